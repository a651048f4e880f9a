#pragma once

namespace initialiser {

// One start-up: every phase once, in its fixed order. Returns the exit status: 0 when it ran to its
// end, whatever was found and corrected on the way. When the time-zone links, or after them the
// localtime link, can't be brought into any usable state, prints a line of its own and returns 1.
int run_start_up() noexcept;

} // namespace initialiser
