#pragma once

namespace initialiser {

// Decides which data set the system's links point at, and points them there:
// - back at the system data set when they can't be read or name data that the installed system
//   can't use or that are older than its own;
// - at the update that the latest link offers, when it is compatible and newer than the data set
//   that the links named. The version-difference record is then written.
// The cleanup marker is made when a stored data set has been abandoned. Any failure is printed and
// ends in the system data set. Links that are in order are not touched.
// Throws only when the links could not even be pointed back at the system data set.
void select_and_activate_dataset();

} // namespace initialiser
