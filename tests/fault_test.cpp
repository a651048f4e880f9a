#include "device.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/resource.h>
#include <unistd.h>

#include <array>
#include <csignal>
#include <filesystem>
#include <fstream>
#include <iostream>
#include <regex>

// What a start-up survives: each of its calls for files failing or interrupted, the power cut at
// each of them, and a standard error that can't take a line.
namespace initialiser {
namespace {

struct file_call {
    std::string name;  // as strace has it: "unlinkat" on some machines, where others have "unlink"
    int count = 0;     // which of the calls of that name it is
    std::string text;  // the name without "at", then the paths in their order
    bool made = false; // and successful
};

struct trace : outcome {
    std::vector<file_call> calls;
};

// A start-up under strace, which fails or cuts calls as the options say, and its calls for files.
trace traced(const vorl_device& device, const messages& options = {}) {
    const std::string log = "/var/calls";
    // The sanitizers' search for leaks can't run beside strace.
    messages strace = {"strace", "-DyE", "ASAN_OPTIONS=detect_leaks=0",         "-s999", "-o",
                       log,      "-e",   "trace=rt_sigaction,%file,%desc,fsync"};
    strace.insert(strace.end(), options.begin(), options.end());
    trace result{device.start_up(strace), {}};
    std::map<std::string, int> counts;
    std::ifstream lines{log};
    bool begun = false;
    for (std::string line; std::getline(lines, line);) {
        // The start-up's first own act, and no sanitizer's, is to ignore broken pipes.
        begun = begun || line.starts_with("rt_sigaction(SIGPIPE");
        const std::string name = line.substr(0, line.find('('));
        file_call call{name, ++counts[name], std::regex_replace(name, std::regex{"at$|64$"}, ""),
                       line.find(" = -1 ") == std::string::npos};
        static const std::regex path{R"raw("(/[^"]*)"|\d<(/[^>]*)>)raw"};
        const std::string arguments = line.substr(0, line.rfind(" = "));
        for (std::sregex_iterator next{arguments.begin(), arguments.end(), path}, end; next != end;
             ++next) {
            call.text += " " + (*next)[1].str() + (*next)[2].str();
        }
        if (begun && call.text.find('/') != std::string::npos && name != "mmap") {
            result.calls.push_back(call);
        }
    }
    std::filesystem::remove(log);
    return result;
}

messages at(const file_call& call, const std::string& fault) {
    return {"-e", "inject=" + call.name + ":" + fault + ":when=" + std::to_string(call.count)};
}

const std::string area = "/var/db/timezone/";
const std::string update = area + "tz/2022a.1.0";
const std::string record = area + "TZVersionDiffRecord";
const changes old_record = {{record, "= that of the update before"}};

// Something for every phase: an old ICU link to migrate, data to reject, an update to install, a
// localtime link to correct, leftovers to remove.
const changes everything_to_do = {{"tz/2022a.1.0", "dataset icutz44l.dat"},
                                  {"update", "2022a.1.0"},
                                  {"zoneinfo", "-> /var/db/timezone/tz/2021a.1.0/zoneinfo"},
                                  {"localtime", "-> /usr/share/zoneinfo/Asia/Tokyo"},
                                  {"needs_cleanup", "="},
                                  old_record.front(),
                                  {"/var/db/icutz", "-> timezone/tz/2021a.1.0/icutz"},
                                  {"/var/db/icu", "="}};

tree after_start_ups(const changes& found, int number) {
    const vorl_device device{found};
    for (int i = 0; i < number; ++i) {
        EXPECT_EQ(device.start_up().status, 0);
    }
    return device.contents();
}

// What the next start-up need not put right after a failed call is taken as put right: a missing
// marker, a record that was not written, a zone that could not be read.
tree settled(tree contents) {
    contents.erase(area + "needs_cleanup");
    std::string& text = contents[record]; // an unreadable version is the empty one
    if (text == "=" || text == old_record.front().second || text == "= .1.0_2022a.1.0") {
        text = "= 2019c.1.0_2022a.1.0";
    }
    if (contents[area + "localtime"] == "-> /var/db/timezone/zoneinfo/America/Los_Angeles") {
        contents[area + "localtime"] = "-> /var/db/timezone/zoneinfo/Asia/Tokyo";
    }
    return contents;
}

class faults : public testing::TestWithParam<std::string> {};

TEST_P(faults, at_any_call_are_put_right) {
    const tree expected = settled(after_start_ups(everything_to_do, 2));
    const trace undisturbed = traced(vorl_device{everything_to_do});
    for (const file_call& call : undisturbed.calls) {
        SCOPED_TRACE(call.text);
        const vorl_device device{everything_to_do};
        const trace result = traced(device, at(call, "error=" + GetParam()));
        EXPECT_LE(result.status, 1);
        int left_open = 0;
        for (const auto& [name, count, text, made] : result.calls) {
            left_open += (name == "openat" && made ? 1 : 0) - (name == "close" ? 1 : 0);
        }
        EXPECT_EQ(left_open, 0);
        EXPECT_EQ(device.start_up().status, 0);
        EXPECT_EQ(settled(device.contents()), expected);
    }
    EXPECT_GT(undisturbed.calls.size(), 60);
    std::cout << undisturbed.calls.size() << " calls failed, one in each start-up\n";
}

INSTANTIATE_TEST_SUITE_P(error, faults,
                         testing::Values("EIO", "ENOSPC", "EROFS", "EACCES", "EMFILE", "ENOMEM"),
                         [](const auto& shown) { return shown.param; });

TEST(faults, interruptions_change_nothing) {
    const vorl_device whole{everything_to_do};
    const std::vector<file_call> calls = traced(whole).calls;
    const messages printed = {"Symlink points at data incompatible with installed system",
                              "Correcting localtime link to /var/db/timezone/zoneinfo/Asia/Tokyo"};
    int interrupted = 0;
    for (const file_call& call : calls) {
        static const std::regex waiting{"(open|read|getdents|write|fsync) /(var|usr)/.*"};
        if (std::regex_match(call.text, waiting)) {
            SCOPED_TRACE(call.text);
            ++interrupted;
            const vorl_device device{everything_to_do};
            EXPECT_EQ(lines_of(traced(device, at(call, "error=EINTR")).printed, printed), printed);
            EXPECT_EQ(device.contents(), whole.contents());
        }
    }
    EXPECT_GT(interrupted, 15);
    std::cout << interrupted << " calls interrupted, one in each start-up\n";
    // For ever: the start-up gives up, and does not hang.
    EXPECT_EQ(
        traced(vorl_device{}, {"-P/usr/share/icu/icutzformat.txt", "-einject=openat:error=EINTR"})
            .status,
        0);
}

// Once the call is made, a power cut leaves this, which the next start-up doesn't put right.
using limits = std::vector<std::pair<std::string, changes>>;

void expect_limits(const changes& found, const limits& expected) {
    const tree put_right = after_start_ups(found, 2);
    const std::vector<file_call> calls = traced(vorl_device{found}).calls;
    auto reached = expected.begin();
    std::string last = "the begin";
    for (const file_call& call : calls) {
        SCOPED_TRACE("cut after " + last);
        const vorl_device device{found};
        EXPECT_EQ(traced(device, at(call, "signal=KILL")).status, 128 + SIGKILL);
        EXPECT_EQ(device.start_up().status, 0);
        EXPECT_EQ(device.contents(), after(put_right, reached->second));
        last = call.text;
        if (reached + 1 != expected.end() && last == (reached + 1)->first) {
            ++reached;
        }
    }
    EXPECT_TRUE(reached + 1 == expected.end()) << "never made: " << (reached + 1)->first;
    EXPECT_TRUE(reached->second.empty());
    std::cout << "power cut at each of " << calls.size() << " calls\n";
}

TEST(faults, a_power_cut_on_the_way_from_rejected_data_to_an_update) {
    expect_limits(
        everything_to_do,
        {{"", {{"needs_cleanup", "="}}},
         {"unlink /var/db/timezone/zoneinfo", {}},
         {"symlink " + update + "/zoneinfo /var/db/timezone/zoneinfo",
          {{"icutz", "nothing"}, old_record.front()}},
         {"symlink " + update + "/icutz /var/db/timezone/icutz", old_record},
         {"ftruncate " + record, {{record, "="}}},
         {"write " + record, {}},
         {"fsync " + record, {}},
         {"unlink /var/db/timezone/localtime",
          {{"localtime", "-> /var/db/timezone/zoneinfo/America/Los_Angeles"}}},
         {"symlink /var/db/timezone/zoneinfo/Asia/Tokyo /var/db/timezone/localtime", {}}});
}

TEST(faults, a_power_cut_on_the_way_from_one_update_to_the_next) {
    expect_limits({{"tz/2022a.1.0", "dataset icutz44l.dat"},
                   {"links", "2020a.1.0"},
                   {"update", "2022a.1.0"},
                   old_record.front()},
                  {{"", {{"needs_cleanup", "="}}},
                   {"unlink /var/db/timezone/zoneinfo", {{record, "= 2019c.1.0_2022a.1.0"}}},
                   {"symlink " + update + "/zoneinfo /var/db/timezone/zoneinfo",
                    {{"icutz", "-> /var/db/timezone/tz/2020a.1.0/icutz"}, old_record.front()}},
                   {"unlink /var/db/timezone/icutz", {{"icutz", "nothing"}, old_record.front()}},
                   {"symlink " + update + "/icutz /var/db/timezone/icutz", old_record},
                   {"ftruncate " + record, {{record, "="}}},
                   {"write " + record, {}},
                   {"fsync " + record, {}}});
}

TEST(faults, nothing_to_do_writes_nothing) {
    for (const file_call& call : traced(vorl_device{}).calls) {
        EXPECT_FALSE(call.name == "fsync" || call.name == "write") << call.text;
    }
}

TEST(faults, no_memory_for_a_walk_resets_the_links) {
    const vorl_device device{{{"links", "2020a.1.0"}}};
    const tree expected = after(device.contents(), {{"links", "system"}});
    const std::string icu = area + "tz/2020a.1.0/icutz";
    const std::string reason = "Cannot allocate memory";
    EXPECT_EQ(traced(device, {"-P" + icu, "-einject=openat:error=ENOMEM"}).printed,
              "vorl_initialiser: tz_icu::initialize: fts_open of " + icu + " failed, " + reason +
                  ": " + reason +
                  "\nvorl_initialiser: Unable to locate data; resetting to system partition: " +
                  reason + "\n");
    EXPECT_EQ(device.contents(), expected);
}

// As when the link comes only after the look at what stands there.
TEST(faults, the_record_follows_no_link) {
    const vorl_device device{
        {{"update", "2020a.1.0"}, {"/var/precious", "= file"}, {record, "-> /var/precious"}}};
    const tree expected = after(device.contents(), {{"links", "2020a.1.0"}});
    traced(device, {"-P" + record, "-einject=%%stat:error=ENOENT:when=1"});
    EXPECT_EQ(device.contents(), expected);
}

TEST(faults, messages_can_not_harm) {
    const auto contents_after = [](const std::function<void()>& prepare) {
        const vorl_device device{everything_to_do};
        EXPECT_EQ(device.start_up({}, prepare).status, 0);
        return device.contents();
    };
    const tree expected = after_start_ups(everything_to_do, 1);
    EXPECT_EQ(contents_after([] { close(2); }), expected);
    EXPECT_EQ(contents_after([] { close(0), close(1), close(2); }), expected);
    EXPECT_EQ(contents_after([] { dup2(open("/dev/full", O_WRONLY), 2); }), expected);
    EXPECT_EQ(contents_after([] {
                  std::array<int, 2> ends{};
                  EXPECT_EQ(pipe(ends.data()), 0);
                  dup2(ends[1], 2), close(ends[0]), close(ends[1]);
              }),
              expected);
    // A limit on the size of files costs the record, not the start-up.
    EXPECT_EQ(contents_after([] {
                  const rlimit none{0, 0};
                  setrlimit(RLIMIT_FSIZE, &none);
              }),
              after(expected, {{record, "="}}));
    // No file gets the number of a closed standard descriptor. With no other number to be had, none
    // is opened: nothing is found to be wrong with the data in use.
    const vorl_device device{{{"links", "2021a.1.0"}}};
    const tree untouched = device.contents();
    device.start_up({}, [] {
        const rlimit three{3, 3};
        setrlimit(RLIMIT_NOFILE, &three);
        close(0), close(1), close(2);
    });
    EXPECT_EQ(device.contents(), untouched);
}

} // namespace
} // namespace initialiser
