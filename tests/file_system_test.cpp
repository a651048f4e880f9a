#include "foundation/file_system.h"

#include "device.h"
#include "startup/current_links.h"

#include <gtest/gtest.h>

#include <cerrno>
#include <cstring>

namespace initialiser {
namespace {

const std::string area = "/var/db/timezone/";

struct failure {
    std::function<void()> operation;
    int error;
    std::string message;
};

TEST(file_system, prints_a_failure_once_and_throws_its_number) {
    const device device;
    device::put({{"link", "-> target"}, {"loop", "-> loop"}});
    const tree before = device::contents();
    for (const auto& [operation, error, message] : std::vector<failure>{
             {[] { remove(area + "tz"); }, EISDIR, "remove: could not remove " + area + "tz"},
             {[] { read_symlink(area + "tz"); }, EINVAL, "read_symlink: " + area + "tz"},
             {[] { read_symlink(area + "loop/x"); }, ELOOP, "read_symlink: " + area + "loop/x"},
             {[] { create_symlink("target", area + "link"); }, EEXIST,
              "create_symlink: from " + area + "link to target"},
             {[] { create_symlink("target", area + "none/link"); }, ENOENT,
              "create_symlink: from " + area + "none/link to target"}}) {
        int thrown = 0;
        testing::internal::CaptureStderr();
        try {
            operation();
        } catch (const int number) {
            thrown = number;
        }
        EXPECT_EQ(testing::internal::GetCapturedStderr(),
                  program_invocation_short_name + (": " + message) + ": " + strerror(error) + "\n");
        EXPECT_EQ(thrown, error);
    }
    EXPECT_EQ(device::contents(), before);
}

TEST(file_system, takes_a_missing_path_for_an_answer) {
    const device device;
    device::put({{"dangling", "-> nowhere"}, {"long", "-> " + std::string(1025, 'x')}});
    const messages printed = printed_by([] {
        remove(area + "none");
        EXPECT_EQ(read_symlink(area + "none"), "");
        EXPECT_FALSE(exists(area + "dangling"));
        EXPECT_TRUE(exists(area + "zoneinfo"));
        EXPECT_EQ(read_symlink(area + "long"), std::string(1024, 'x'));
        remove(area + "zoneinfo");
        discard(area + "tz");
    });
    EXPECT_EQ(printed, messages{});
    EXPECT_TRUE(exists("/usr/share/zoneinfo.default") && exists(area + "tz"));
    EXPECT_EQ(read_symlink(area + "zoneinfo"), "");
}

TEST(current_links, map_to_dataset_paths) {
    const std::string stored = "/var/db/timezone/tz/";
    const std::string bad = "bad";
    const std::map<std::string, std::string> paths = {
        {"/usr/share/zoneinfo.default", ""},
        {stored + "2019c.1.0/zoneinfo", stored + "2019c.1.0"},
        {stored + "2019c.1.0/", stored + "2019c.1.0"},
        {stored + "a/b/zoneinfo", stored + "a/b"},
        {stored + "x/", stored + "x"},
        {stored + "2019c.1.0", bad},
        {stored + "/zoneinfo", bad},
        {stored, bad},
        {"", bad},
        {"/usr/share/zoneinfo", bad},
        {"/usr/share/zoneinfo.default/", bad},
        {"." + stored + "2019c/zoneinfo", bad}};
    for (const auto& [target, path] : paths) {
        std::string result = bad;
        const messages printed = printed_by([&result, &target = target] {
            try {
                result = dataset_path_of_zoneinfo_link(target);
            } catch (const int number) {
                EXPECT_EQ(number, -1);
            }
        });
        EXPECT_EQ(result, path);
        EXPECT_EQ(printed, path == bad ? messages{"Bad zoneinfo link " + target} : messages{});
    }
}

} // namespace
} // namespace initialiser
