#include "dataset/dataset.h"
#include "harness.h"
#include "foundation/expression.h"
#include "foundation/file_system.h"
#include "foundation/text_file.h"
#include "foundation/version.h"
#include "startup/dataset_phase.h"

#include <gtest/gtest.h>

#include <stdexcept>

// What whole start-ups don't show, or only at length.
namespace initialiser {
namespace {

TEST(version, parses_whole_texts_only) {
    for (const std::string text : {"2019C", "2019", "2019c.", "2019c.1.0.2", "", "v2019c", " 2019c",
                                   "2019c ", "2019c.1.0/", "2019\xe4"}) {
        vorl_version version{"1a.2.3"};
        version.parse(text);
        EXPECT_TRUE(version.equals(vorl_version{})) << text;
    }
    for (const std::string text : {"2147483648c", "2019c.2147483648.4", "2019c.1.99999999999"}) {
        EXPECT_THROW(vorl_version{text}, std::out_of_range) << text;
    }
}

TEST(version, is_strictly_and_totally_ordered) {
    const std::vector<std::string> ascending = {
        "",        "2019aa",     "2019b",  "2019c", "2019c.0", "2019c.1",         "2019c.1.0",
        "2019c.2", "2019c.10.0", "2019ca", "2019d", "02020a",  "2020a.2147483647"};
    for (auto one = ascending.begin(); one != ascending.end(); ++one) {
        for (auto other = ascending.begin(); other != ascending.end(); ++other) {
            SCOPED_TRACE(*one + " and " + *other);
            EXPECT_EQ(vorl_version{*one}.newer_than(vorl_version{*other}), one > other);
            EXPECT_EQ(vorl_version{*one}.equals(vorl_version{*other}), one == other);
        }
    }
}

TEST(expression, matches_long_texts) {
    const std::string word(100'000, 'a');
    EXPECT_EQ(vorl_expression{"([0-9]+)([a-z]+)"}.match_whole("1" + word)[2], word);
}

TEST(file_system, cuts_long_targets) {
    const vorl_device device{{{"long", "-> " + std::string(1500, 'x')}}};
    EXPECT_EQ(read_symlink("/var/db/timezone/long"), std::string(1024, 'x'));
}

TEST(text_file, gives_its_first_word) {
    const vorl_device device;
    tree words = {{"", ""}, {"\b\x0e\x1f\x85\xa0!", "\b\x0e\x1f\x85\xa0!"}};
    for (const char blank : {' ', '\t', '\n', '\v', '\f', '\r'}) {
        words[{blank, 'a', blank, 'b'}] = std::string{"a"};
    }
    // Around the size of what is read at once, and far above it.
    for (const std::size_t length : {16383U, 16384U, 16385U, 20'000'000U}) {
        const std::string word(length, 'a');
        words[word] = word;
        words[std::string(length, ' ') + word + " b"] = word;
    }
    for (const auto& [text, word] : words) {
        device.put({{"text", "= " + text}});
        EXPECT_TRUE(read_first_word("/var/db/timezone/text") == word)
            << text.size() << " bytes: " << text.substr(0, 20);
    }
}

TEST(dataset, lies_among_the_stored_ones) {
    for (const std::string path :
         {"/var/db/timezone/tz/", "/var/db/timezone/tz2/x", "//var/db/timezone/tz/x"}) {
        EXPECT_THROW(vorl_dataset{path}, std::invalid_argument) << path;
    }
}

TEST(dataset, is_found_by_the_zoneinfo_link) {
    for (const auto& [target, path] :
         tree{{"/usr/share/zoneinfo.default", ""},
              {"/var/db/timezone/tz/a/b/zoneinfo", "/var/db/timezone/tz/a/b"},
              {"/var/db/timezone/tz/x/", "/var/db/timezone/tz/x"}}) {
        EXPECT_EQ(dataset_path_of_zoneinfo_link(target), path);
    }
    for (const std::string target :
         {"", "tz/x/zoneinfo", "/usr/share/zoneinfo", "/usr/share/zoneinfo.defaults",
          "/var/db/timezone/tz/", "/var/db/timezone/tz/x", "/var/db/timezone/tz//x"}) {
        EXPECT_THROW(dataset_path_of_zoneinfo_link(target), int) << target;
    }
}

} // namespace
} // namespace initialiser
