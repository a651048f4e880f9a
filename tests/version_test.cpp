#include "foundation/version.h"

#include "device.h"
#include "foundation/expression.h"

#include <gtest/gtest.h>

#include <regex>
#include <stdexcept>

namespace initialiser {
namespace {

std::string shown(const vorl_version& version) {
    return std::to_string(version.year) + " " + version.letters + " " +
           std::to_string(version.major) + " " + std::to_string(version.minor);
}

TEST(version, parses_whole_texts_only) {
    const std::string none = "-1  -1 -1";
    const std::map<std::string, std::string> versions = {{"2019c", "2019 c -1 -1"},
                                                         {"2020a.1.0", "2020 a 1 0"},
                                                         {"2019c.1", "2019 c 1 -1"},
                                                         {"2016j.12.345", "2016 j 12 345"},
                                                         {"02019ab.007", "2019 ab 7 -1"},
                                                         {"1c.2147483647", "1 c 2147483647 -1"},
                                                         {"2019C", none},
                                                         {"2019", none},
                                                         {"2019c.", none},
                                                         {"2019c.1.0.2", none},
                                                         {"", none},
                                                         {"v2019c", none},
                                                         {" 2019c", none},
                                                         {"2019c ", none},
                                                         {"2019c.1.0/", none},
                                                         {"2019\xe4", none}};
    for (const auto& [text, expected] : versions) {
        vorl_version version{"1a.2.3"};
        const messages printed = printed_by([&] { version.parse(text); });
        EXPECT_EQ(shown(version), expected) << text;
        const std::string line = "Cannot parse version string " + text;
        const messages lines = {line + ", results.size() = 0", line};
        EXPECT_EQ(printed, expected == none ? lines : messages{});
    }
}

TEST(version, lets_a_number_out_of_range_out) {
    for (const std::string text : {"2147483648c", "2019c.2147483648.4", "2019c.1.99999999999"}) {
        vorl_version version;
        const messages printed =
            printed_by([&] { EXPECT_THROW(version.parse(text), std::out_of_range); });
        EXPECT_EQ(printed, messages{});
    }
}

TEST(version, is_strictly_and_totally_ordered) {
    std::vector<vorl_version> ascending(1);
    for (const std::string text : {"2019aa", "2019b", "2019c", "2019c.0", "2019c.1", "2019c.1.0",
                                   "2019c.2", "2019c.10.0", "2019ca", "2019d", "2020a"}) {
        ascending.emplace_back(text);
    }
    for (std::size_t first = 0; first < ascending.size(); ++first) {
        for (std::size_t second = 0; second < ascending.size(); ++second) {
            SCOPED_TRACE(shown(ascending[first]) + " and " + shown(ascending[second]));
            EXPECT_EQ(ascending[first].newer_than(ascending[second]), first > second);
            EXPECT_EQ(ascending[first].equals(ascending[second]), first == second);
        }
    }
}

TEST(expression, matches_long_texts_and_knows_no_classes) {
    constexpr std::size_t length = 1'000'000;
    const vorl_expression expression{"([0-9]+)([a-z]+)"};
    EXPECT_EQ(expression.match_whole("1" + std::string(length, 'a'))[2].size(), length);
    EXPECT_TRUE(expression.match_whole(std::string(length, '1')).empty());
    EXPECT_THROW(vorl_expression{R"(\d+)"}, std::regex_error);
}

} // namespace
} // namespace initialiser
