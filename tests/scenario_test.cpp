#include "harness.h"

#include <gtest/gtest.h>

#include <fstream>
#include <regex>
#include <sstream>
#include <stdexcept>

namespace initialiser {
namespace {

struct scenario {
    std::string name;
    std::string command = {};
    changes found = {};
    std::vector<std::string> printed = {};
    changes left = {};
    int status = 0;
};

void add(changes& list, const changes& more) {
    list.insert(list.end(), more.begin(), more.end());
}

// False where there is no such verb.
bool add_line(scenario& shown, const std::smatch& line) {
    const std::string verb = line[1];
    const std::string text = line[2]; // a word and the rest
    const std::string word = line[3];
    const std::string rest = line[4];
    if (verb == "found" || verb == "leaves") {
        add(verb == "found" ? shown.found : shown.left, {{word, rest}});
    } else if (verb == "offers") {
        add(shown.found, {{"tz_latest", "-> /var/db/timezone/tz/" + word}});
    } else if (verb == "uses" || verb == "turns_to" || verb == "installs") {
        add(verb == "uses" ? shown.found : shown.left, links_on(word));
        if (rest.starts_with("over ")) {
            add(shown.left, {{"TZVersionDiffRecord", "= " + rest.substr(5) + "_" + word}});
        }
    } else if (verb == "prints") {
        shown.printed.push_back(text);
    } else if (verb == "runs") {
        shown.command += text + "\n";
    } else if (verb == "exits") {
        shown.status = std::stoi(word);
    } else {
        return false;
    }
    return true;
}

std::vector<scenario> scenarios() {
    std::vector<scenario> all;
    const std::regex form{R"(\s*(\S*)\s*((\S*) ?(.*?))\s*)"};
    std::smatch parts;
    for (const std::string kind : {"datasets", "links", "faults"}) {
        std::ifstream file{VORL_SCENARIOS "/" + kind + ".txt"};
        for (std::string line; std::getline(file, line);) {
            if (std::regex_match(line, parts, form) && parts[1] == "scenario") {
                all.push_back({kind + "_" + parts[3].str()});
            } else if (!parts[1].str().empty() && parts[1] != "#" &&
                       (all.empty() || !add_line(all.back(), parts))) {
                throw std::runtime_error("no line of a scenario: " + line);
            }
        }
        if (all.empty() || !all.back().name.starts_with(kind)) {
            throw std::runtime_error(kind + ".txt holds no scenario, or can't be read");
        }
    }
    return all;
}

class start_up : public testing::TestWithParam<scenario> {};

TEST_P(start_up, prints_and_leaves) {
    const auto& [name, command, found, printed, left, status] = GetParam();
    const vorl_device device{found};
    const tree expected = after(device.contents(), left);
    const tree untouched = device.contents(true);
    const outcome outcome = device.start_up(command);
    EXPECT_EQ(outcome.status, status);
    std::istringstream lines{outcome.printed};
    std::string line;
    for (const std::string& text : printed) {
        std::getline(lines, line);
        EXPECT_TRUE((line + ": ").starts_with("vorl_initialiser: " + text + ": "))
            << line << " is not " << text;
    }
    EXPECT_FALSE(std::getline(lines, line)) << line;
    device.expect(expected);
    EXPECT_TRUE(!left.empty() || device.contents(true) == untouched);
}

// A doubled name stops the test program.
INSTANTIATE_TEST_SUITE_P(scenarios, start_up, testing::ValuesIn(scenarios()),
                         [](const auto& shown) { return shown.param.name; });

} // namespace
} // namespace initialiser
