#include "device.h"

#include <gtest/gtest.h>

#include <fstream>
#include <ostream>
#include <sstream>

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

void add_line(std::vector<scenario>& all, const std::string& line) {
    std::istringstream words{line};
    std::string keyword;
    std::string path;
    std::string rest;
    words >> keyword >> std::ws;
    if (keyword == "found" || keyword == "leaves") {
        words >> path >> std::ws;
        std::getline(words, rest);
        (keyword == "found" ? all.back().found : all.back().left).emplace_back(path, rest);
        return;
    }
    std::getline(words, rest);
    if (keyword == "scenario") {
        all.push_back({rest, {}, {}, {}});
    } else if (keyword == "prints") {
        all.back().printed.push_back(rest);
    } else if (keyword == "exits") {
        all.back().status = std::stoi(rest);
    } else if (!keyword.empty() && keyword != "#") {
        throw std::invalid_argument("a scenario has no such line: " + keyword);
    }
}

std::vector<scenario> scenarios() {
    std::vector<scenario> all;
    for (const char* const file : {VORL_SCENARIOS "/datasets.txt", VORL_SCENARIOS "/links.txt"}) {
        std::ifstream stream{file};
        for (std::string line; std::getline(stream, line);) {
            add_line(all, line);
        }
    }
    return all;
}

class start_up : public testing::TestWithParam<scenario> {};

TEST_P(start_up, prints_and_leaves) {
    const auto& [name, found, printed, left, status] = GetParam();
    const device device;
    device::put(found);
    const tree before = device::contents();
    const outcome outcome = device::start_up();
    EXPECT_EQ(outcome.status, status);
    EXPECT_EQ(lines_of(outcome.printed, printed), printed);
    EXPECT_EQ(device::contents(), after(before, left));

    // A start-up that finds everything in order makes nothing anew, not even with the same content.
    if (left.empty()) {
        const tree untouched = device::stamps();
        device::start_up();
        EXPECT_EQ(device::stamps(), untouched);
    }
}

INSTANTIATE_TEST_SUITE_P(scenarios, start_up, testing::ValuesIn(scenarios()),
                         [](const auto& shown) { return shown.param.name; });

} // namespace
} // namespace initialiser
