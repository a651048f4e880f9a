#pragma once

namespace initialiser {

// Leaves the localtime link pointing into the zoneinfo link. A target that begins with that link's
// path is accepted as it is.
// One in the old place is corrected ("Correcting localtime link to TARGET") when its zone exists.
// Anything else is reset to the default zone ("localtime link invalid; resetting to ZONE").
// Throws the error number when the default link can't be made.
void repair_localtime_link();

} // namespace initialiser
