#pragma once

#include <unistd.h>

#include <cerrno>
#include <type_traits>
#include <utility>

namespace initialiser {

// Owns an open descriptor and closes it at the end of its scope. A negative number is that of a
// failed open: nothing is open then.
class vorl_descriptor {
public:
    explicit vorl_descriptor(int number) noexcept : number_(number) {}
    vorl_descriptor(vorl_descriptor&& other) noexcept : number_(std::exchange(other.number_, -1)) {}
    ~vorl_descriptor() { close(); }
    vorl_descriptor(const vorl_descriptor&) = delete;
    vorl_descriptor& operator=(const vorl_descriptor&) = delete;
    vorl_descriptor& operator=(vorl_descriptor&&) = delete;

    bool is_open() const noexcept { return number_ >= 0; }
    int number() const noexcept { return number_; }

    // Closes it now. False when the close fails; the descriptor is gone all the same.
    bool close() noexcept {
        const int closing = std::exchange(number_, -1);
        return closing < 0 || ::close(closing) == 0;
    }

private:
    int number_;
};

// Makes a call to the system, and makes it again while a signal interrupts it (EINTR). The number
// of repetitions has a bound, so that nothing can hold up the start-up for ever. Returns the last
// call's result. The error number is that of the failure, or what it was before.
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
