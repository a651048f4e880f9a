#include "device.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <ostream>
#include <sstream>
#include <stdexcept>

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
    std::string rest;
    words >> keyword >> std::ws;
    if (keyword.empty() || keyword == "#") {
        return;
    }
    if (keyword == "scenario") {
        std::getline(words, rest);
        all.push_back({rest, {}, {}, {}});
        return;
    }
    scenario& last = all.at(all.size() - 1); // throws when there is none
    if (keyword == "found" || keyword == "leaves") {
        std::string path;
        words >> path >> std::ws;
        std::getline(words, rest);
        (keyword == "found" ? last.found : last.left).emplace_back(path, rest);
    } else if (keyword == "prints") {
        std::getline(words, rest);
        last.printed.push_back(rest);
    } else if (keyword == "exits") {
        words >> last.status;
    } else {
        throw std::invalid_argument("no such keyword");
    }
}

// The scenarios of one file. Throws where it holds none or a line can't be understood.
std::vector<scenario> scenarios_in(const std::filesystem::path& path) {
    std::vector<scenario> all;
    std::ifstream file{path};
    for (std::string line; std::getline(file, line);) {
        line.erase(line.find_last_not_of(" \t\r") + 1);
        try {
            add_line(all, line);
        } catch (const std::exception& error) {
            throw std::runtime_error(path.string() + ": " + line + ": " + error.what());
        }
    }
    if (all.empty()) {
        throw std::runtime_error(path.string() + ": there is no scenario, or it can't be read");
    }
    return all;
}

std::vector<scenario> scenarios() {
    std::vector<scenario> all;
    for (const auto& entry : std::filesystem::directory_iterator{VORL_SCENARIOS}) {
        const std::string name = entry.path().filename();
        if (name != "README.md" && !name.starts_with('.')) {
            const std::vector<scenario> more = scenarios_in(entry.path());
            all.insert(all.end(), more.begin(), more.end());
        }
    }
    return all;
}

class start_up : public testing::TestWithParam<scenario> {};

TEST_P(start_up, prints_and_leaves) {
    const auto& [name, found, printed, left, status] = GetParam();
    const vorl_device device{found};
    const tree before = device.contents();
    const tree untouched = device.contents(true);
    const outcome outcome = device.start_up();
    EXPECT_EQ(outcome.status, status);
    EXPECT_EQ(lines_of(outcome.printed, printed), printed);
    EXPECT_EQ(device.contents(), after(before, left));
    if (left.empty()) {
        EXPECT_EQ(device.contents(true), untouched);
    }
}

// A doubled name stops the test program.
INSTANTIATE_TEST_SUITE_P(scenarios, start_up, testing::ValuesIn(scenarios()),
                         [](const auto& shown) { return shown.param.name; });

} // namespace
} // namespace initialiser
