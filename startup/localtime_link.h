#pragma once

namespace initialiser {

// Makes the localtime link point into the zoneinfo link.
// - A target that begins with the zoneinfo link's path is accepted as it is.
// - For a target in the old place, prints "Correcting localtime link to TARGET", and corrects the
//   link when its zone exists.
// - For anything else, and where that zone doesn't exist or the corrected link can't be made,
//   prints "localtime link invalid; resetting to ZONE", and sets the default zone.
// Throws the error number when the link to the default zone can't be made.
void repair_localtime_link();

} // namespace initialiser
