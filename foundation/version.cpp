#include "foundation/version.h"

#include "foundation/expression.h"

#include <err.h>

#include <vector>

namespace initialiser {
namespace {

constexpr auto version_expression = R"(([0-9]+)([a-z]+)(?:\.([0-9]+))?(?:\.([0-9]+))?)";
constexpr std::size_t entries_of_a_match = 5; // the whole text and four groups

std::int32_t number_or_absent(const std::string& digits) {
    return digits.empty() ? vorl_version::absent : std::stoi(digits);
}

} // namespace

void vorl_version::parse(const std::string& text) {
    static const vorl_expression expression{version_expression};
    const std::vector<std::string> results = expression.match_whole(text);
    if (results.size() != entries_of_a_match) {
        warn("Cannot parse version string %s, results.size() = %d", text.c_str(),
             static_cast<int>(results.size()));
        warn("Cannot parse version string %s", text.c_str());
        *this = vorl_version{};
        return;
    }
    year = std::stoi(results[1]);
    letters = results[2];
    major = number_or_absent(results[3]);
    minor = number_or_absent(results[4]);
}

} // namespace initialiser
