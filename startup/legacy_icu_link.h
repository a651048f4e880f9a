#pragma once

namespace initialiser {

// Moves the ICU link of older systems into the storage area, target text unchanged, unless one that
// leads somewhere is there already; then removes the old link. A link that leads nowhere counts as
// missing in both places. What fails is printed ("Could not migrate OLD to NEW", "Could not remove
// OLD", each after the failed operation's own line) and passed over.
void migrate_legacy_icutz();

} // namespace initialiser
