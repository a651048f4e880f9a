#include "startup/version_diff_record.h"

#include "foundation/paths.h"
#include "foundation/text_file.h"

namespace initialiser {

void write_version_diff_record(const std::string& old_version,
                               const std::string& new_version) noexcept {
    try {
        write_text(version_diff_record, old_version + "_" + new_version);
    } catch (...) {
        // Out of memory: the update is in place, and an old record is no reason to undo it.
    }
}

} // namespace initialiser
