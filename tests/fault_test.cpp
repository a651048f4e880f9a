#include "harness.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <iterator>
#include <map>
#include <regex>
#include <set>
#include <string>
#include <utility>
#include <vector>

// What a start-up survives: each of its calls fails, is interrupted, or is where the power is cut.
// Faults of one call are in scenarios/faults.txt.
namespace initialiser {
namespace {

struct call {
    std::string name;
    std::string number; // among those of that name
    std::string line;   // as strace shows it
};

// A start-up, and its calls for files from its first own act on, which is to ignore SIGPIPE.
struct traced : outcome {
    std::vector<call> calls;
    int left_open; // descriptors
};

traced trace(const vorl_device& device, const std::string& fault = "", const call& at = {}) {
    const std::string log = "/usr/share/calls";
    const std::string inject = " -e inject=" + at.name + ":" + fault + ":when=" + at.number;
    traced run{device.start_up("$strace -y -e trace=rt_sigaction,%file,%desc,fsync -o " + log +
                               (fault.empty() ? "" : inject) + " $program"),
               {},
               0};
    std::map<std::string, int> numbers;
    bool begun = false;
    std::ifstream lines{log};
    for (std::string line; std::getline(lines, line);) {
        const std::string name = line.substr(0, line.find('('));
        const int number = ++numbers[name];
        begun = begun || line.starts_with("rt_sigaction(SIGPIPE");
        if (begun && name != line && !name.starts_with("mmap")) { // a signal has no bracket
            run.calls.push_back({name, std::to_string(number), line});
            const bool opens = name == "openat" || name == "dup";
            run.left_open += opens && line.find(" = -1 ") == std::string::npos ? 1 : 0;
            run.left_open -= name == "close" ? 1 : 0;
        }
    }
    std::filesystem::remove(log);
    return run;
}

// An undisturbed start-up, and what is left when one more has put everything right.
struct situation {
    explicit situation(const changes& found) {
        const vorl_device device{found};
        first = trace(device);
        EXPECT_GT(first.calls.size(), 20U) << "strace can't do its work: " << first.printed;
        EXPECT_EQ(device.start_up().status, 0);
        put_right = device.contents();
    }
    traced first;
    tree put_right;
};

// Something for every phase: an old ICU link to migrate, data to reject, an update to install, a
// localtime link to correct, leftovers to remove.
const changes everything_to_do = {{"/var/db/icutz", "-> timezone/tz/2021a.1.0/icutz"},
                                  {"/var/db/icu", "="},
                                  {"needs_cleanup", "="},
                                  {"zoneinfo", "-> /var/db/timezone/tz/2021a.1.0/zoneinfo"},
                                  {"tz_latest", "-> /var/db/timezone/tz/2022a.1.0"},
                                  {"tz/2022a.1.0/zoneinfo/Asia/Tokyo", "= TZif"},
                                  {"tz/2022a.1.0/icutz/icutz44l.dat", "="},
                                  {"localtime", "-> /usr/share/zoneinfo/Asia/Tokyo"},
                                  {"TZVersionDiffRecord", "= old"}};
const std::string default_zone = "-> /var/db/timezone/zoneinfo/America/Los_Angeles";

// `left` as it is without a failed call, which may cost the marker, the zone, and the record or the
// old version in it.
tree settled(tree left) {
    left.erase("/var/db/timezone/needs_cleanup");
    std::string& zone = left["/var/db/timezone/localtime"];
    zone = zone == default_zone ? "-> /var/db/timezone/zoneinfo/Asia/Tokyo" : zone;
    std::string& record = left["/var/db/timezone/TZVersionDiffRecord"];
    const std::set<std::string> costs = {"= old", "=", "= .1.0_2022a.1.0"};
    record = costs.contains(record) ? "= 2019c.1.0_2022a.1.0" : record;
    return left;
}

class each_call : public testing::TestWithParam<std::string> {};

TEST_P(each_call, fails_once) {
    const std::regex repeated{"(openat|read|getdents64|write|ftruncate|fsync)[(].*/(var|usr)/.*"};
    const auto [undisturbed, put_right] = situation{everything_to_do};
    for (const call& failing : undisturbed.calls) {
        SCOPED_TRACE(failing.line);
        const vorl_device device{everything_to_do};
        const traced run = trace(device, "error=" + GetParam(), failing);
        EXPECT_LE(run.status, 1);
        EXPECT_EQ(run.left_open, 0);
        EXPECT_EQ(device.start_up().status, 0);
        if (GetParam() == "EINTR" && std::regex_match(failing.line, repeated)) {
            EXPECT_EQ(run.printed, undisturbed.printed);
            device.expect(put_right);
        }
        EXPECT_EQ(settled(device.contents()), settled(put_right));
    }
}

INSTANTIATE_TEST_SUITE_P(faults, each_call,
                         testing::Values("EIO", "ENOSPC", "EROFS", "EACCES", "EMFILE", "ENOMEM",
                                         "EINTR"),
                         [](const auto& shown) { return shown.param; });

// What power cuts leave for good, beside what the next start-up puts right. Each row holds for a
// cut after the call that its expression finds, up to the call of the next row.
using rows = std::vector<std::pair<std::string, changes>>;

const std::pair<changes, rows> power_cuts[] = {
    {everything_to_do,
     {{"", {{"needs_cleanup", "="}}}, // the next start-up still has all to do
      {"unlink.*/zoneinfo", {}},
      {"symlink.*2022a.1.0/zoneinfo", {{"icutz", "nothing"}, {"TZVersionDiffRecord", "= old"}}},
      {"symlink.*2022a.1.0/icutz", {{"TZVersionDiffRecord", "= old"}}},
      {"ftruncate.*/TZVersionDiffRecord", {{"TZVersionDiffRecord", "="}}},
      {"write.*/TZVersionDiffRecord", {}},
      {"fsync.*/TZVersionDiffRecord", {}},
      {"unlink.*/localtime", {{"localtime", default_zone}}},
      {"symlink.*/localtime", {}}}},
    {links_on("2021a.1.0"), // to be reset
     {{"", {{"needs_cleanup", "="}}},
      {"unlink.*/zoneinfo", {}},
      {"symlink.*default", {{"icutz", "-> /var/db/timezone/tz/2021a.1.0/icutz"}}},
      {"unlink.*/icutz", {}}}}};

TEST(faults, power_is_cut_before_each_call) {
    for (const auto& [found, left] : power_cuts) {
        const auto [undisturbed, put_right] = situation{found};
        auto now = left.begin();
        for (const call& next : undisturbed.calls) {
            SCOPED_TRACE(next.line);
            const vorl_device device{found};
            EXPECT_EQ(trace(device, "signal=KILL", next).status, 137);
            EXPECT_EQ(device.start_up().status, 0);
            device.expect(after(put_right, now->second));
            if (now->first != left.back().first &&
                std::regex_search(next.line, std::regex{"^" + std::next(now)->first})) {
                ++now;
            }
        }
        EXPECT_EQ(now->first, left.back().first) << "is the last of these calls that is made";
    }
}

} // namespace
} // namespace initialiser
