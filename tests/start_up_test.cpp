#include "device.h"

#include <gtest/gtest.h>

#include <fstream>
#include <ostream>

namespace initialiser {
namespace {

struct scenario {
    std::string name;
    changes found;
    messages printed;
    changes left;
    int status = 0;
};

void PrintTo(const scenario& shown, std::ostream* out) {
    *out << shown.name;
}

std::string first_word(std::string& rest) {
    const auto end = rest.find(' ');
    const std::string word = rest.substr(0, end);
    rest = end == std::string::npos ? "" : rest.substr(end + 1);
    return word;
}

void add_line(std::vector<scenario>& all, std::string line) {
    const std::string keyword = first_word(line);
    if (keyword == "scenario") {
        all.push_back({line, {}, {}, {}});
    } else if (keyword == "found" || keyword == "leaves") {
        const std::string path = first_word(line);
        (keyword == "found" ? all.back().found : all.back().left).emplace_back(path, line);
    } else if (keyword == "prints") {
        all.back().printed.push_back(line);
    } else if (keyword == "exits") {
        all.back().status = std::stoi(line);
    } else if (!keyword.empty() && keyword != "#") {
        throw std::invalid_argument("scenarios: no such line: " + keyword);
    }
}

std::vector<scenario> scenarios(const std::string& file) {
    std::vector<scenario> all;
    std::ifstream stream{VORL_SCENARIOS "/" + file};
    for (std::string line; std::getline(stream, line);) {
        add_line(all, line);
    }
    return all;
}

class start_up : public testing::TestWithParam<scenario> {};

TEST_P(start_up, prints_and_leaves) {
    const device device;
    device::put(GetParam().found);
    const tree before = device::contents();

    outcome outcome = device::start_up();

    for (std::string& line : outcome.printed) {
        line.erase(line.find_last_not_of(' ') + 1); // blanks at a line's end would be lost in edits
    }
    EXPECT_EQ(outcome.status, GetParam().status);
    EXPECT_EQ(outcome.printed, GetParam().printed);
    EXPECT_EQ(device::contents(), after(before, GetParam().left));
}

std::string name_of(const testing::TestParamInfo<scenario>& info) {
    return info.param.name;
}

INSTANTIATE_TEST_SUITE_P(datasets, start_up, testing::ValuesIn(scenarios("datasets.txt")), name_of);
INSTANTIATE_TEST_SUITE_P(localtime, start_up, testing::ValuesIn(scenarios("localtime.txt")),
                         name_of);
INSTANTIATE_TEST_SUITE_P(migration, start_up, testing::ValuesIn(scenarios("migration.txt")),
                         name_of);

TEST(start_up_in_order, leaves_every_time_stamp) {
    const device device;
    device::put({{"zoneinfo", "-> /var/db/timezone/tz/2020a.1.0/zoneinfo"},
                 {"icutz", "-> /var/db/timezone/tz/2020a.1.0/icutz"},
                 {"tz_latest", "-> /var/db/timezone/tz/2020a.1.0"}});
    const tree before = device::stamps();
    device::start_up();
    EXPECT_EQ(device::stamps(), before);
}

} // namespace
} // namespace initialiser
