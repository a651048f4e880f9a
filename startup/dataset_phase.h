#pragma once

#include <string>

namespace initialiser {

// Decides which data set the system's links point at, and points them there:
// - back at the system data set when the links can't be read, or name data that the installed
//   system can't use or that are older than its own;
// - at the update that the latest link names, when it is compatible and newer than the data set
//   that the links named. The version-difference record is then written.
// Makes the cleanup marker when a stored data set has been abandoned. Any failure resets the links
// to the system data set, after a line that says so. Otherwise, links that are in order are not
// touched. Throws only when the links could not even be reset.
void select_and_activate_dataset();

// The path of the data set whose tz database is at `target`; empty for the system's. What follows
// the last slash is not looked at, nor whether the data set exists. For any other target prints
// "Bad zoneinfo link TARGET" and throws -1.
std::string dataset_path_of_zoneinfo_link(const std::string& target);

} // namespace initialiser
