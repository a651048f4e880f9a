#include "harness.h"

#include <gtest/gtest.h>

#include <cstddef>
#include <filesystem>
#include <fstream>
#include <ostream>
#include <regex>
#include <sstream>
#include <stdexcept>
#include <string>
#include <vector>

namespace initialiser {
namespace {

struct scenario {
    std::string name;
    std::string command;
    changes found;
    std::vector<std::string> printed;
    changes left;
    int status = 0;
};

std::ostream& operator<<(std::ostream& out, const scenario& shown) {
    return out << shown.name;
}

// False where there is no such verb.
bool add_line(scenario& shown, const std::smatch& line) {
    const std::string verb = line[1];
    const std::string text = line[2]; // a word and the rest
    const std::string word = line[3];
    const std::string rest = line[4];
    changes& list =
        verb == "leaves" || verb == "turns_to" || verb == "installs" ? shown.left : shown.found;
    if (verb == "found" || verb == "leaves") {
        list.emplace_back(word, rest);
    } else if (verb == "offers") {
        list.emplace_back("tz_latest", "-> /var/db/timezone/tz/" + word);
    } else if (verb == "uses" || verb == "turns_to" || verb == "installs") {
        const changes links = links_on(word);
        list.insert(list.end(), links.begin(), links.end());
        if (rest.starts_with("over ")) {
            list.emplace_back("TZVersionDiffRecord", "= " + rest.substr(5) + "_" + word);
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
    for (const auto& entry : std::filesystem::directory_iterator{VORL_SCENARIOS}) {
        const std::filesystem::path& path = entry.path();
        if (path.extension() != ".txt") {
            continue;
        }
        const std::size_t before = all.size();
        std::ifstream file{path};
        for (std::string line; std::getline(file, line);) {
            if (std::regex_match(line, parts, form) && parts[1] == "scenario") {
                all.emplace_back().name = path.stem().string() + "_" + parts[3].str();
            } else if (!parts[1].str().empty() && parts[1] != "#" &&
                       (all.size() == before || !add_line(all.back(), parts))) {
                throw std::runtime_error("no line of a scenario: " + line);
            }
        }
        if (all.size() == before) {
            throw std::runtime_error(path.string() + " holds no scenario, or can't be read");
        }
    }
    return all;
}

void expect_messages(const std::string& found, const std::vector<std::string>& expected) {
    std::istringstream lines{found};
    for (const std::string& text : expected) {
        std::string line;
        std::getline(lines, line);
        if (!(line + ": ").starts_with("vorl_initialiser: " + text + ": ")) {
            ADD_FAILURE() << '"' << line << "\" instead of \"" << text << '"';
        }
    }
    for (std::string line; std::getline(lines, line);) {
        ADD_FAILURE() << "one message too many: " << line;
    }
}

class start_up : public testing::TestWithParam<scenario> {};

TEST_P(start_up, prints_and_leaves) {
    const auto& [name, command, found, printed, left, status] = GetParam();
    const vorl_device device{found};
    const bool stamped = left.empty();
    const tree expected = after(device.contents(stamped), left);
    const outcome outcome = device.start_up(command);
    EXPECT_EQ(outcome.status, status);
    expect_messages(outcome.printed, printed);
    device.expect(expected, stamped);
}

// A doubled name stops the test program.
INSTANTIATE_TEST_SUITE_P(scenarios, start_up, testing::ValuesIn(scenarios()),
                         [](const auto& shown) { return shown.param.name; });

} // namespace
} // namespace initialiser
