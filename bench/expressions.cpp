// Builds and matches the expressions of an update, as often as the start-up does, the way the
// standard library does it by itself. They are those of foundation/version.cpp and dataset/icu.cpp.
#include <exception>
#include <regex>

int main() {
    try {
        const std::regex version{R"(([0-9]+)([a-z]+)(?:\.([0-9]+))?(?:\.([0-9]+))?)"};
        const std::regex icu_file{R"(icutz([0-9]+[lbe])\.dat)"};
        std::cmatch groups;
        for (const char* const text : {"2019c.1.0", "2020a.1.0", "2020b.1.0"}) {
            if (!std::regex_match(text, groups, version)) {
                return 1;
            }
        }
        for (int dataset = 0; dataset < 2; ++dataset) {
            if (!std::regex_match("icutz44l.dat", groups, icu_file)) {
                return 1;
            }
        }
        return 0;
    } catch (const std::exception&) {
        return 1;
    }
}
