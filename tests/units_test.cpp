#include "dataset/dataset.h"
#include "dataset/icu.h"
#include "foundation/file_system.h"
#include "foundation/text_file.h"
#include "foundation/version.h"
#include "harness.h"
#include "startup/dataset_phase.h"

#include <gtest/gtest.h>

#include <cstddef>
#include <cstdio>
#include <iterator>
#include <regex>
#include <stdexcept>
#include <string>
#include <utility>
#include <vector>

// What whole start-ups don't show, or only at length.
namespace initialiser {
namespace {

// All texts of `beginning` and up to `more` bytes of `alphabet`.
std::vector<std::string> texts(const std::string& beginning, std::size_t more,
                               const std::string& alphabet) {
    std::vector<std::string> all = {beginning};
    for (std::size_t next = 0; all[next].size() < beginning.size() + more; ++next) {
        for (const char byte : alphabet) {
            all.push_back(all[next] + byte);
        }
    }
    return all;
}

// The alphabets have the ends of each range of bytes, their neighbours, and bytes of other kinds.
TEST(version, has_its_form) {
    const std::regex form{R"(([0-9]+)([a-z]+)(?:\.([0-9]+))?(?:\.([0-9]+))?)"};
    const auto number = [](const std::string& digits) {
        return digits.empty() ? -1 : stoi(digits);
    };
    FILE* const shown = std::exchange(stderr, std::fopen("/dev/null", "we")); // many messages
    for (const std::string beginning : {"", "9z", "9z.0", "9z.0.9"}) {
        for (const std::string& text : texts(beginning, 4, "/09:`az{.A \xe4")) {
            vorl_version expected;
            if (std::smatch part; std::regex_match(text, part, form)) {
                expected.year = number(part[1]);
                expected.letters = part[2];
                expected.major = number(part[3]);
                expected.minor = number(part[4]);
            }
            vorl_version version{"1a.2.3"};
            version.parse(text);
            EXPECT_TRUE(version.equals(expected)) << text;
        }
    }
    std::fclose(std::exchange(stderr, shown));
}

TEST(icu, files_have_their_form) {
    const std::regex form{R"(icutz([0-9]+[lbe])\.dat)"};
    for (const std::string beginning : {"", "icutz", "icutz9l"}) {
        for (const std::string& text : texts(beginning, 3, "/09:lbekmacdft.L \xe4")) {
            for (const std::string& name : {text, text + ".dat"}) {
                std::smatch part;
                const bool fits = std::regex_match(name, part, form);
                EXPECT_EQ(schema_of_icu_file(name), fits ? part[1].str() : "") << name;
            }
        }
    }
}

TEST(version, has_numbers_up_to_a_limit) {
    for (const std::string text : {"2147483648c", "2c.2147483648.4", "2c.1.99999999999"}) {
        EXPECT_THROW(vorl_version{text}, std::out_of_range) << text;
    }
    vorl_version version{"1a.2.3"};
    EXPECT_THROW(version.parse("2c.4.2147483648"), std::out_of_range);
    EXPECT_TRUE(version.equals(vorl_version{"2c.4.3"})) << "what stands before the number is set";
    const std::string letters(100'000, 'a');
    EXPECT_EQ(vorl_version{"1" + letters}.letters, letters);
}

TEST(version, is_strictly_and_totally_ordered) {
    const std::vector<std::string> ascending = {
        "",        "2019aa",     "2019b",  "2019c", "2019c.0", "2019c.1",         "2019c.1.0",
        "2019c.2", "2019c.10.0", "2019ca", "2019d", "02020a",  "2020a.2147483647"};
    for (auto newer = std::next(ascending.begin()); newer != ascending.end(); ++newer) {
        const vorl_version older{*std::prev(newer)};
        EXPECT_TRUE(vorl_version{*newer}.newer_than(older)) << *newer;
        EXPECT_FALSE(older.newer_than(vorl_version{*newer}) || older.newer_than(older)) << *newer;
    }
}

TEST(file_system, cuts_long_targets) {
    const vorl_device device{{{"long", "-> " + std::string(1500, 'x')}}};
    EXPECT_EQ(read_symlink("/var/db/timezone/long"), std::string(1024, 'x'));
}

TEST(text_file, gives_its_first_word) {
    const vorl_device device;
    tree words = {{"", ""}, {"\b\x0e\x1f\x85\xa0!", "\b\x0e\x1f\x85\xa0!"}, {"\v\f\ra\r", "a"}};
    // Around the size of what is read at once, and far above it.
    for (const std::size_t length : {16383U, 16384U, 16385U, 20'000'000U}) {
        const std::string word(length, 'a');
        words[word] = word;
        words[std::string(length, ' ') + word + " b"] = word;
    }
    for (const auto& [text, word] : words) {
        device.put({{"text", "= " + text}});
        EXPECT_TRUE(read_first_word("/var/db/timezone/text") == word) << text.substr(0, 20);
    }
}

TEST(dataset, is_found_by_its_path) {
    const std::string area = "/var/db/timezone/";
    for (const std::string& path : {area + "tz/", area + "tz2/x", "/" + area + "tz/x"}) {
        EXPECT_THROW(vorl_dataset{path}, std::invalid_argument) << path;
    }
    EXPECT_EQ(dataset_path_of_zoneinfo_link("/usr/share/zoneinfo.default"), "");
    EXPECT_EQ(dataset_path_of_zoneinfo_link(area + "tz/a/b/zoneinfo"), area + "tz/a/b");
    EXPECT_EQ(dataset_path_of_zoneinfo_link(area + "tz/x/"), area + "tz/x");
    for (const std::string& target :
         {area + "tz/", area + "tz/x", area + "tz//x", std::string{"tz/x/"},
          std::string{"/usr/share/zoneinfo.defaults"}}) {
        EXPECT_THROW(dataset_path_of_zoneinfo_link(target), int) << target;
    }
}

} // namespace
} // namespace initialiser
