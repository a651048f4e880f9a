#pragma once

#include <string>

// What a start-up leaves on disk for other programs. The links matter more: a failure here ends
// nothing and throws nothing.
namespace initialiser {

// Makes sure that the cleanup marker exists; one that does is left as it is. Prints "Cannot touch
// file PATH" when it can't.
void touch_cleanup_marker() noexcept;

// Makes "OLD_NEW", without a line end, the whole content of the version-difference record. Prints
// nothing when it can't.
void write_version_diff_record(const std::string& old_version,
                               const std::string& new_version) noexcept;

} // namespace initialiser
