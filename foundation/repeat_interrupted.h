#pragma once

#include <cerrno>
#include <type_traits>

namespace initialiser {

// Makes a call to the system, and makes it again while it is interrupted (EINTR). No signal handler
// is installed here, so a local disk never interrupts a call; a file system that a process serves,
// such as FUSE, may. The number of repetitions has a bound, so that it can't hold up the start-up
// for ever. Returns the last call's result. After a failure errno is that failure's; after a
// success it is unchanged.
template <typename call> auto repeat_interrupted(const call& make) noexcept {
    constexpr int most_repetitions = 1000;
    const auto failed = [](const auto result) {
        if constexpr (std::is_pointer_v<decltype(result)>) {
            return result == nullptr;
        } else {
            return result < 0;
        }
    };
    const int earlier_error = errno;
    auto result = make();
    for (int i = 0; i < most_repetitions && failed(result) && errno == EINTR; ++i) {
        result = make();
    }
    if (!failed(result)) {
        errno = earlier_error;
    }
    return result;
}

} // namespace initialiser
