#pragma once

namespace initialiser {

// Gives the storage area and the directory of the stored data sets the data-protection class that
// can be read at start-up; on Linux there are none, and nothing is set. A missing directory is no
// error and is not made. Prints and throws nothing.
void prepare_storage() noexcept;

// Moves the ICU link of older systems into the storage area with its target text unchanged, unless
// a link that leads somewhere is there already; then removes the old link. A link that leads
// nowhere counts as missing in both places. When one of the two fails, its own line is followed by
// "Could not migrate OLD to NEW" or "Could not remove OLD". Throws nothing.
void migrate_legacy_icutz();

} // namespace initialiser
