#pragma once

#include <string>

// What a start-up leaves on disk for other programs. The links matter more, so no failure here is
// thrown.
namespace initialiser {

// Makes the cleanup marker, unless it exists: then it is left as it is. When it can't, prints
// "Cannot touch file PATH".
void touch_cleanup_marker() noexcept;

// Makes "OLD_NEW", without a line end, the whole content of the version-difference record. Prints
// nothing when it can't.
void write_version_diff_record(const std::string& old_version,
                               const std::string& new_version) noexcept;

} // namespace initialiser
