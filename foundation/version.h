#pragma once

#include <compare>
#include <cstdint>
#include <string>

namespace initialiser {

// A data set's version in parsed form: a tz release and up to two numbers, as in 2020a.1.0. Of two
// versions, one is newer or they are equal. The default version (-1, "", -1, -1) stands for a text
// that can't be parsed. It is older than every parsed one.
class vorl_version {
public:
    vorl_version() = default;
    explicit vorl_version(const std::string& text) { parse(text); }

    // Sets all four fields from `text`. For a text of another form, prints "Cannot parse version
    // string TEXT, results.size() = 0" and "Cannot parse version string TEXT" and sets the default
    // version. For a number above 2147483647, prints nothing and throws std::out_of_range; the
    // fields before that number are then set.
    void parse(const std::string& text);

    // Compare year, letters (as bytes), major and minor, in this order.
    bool newer_than(const vorl_version& other) const { return *this > other; }
    bool equals(const vorl_version& other) const { return *this == other; }
    std::strong_ordering operator<=>(const vorl_version& other) const = default;

    static constexpr std::int32_t absent = -1; // a number that the text doesn't have; below 0

    // In the order of comparison.
    std::int32_t year = absent;
    std::string letters;
    std::int32_t major = absent;
    std::int32_t minor = absent;
};

} // namespace initialiser
