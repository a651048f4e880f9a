#pragma once

namespace initialiser {

// Makes the localtime link point into the zoneinfo link.
// - A target that begins with the zoneinfo link's path is accepted as it is.
// - For a target in the old place, prints "Correcting localtime link to TARGET", and corrects it
//   when its zone exists.
// - For anything else, prints "localtime link invalid; resetting to ZONE", and sets the default
//   zone. Throws the error number when that link can't be made.
void repair_localtime_link();

} // namespace initialiser
