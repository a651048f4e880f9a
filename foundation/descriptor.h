#pragma once

namespace initialiser {

// Owns an open descriptor and closes it at the end of its scope. Negative: nothing is open.
class vorl_descriptor {
public:
    explicit vorl_descriptor(int number) noexcept : number_(number) {}
    ~vorl_descriptor() { close(); }
    vorl_descriptor(const vorl_descriptor&) = delete;
    vorl_descriptor& operator=(const vorl_descriptor&) = delete;

    bool is_open() const noexcept { return number_ >= 0; }
    int number() const noexcept { return number_; }

    // Closes now; true when the close succeeded or nothing was open. The descriptor is gone in
    // either case.
    bool close() noexcept;

private:
    int number_;
};

} // namespace initialiser
