#pragma once

#include <string>

// What a start-up leaves on disk for other programs. The links matter more, so no failure here is
// thrown.
namespace initialiser {

// Makes the cleanup marker, unless it exists: then it is left as it is. When it can't, prints
// "Cannot touch file PATH".
void touch_cleanup_marker() noexcept;

// Overwrites the version-difference record with "OLD_NEW", without a line end. Prints nothing when
// it can't.
void write_version_diff_record(const std::string& old_version,
                               const std::string& new_version) noexcept;

} // namespace initialiser
