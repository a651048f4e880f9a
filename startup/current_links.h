#pragma once

#include <string>

// Which data sets the system's links name. A data set is named by its path: its folder, or the
// empty text for the system data set. Nothing here changes the disk or looks whether a data set
// exists.
namespace initialiser {

// The latest link's target, unchanged and unchecked. A missing link is no error and gives the empty
// text. Throws what read_symlink() throws.
std::string read_latest_dataset_path();

// The path of the data set that the zoneinfo link points at. Throws what read_symlink() and
// dataset_path_of_zoneinfo_link() throw; a missing link is a bad one.
std::string read_current_dataset_path();

// The path of the data set whose tz database is at `target`. Prints "Bad zoneinfo link TARGET" and
// throws -1 when that is neither the system's nor inside a stored data set.
std::string dataset_path_of_zoneinfo_link(const std::string& target);

} // namespace initialiser
