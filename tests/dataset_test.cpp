#include "dataset/dataset.h"

#include "dataset/icu.h"
#include "dataset/zoneinfo.h"
#include "device.h"

#include <gtest/gtest.h>

#include <stdexcept>
#include <type_traits>

namespace initialiser {
namespace {

// Deletion through the interface must not compile.
static_assert(!std::is_destructible_v<vorl_dataset_component>);

TEST(components, are_compatible_by_kind) {
    const device device;
    const vorl_zoneinfo zoneinfo;
    const vorl_icu icu;
    EXPECT_TRUE(zoneinfo.compatible_schema(icu));
    EXPECT_EQ(printed_by([&] { EXPECT_FALSE(icu.compatible_schema(zoneinfo)); }),
              messages{"vorl_icu::compatible_schema: could not dynamic_cast other component"});
}

TEST(components, read_the_first_word) {
    const device device;
    const std::string long_word(8192, 'x');
    for (const auto& [text, word] : std::map<std::string, std::string>{
             {" \t\n\v\f\r2020a further words", "2020a"},
             {" \n", ""},
             {"x\xa0y\n", "x\xa0y"},
             {std::string(4096, ' ') + long_word + " y", long_word}}) {
        device::put({{"/usr/share/zoneinfo.default/+VERSION", "= " + text}});
        EXPECT_EQ(vorl_zoneinfo{}.version_text(), word);
    }
}

TEST(datasets, refuse_bad_paths) {
    const device device;
    for (const std::string path :
         {"/var/db/timezone/tz/", "/var/db/timezone/tz2/2019c.1.0", "/var/db/timezone/TZ/2019c.1.0",
          "var/db/timezone/tz/2019c.1.0", "/usr/share/zoneinfo.default", "x"}) {
        const messages printed = printed_by([&path] {
            try {
                const vorl_dataset dataset{path};
                ADD_FAILURE() << path;
            } catch (const std::invalid_argument& error) {
                EXPECT_STREQ(error.what(), "badpath");
            }
        });
        EXPECT_EQ(printed, messages{"vorl_dataset::create_components: bad path " + path});
    }
}

TEST(datasets, compare) {
    const device device;
    device::put({{"tz/2019c.1.0", "dataset icutz44b.dat"}});
    const vorl_dataset system;
    const vorl_dataset same_age{"/var/db/timezone/tz/2019c.1.0"};
    const vorl_dataset newer{"/var/db/timezone/tz/2020a.1.0"};
    EXPECT_EQ(system.version_text(), same_age.version_text());
    EXPECT_TRUE(system.same_path(vorl_dataset{""}));
    EXPECT_FALSE(system.same_path(same_age));
    EXPECT_FALSE(system.newer_than(same_age) || same_age.newer_than(system));
    EXPECT_TRUE(newer.newer_than(system));
    EXPECT_TRUE(newer.compatible_with(system));
    EXPECT_FALSE(same_age.compatible_with(system));
}

} // namespace
} // namespace initialiser
