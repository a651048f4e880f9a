#pragma once

namespace initialiser {

// Makes sure that the cleanup marker exists; one that does is left as it is. Prints "Cannot touch
// file PATH" when it can't.
void touch_cleanup_marker() noexcept;

// Takes the previous start-up's marker away; a missing one is no error. Prints nothing.
void remove_cleanup_marker() noexcept;

} // namespace initialiser
