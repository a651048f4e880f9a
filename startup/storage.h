#pragma once

namespace initialiser {

// Gives the storage area and the directory of the stored data sets the data-protection class that
// can be read at start-up. Linux has no such classes, so nothing is set there. A missing directory
// is passed over and not made. Prints and throws nothing.
void prepare_storage() noexcept;

// Moves the ICU link of older systems into the storage area, with its target text unchanged.
// - An old link that leads nowhere is left alone.
// - Where the storage area has an ICU link that leads somewhere, the old one is only removed.
// - An ICU link that leads nowhere stays in the way: the copy fails, and the old one is removed.
// A failed copy prints its own line and "Could not migrate OLD to NEW"; a failed removal prints its
// own line and "Could not remove OLD". Throws nothing.
void migrate_legacy_icutz() noexcept;

} // namespace initialiser
