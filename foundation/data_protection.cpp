#include "foundation/data_protection.h"

#include <fcntl.h>

#include <cerrno>

namespace initialiser {

int control_protection(int /*descriptor*/, int /*command*/, int /*protection_class*/) noexcept {
    errno = ENOTSUP;
    return -1;
}

int open_protected(const std::string& path, int flags, int /*protection_class*/,
                   int /*option_flags*/, mode_t mode) noexcept {
    return ::open(path.c_str(), flags | O_NOFOLLOW | O_NONBLOCK | O_NOCTTY | O_CLOEXEC, mode);
}

} // namespace initialiser
