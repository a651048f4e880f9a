#include "startup/notices.h"

#include "foundation/data_protection.h"
#include "foundation/descriptor.h"
#include "foundation/paths.h"
#include "foundation/repeat_interrupted.h"
#include "foundation/text_file.h"

#include <err.h>
#include <fcntl.h>
#include <sys/stat.h>
#include <sys/types.h>

#include <string>

namespace initialiser {
namespace {

constexpr mode_t marker_mode = 0666; // less the process's mask

// A planted link must not make a file elsewhere, and what stands there must not hold up the open.
constexpr int marker_flags = O_RDWR | O_CREAT | O_NOFOLLOW | O_NONBLOCK | O_NOCTTY | O_CLOEXEC;

bool open_and_close_marker() noexcept {
    vorl_descriptor marker{repeat_interrupted([] {
        return open_protected(cleanup_marker, marker_flags, always_readable, 0, marker_mode);
    })};
    if (!marker.is_open()) {
        return false;
    }
    struct stat status{};
    const bool has_status = ::fstat(marker.number(), &status) == 0;
    return marker.close() && has_status;
}

} // namespace

void touch_cleanup_marker() noexcept {
    if (!open_and_close_marker()) {
        warn("Cannot touch file %s", cleanup_marker.c_str());
    }
}

void write_version_diff_record(const std::string& old_version,
                               const std::string& new_version) noexcept {
    try {
        write_text(version_diff_record, old_version + "_" + new_version);
    } catch (...) {
        // No memory for the text. An old record is no reason to undo the update.
    }
}

} // namespace initialiser
