#include "startup/cleanup_marker.h"

#include "foundation/data_protection.h"
#include "foundation/descriptor.h"
#include "foundation/file_system.h"
#include "foundation/paths.h"

#include <err.h>
#include <fcntl.h>
#include <sys/stat.h>

namespace initialiser {
namespace {

constexpr mode_t marker_mode = 0666; // less the process's mask

bool open_and_close_marker() noexcept {
    vorl_descriptor marker{
        open_protected(cleanup_marker, O_RDWR | O_CREAT, always_readable, 0, marker_mode)};
    if (!marker.is_open()) {
        return false;
    }
    struct stat status {};
    const bool has_status = ::fstat(marker.number(), &status) == 0;
    return marker.close() && has_status;
}

} // namespace

void touch_cleanup_marker() noexcept {
    if (!open_and_close_marker()) {
        warn("Cannot touch file %s", cleanup_marker.c_str());
    }
}

void remove_cleanup_marker() noexcept {
    discard(cleanup_marker);
}

} // namespace initialiser
