#include "harness.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <iterator>
#include <map>
#include <regex>
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
};

traced trace(const vorl_device& device, const std::string& fault = "", const call& at = {}) {
    const std::string log = "/usr/share/calls";
    const std::string inject = " -e inject=" + at.name + ":" + fault + ":when=" + at.number;
    traced run{device.start_up("$strace -y -e trace=rt_sigaction,%file,%desc,fsync -o " + log +
                               (fault.empty() ? "" : inject) + " $program"),
               {}};
    std::map<std::string, int> numbers;
    bool begun = false;
    std::ifstream lines{log};
    for (std::string line; std::getline(lines, line);) {
        const std::string name = line.substr(0, line.find('('));
        const int number = ++numbers[name];
        begun = begun || line.starts_with("rt_sigaction(SIGPIPE");
        if (begun && name != line && !name.starts_with("mmap")) { // a signal has no bracket
            run.calls.push_back({name, std::to_string(number), line});
        }
    }
    std::filesystem::remove(log);
    return run;
}

// An undisturbed start-up, and what is left when one more has put everything right.
std::pair<traced, tree> undisturbed_start_up(const changes& found) {
    const vorl_device device{found};
    const traced run = trace(device);
    EXPECT_GT(run.calls.size(), 20U) << "strace can't do its work: " << run.printed;
    EXPECT_EQ(device.start_up().status, 0);
    return {run, device.contents()};
}

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

// `left` as it is without a failed call, which may cost the marker, the record and the zone.
tree settled(tree left) {
    left.erase("/var/db/timezone/needs_cleanup");
    left.erase("/var/db/timezone/TZVersionDiffRecord");
    std::string& zone = left["/var/db/timezone/localtime"];
    zone = zone == default_zone ? "-> /var/db/timezone/zoneinfo/Asia/Tokyo" : zone;
    return left;
}

class each_call : public testing::TestWithParam<std::string> {};

TEST_P(each_call, fails_once) {
    const std::regex repeated{"(openat|read|getdents64|write|ftruncate|fsync)[(].*/(var|usr)/.*"};
    const auto [undisturbed, put_right] = undisturbed_start_up(everything_to_do);
    for (const call& failing : undisturbed.calls) {
        SCOPED_TRACE(failing.line);
        const vorl_device device{everything_to_do};
        const traced run = trace(device, "error=" + GetParam(), failing);
        EXPECT_LE(run.status, 1);
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
const std::vector<std::pair<std::string, changes>> power_cuts = {
    {"", {{"needs_cleanup", "="}}}, // the next start-up still has all to do
    {"unlink.*/zoneinfo", {}},
    {"symlink.*2022a.1.0/zoneinfo", {{"icutz", "nothing"}, {"TZVersionDiffRecord", "= old"}}},
    {"symlink.*2022a.1.0/icutz", {{"TZVersionDiffRecord", "= old"}}},
    {"ftruncate.*/TZVersionDiffRecord", {{"TZVersionDiffRecord", "="}}},
    {"write.*/TZVersionDiffRecord", {}},
    {"fsync.*/TZVersionDiffRecord", {}},
    {"unlink.*/localtime", {{"localtime", default_zone}}},
    {"symlink.*/localtime", {}}};

TEST(faults, power_is_cut_before_each_call) {
    const auto [undisturbed, put_right] = undisturbed_start_up(everything_to_do);
    auto now = power_cuts.begin();
    for (const call& next : undisturbed.calls) {
        SCOPED_TRACE(next.line);
        const vorl_device device{everything_to_do};
        EXPECT_EQ(trace(device, "signal=KILL", next).status, 137);
        EXPECT_EQ(device.start_up().status, 0);
        device.expect(after(put_right, now->second));
        if (now->first != power_cuts.back().first &&
            std::regex_search(next.line, std::regex{"^" + std::next(now)->first})) {
            ++now;
        }
    }
    EXPECT_EQ(now->first, power_cuts.back().first) << "is the last of these calls that is made";
}

} // namespace
} // namespace initialiser
