#pragma once

#include <cstdint>
#include <string>

namespace initialiser {

// A data set's version in parsed form: a tz release and up to two numbers, as in 2020a.1.0.
// Versions are strictly and totally ordered. The default version (-1, "", -1, -1) stands for a text
// that can't be parsed; it is older than every parsed one.
class vorl_version {
public:
    vorl_version() = default;
    explicit vorl_version(const std::string& text);

    // Sets all four fields from `text`. A text of another form gives the default version after two
    // lines, "Cannot parse version string TEXT, results.size() = 0" and "Cannot parse version
    // string TEXT". A number above the largest 32-bit one prints nothing and throws
    // std::out_of_range; the fields before it are then set.
    void parse(const std::string& text);

    // Compares year, letters (as bytes), major and minor, in this order; an absent number is below
    // 0.
    bool newer_than(const vorl_version& other) const;
    bool equals(const vorl_version& other) const;

    static constexpr std::int32_t absent = -1;

    std::int32_t year = absent;
    std::string letters;
    std::int32_t major = absent;
    std::int32_t minor = absent;
};

} // namespace initialiser
