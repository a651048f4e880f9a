#include "device.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <iterator>
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

// False where the line can't be understood.
bool add_line(std::vector<scenario>& all, const std::string& line) {
    std::istringstream words{line};
    std::string keyword;
    std::string path;
    const auto rest = [&words] {
        std::string text;
        std::getline(words >> std::ws, text);
        return text;
    };
    if (!(words >> keyword) || keyword == "#") {
        return true;
    }
    if (keyword == "scenario") {
        all.push_back({rest(), {}, {}, {}});
    } else if (all.empty()) {
        return false;
    } else if (keyword == "found" && words >> path) {
        all.back().found.emplace_back(path, rest());
    } else if (keyword == "leaves" && words >> path) {
        all.back().left.emplace_back(path, rest());
    } else if (keyword == "prints") {
        all.back().printed.push_back(rest());
    } else {
        return keyword == "exits" && words >> all.back().status;
    }
    return true;
}

std::vector<scenario> scenarios_in(const std::filesystem::path& path) {
    std::vector<scenario> all;
    std::ifstream file{path};
    for (std::string line; std::getline(file, line);) {
        line.erase(line.find_last_not_of(" \t\r") + 1);
        if (!add_line(all, line)) {
            throw std::runtime_error(path.string() + ": what is this? " + line);
        }
    }
    if (all.empty()) {
        throw std::runtime_error(path.string() + " holds no scenario, or can't be read");
    }
    return all;
}

std::vector<scenario> scenarios() {
    std::vector<scenario> all;
    for (const auto& entry : std::filesystem::directory_iterator{VORL_SCENARIOS}) {
        const std::string name = entry.path().filename();
        if (name != "README.md" && !name.starts_with('.')) {
            std::ranges::move(scenarios_in(entry.path()), std::back_inserter(all));
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
