#include "foundation/version.h"

#include "foundation/expression.h"

#include <err.h>

#include <stdexcept>
#include <tuple>
#include <vector>

namespace initialiser {
namespace {

constexpr auto version_expression = R"(([0-9]+)([a-z]+)(?:\.([0-9]+))?(?:\.([0-9]+))?)";
constexpr std::size_t entries_of_a_match = 5; // the whole text and four groups

std::int32_t number_or_absent(const std::string& digits) {
    try {
        return std::stoi(digits);
    } catch (const std::invalid_argument&) {
        return vorl_version::absent;
    }
}

} // namespace

vorl_version::vorl_version(const std::string& text) {
    parse(text);
}

void vorl_version::parse(const std::string& text) {
    try {
        const std::vector<std::string> results =
            vorl_expression{version_expression}.match_whole(text);
        if (results.size() != entries_of_a_match) {
            warn("Cannot parse version string %s, results.size() = %d", text.c_str(),
                 static_cast<int>(results.size()));
            throw std::invalid_argument("no match");
        }
        year = std::stoi(results[1]);
        letters = results[2];
        major = number_or_absent(results[3]);
        minor = number_or_absent(results[4]);
    } catch (const std::invalid_argument&) {
        warn("Cannot parse version string %s", text.c_str());
        *this = vorl_version{};
    }
}

bool vorl_version::newer_than(const vorl_version& other) const {
    return std::tie(year, letters, major, minor) >
           std::tie(other.year, other.letters, other.major, other.minor);
}

bool vorl_version::equals(const vorl_version& other) const {
    return std::tie(year, letters, major, minor) ==
           std::tie(other.year, other.letters, other.major, other.minor);
}

} // namespace initialiser
