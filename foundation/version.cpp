#include "foundation/version.h"

#include "foundation/text_reader.h"

#include <err.h>

#include <cstdint>
#include <string>
#include <string_view>

namespace initialiser {
namespace {

// Throws what stoi throws for a number that is too large.
std::int32_t number_or_absent(std::string_view digits) {
    return digits.empty() ? vorl_version::absent : std::stoi(std::string{digits});
}

} // namespace

void vorl_version::parse(const std::string& text) {
    // ([0-9]+)([a-z]+)(?:\.([0-9]+))?(?:\.([0-9]+))?
    vorl_text_reader reader{text};
    const std::string_view year_digits = reader.take_digits();
    const std::string_view release_letters = reader.take_letters();
    const std::string_view major_digits = reader.take_dot_and_digits();
    const std::string_view minor_digits = reader.take_dot_and_digits();
    if (year_digits.empty() || release_letters.empty() || !reader.is_at_end()) {
        // Other programs look for this text, so it keeps its number, which is always 0.
        warn("Cannot parse version string %s, results.size() = %d", text.c_str(), 0);
        warn("Cannot parse version string %s", text.c_str());
        *this = vorl_version{};
        return;
    }
    year = number_or_absent(year_digits);
    letters = release_letters;
    major = number_or_absent(major_digits);
    minor = number_or_absent(minor_digits);
}

} // namespace initialiser
