#include "startup/process_guards.h"

#include <fcntl.h>
#include <unistd.h>

#include <array>
#include <cerrno>
#include <csignal>
#include <cstdio>

namespace initialiser {
namespace {

// Fills each closed number from 0 to 2 with a descriptor that can't be read or written; the first
// above 2 is closed again. They are of the root directory, since a bare root has no /dev/null.
void occupy_standard_descriptors() noexcept {
    int filler = 0;
    while (filler >= 0 && filler <= STDERR_FILENO) {
        filler = ::open("/", O_PATH | O_CLOEXEC);
    }
    if (filler > STDERR_FILENO) {
        ::close(filler);
    }
}

} // namespace

void guard_process() noexcept {
    static char program_name[] = "vorl_initialiser";
    program_invocation_short_name = program_name;
    std::signal(SIGPIPE, SIG_IGN);
    std::signal(SIGXFSZ, SIG_IGN);
    occupy_standard_descriptors();
    // A line reaches the log whole: some logs make a record of each write.
    static std::array<char, BUFSIZ> line{};
    static_cast<void>(std::setvbuf(stderr, line.data(), _IOLBF, line.size()));
}

} // namespace initialiser
