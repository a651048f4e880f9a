#pragma once

#include <unistd.h>

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

} // namespace initialiser
