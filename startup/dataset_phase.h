#pragma once

#include <string>

namespace initialiser {

// Chooses a data set, and points the system's links at it:
// - the system data set, when the zoneinfo link is missing, can't be read or names no data set, or
//   when its data set has another ICU schema than the system's or is older than the system's;
// - the update that the latest link names, when it has the system's ICU schema and is newer than
//   the data set that the zoneinfo link named. The version-difference record is then written.
// Otherwise the links stay: where the zoneinfo link is in order, the ICU link is not looked at.
// When a stored data set is abandoned, makes the cleanup marker. After a failure, prints a line and
// resets the links to the system data set. Throws only when that fails.
void select_and_activate_dataset();

// The path of the data set whose tz database is at `target`; the empty path is the system data set.
// What follows the last slash is not looked at, and the data set need not exist. For any other
// target, prints "Bad zoneinfo link TARGET" and throws no_error_number.
std::string dataset_path_of_zoneinfo_link(const std::string& target);

} // namespace initialiser
