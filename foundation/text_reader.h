#pragma once

#include <string_view>

namespace initialiser {

// Takes a text apart, from its beginning to its end. Bytes are compared as they are, in no locale.
class vorl_text_reader {
public:
    explicit vorl_text_reader(std::string_view text) : rest_(text) {}

    bool is_at_end() const { return rest_.empty(); }

    // Takes `word` and returns true where the text goes on with it. Else takes nothing and returns
    // false.
    bool take(std::string_view word) {
        if (!rest_.starts_with(word)) {
            return false;
        }
        rest_.remove_prefix(word.size());
        return true;
    }

    // Takes and returns all bytes up to the first that is not among `bytes`.
    std::string_view take_all_of(std::string_view bytes) {
        const std::string_view taken = rest_.substr(0, rest_.find_first_not_of(bytes));
        rest_.remove_prefix(taken.size());
        return taken;
    }
    std::string_view take_digits() { return take_all_of("0123456789"); }
    std::string_view take_letters() { return take_all_of("abcdefghijklmnopqrstuvwxyz"); }

    // Takes a dot and the digits behind it, and returns the digits. Takes nothing where either is
    // missing.
    std::string_view take_dot_and_digits() {
        vorl_text_reader behind_dot = *this;
        if (!behind_dot.take(".")) {
            return {};
        }
        const std::string_view digits = behind_dot.take_digits();
        if (!digits.empty()) {
            *this = behind_dot;
        }
        return digits;
    }

private:
    std::string_view rest_;
};

} // namespace initialiser
