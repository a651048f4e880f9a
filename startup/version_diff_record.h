#pragma once

#include <string>

namespace initialiser {

// Makes "OLD_NEW", without a line end, the whole content of the version-difference record. A
// failure is passed over and nothing is printed: the links matter, the record only tells of them.
void write_version_diff_record(const std::string& old_version,
                               const std::string& new_version) noexcept;

} // namespace initialiser
