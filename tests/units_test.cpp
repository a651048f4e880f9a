#include "dataset/dataset.h"
#include "dataset/icu.h"
#include "dataset/zoneinfo.h"
#include "device.h"
#include "foundation/expression.h"
#include "foundation/file_system.h"
#include "foundation/text_file.h"
#include "foundation/version.h"
#include "startup/dataset_phase.h"

#include <gtest/gtest.h>

#include <cerrno>
#include <stdexcept>
#include <type_traits>

// What whole start-ups don't show, or only at length.
namespace initialiser {
namespace {

// Deletion through the interface must not compile.
static_assert(!std::is_destructible_v<vorl_dataset_component>);

void expect_printed(const messages& expected, const std::function<void()>& action) {
    static char program_name[] = "vorl_initialiser";
    program_invocation_short_name = program_name;
    testing::internal::CaptureStderr();
    action();
    EXPECT_EQ(lines_of(testing::internal::GetCapturedStderr(), expected), expected);
}

std::string shown(const vorl_version& version) {
    return std::to_string(version.year) + " " + version.letters + " " +
           std::to_string(version.major) + " " + std::to_string(version.minor);
}

TEST(version, parses_whole_texts_only) {
    for (const auto& [text, parsed] : tree{{"2019c", "2019 c -1 -1"},
                                           {"2020a.1.0", "2020 a 1 0"},
                                           {"2019z.1", "2019 z 1 -1"},
                                           {"2016j.12.345", "2016 j 12 345"},
                                           {"02019ab.007", "2019 ab 7 -1"},
                                           {"1c.2147483647", "1 c 2147483647 -1"}}) {
        EXPECT_EQ(shown(vorl_version{text}), parsed);
    }
    for (const std::string text : {"2019C", "2019", "2019c.", "2019c.1.0.2", "", "v2019c", " 2019c",
                                   "2019c ", "2019c.1.0/", "2019\xe4"}) {
        const std::string line = "Cannot parse version string " + text;
        vorl_version version{"1a.2.3"};
        expect_printed({line + ", results.size() = 0", line}, [&] { version.parse(text); });
        EXPECT_TRUE(version.equals(vorl_version{}));
    }
    for (const std::string text : {"2147483648c", "2019c.2147483648.4", "2019c.1.99999999999"}) {
        expect_printed({}, [&] { EXPECT_THROW(vorl_version{text}, std::out_of_range); });
    }
}

TEST(version, is_strictly_and_totally_ordered) {
    std::vector<vorl_version> ascending(1);
    for (const std::string text : {"2019aa", "2019b", "2019c", "2019c.0", "2019c.1", "2019c.1.0",
                                   "2019c.2", "2019c.10.0", "2019ca", "2019d", "2020a"}) {
        ascending.emplace_back(text);
    }
    // Every pair stands as in the table, and so every triple too.
    for (std::size_t first = 0; first < ascending.size(); ++first) {
        for (std::size_t second = 0; second < ascending.size(); ++second) {
            SCOPED_TRACE(shown(ascending[first]) + " and " + shown(ascending[second]));
            EXPECT_EQ(ascending[first].newer_than(ascending[second]), first > second);
            EXPECT_EQ(ascending[first].equals(ascending[second]), first == second);
        }
    }
}

TEST(expression, matches_long_texts) {
    constexpr std::size_t length = 100'000;
    const vorl_expression expression{"([0-9]+)([a-z]+)"};
    EXPECT_EQ(expression.match_whole("1" + std::string(length, 'a'))[2].size(), length);
    EXPECT_TRUE(expression.match_whole(std::string(length, '1')).empty());
}

TEST(file_system, cuts_long_targets) {
    const vorl_device device{{{"long", "-> " + std::string(1500, 'x')}}};
    EXPECT_EQ(read_symlink("/var/db/timezone/long"), std::string(1024, 'x'));
}

TEST(text_file, gives_its_first_word) {
    vorl_device device;
    tree words = {{"", ""}, {"\b\x0e\x1f\x85\xa0!", "\b\x0e\x1f\x85\xa0!"}};
    for (const char blank : {' ', '\t', '\n', '\v', '\f', '\r'}) {
        words[{blank}] = "";
        words[{blank, 'a', blank, 'b'}] = "a";
    }
    // Around the size of what is read at once, and far above it.
    for (const std::size_t length : {16383U, 16384U, 16385U, 300'000U}) {
        const std::string word = std::string(length - 1, 'a') + "z";
        words[word] = word;
        words[word + " b"] = word;
        words[std::string(length, ' ') + word + " b"] = word;
    }
    for (const auto& [text, word] : words) {
        device.put({{"text", "= " + text}});
        EXPECT_TRUE(read_first_word("/var/db/timezone/text") == word)
            << text.size() << " bytes: " << text.substr(0, 20);
    }
}

TEST(dataset, is_named_by_its_path) {
    const vorl_device device;
    testing::internal::CaptureStderr();
    EXPECT_EQ(vorl_dataset{"/var/db/timezone/tz/2020a.1.0/"}.version_text(), "2020a.1.0/");
    for (const std::string path :
         {"/", "/var/db/timezone/tz/", "/var/db/timezone/tz2/x", "/var/db/timezone/TZ/x",
          "var/db/timezone/tz/x", "//var/db/timezone/tz/x", "/usr/share/zoneinfo.default"}) {
        EXPECT_THROW(vorl_dataset{path}, std::invalid_argument) << path;
    }
    testing::internal::GetCapturedStderr();
}

TEST(dataset, is_found_by_the_zoneinfo_link) {
    for (const auto& [target, path] :
         tree{{"/usr/share/zoneinfo.default", ""},
              {"/var/db/timezone/tz/2020a.1.0/zoneinfo", "/var/db/timezone/tz/2020a.1.0"},
              {"/var/db/timezone/tz/2020a.1.0/", "/var/db/timezone/tz/2020a.1.0"},
              {"/var/db/timezone/tz/a/b/zoneinfo", "/var/db/timezone/tz/a/b"},
              {"/var/db/timezone/tz/x/zoneinfo", "/var/db/timezone/tz/x"}}) {
        EXPECT_EQ(dataset_path_of_zoneinfo_link(target), path);
    }
    for (const std::string target :
         {"", "/", "/usr/share/zoneinfo", "/usr/share/zoneinfo.default/", "tz/x/zoneinfo",
          "/usr/share/zoneinfo.defaults", "/var/db/timezone/tz", "/var/db/timezone/tz/",
          "/var/db/timezone/tz/x", "/var/db/timezone/tz//x", "/var/db/timezone/TZ/x/zoneinfo"}) {
        expect_printed({"Bad zoneinfo link " + target},
                       [&] { EXPECT_THROW(dataset_path_of_zoneinfo_link(target), int); });
    }
}

TEST(components, are_compatible_by_kind) {
    EXPECT_TRUE(vorl_zoneinfo{}.compatible_schema(vorl_icu{}));
    expect_printed({"vorl_icu::compatible_schema: could not dynamic_cast other component"},
                   [] { EXPECT_FALSE(vorl_icu{}.compatible_schema(vorl_zoneinfo{})); });
}

} // namespace
} // namespace initialiser
