// Builds and matches, as the standard library does it by itself, the expressions of the typical
// start-up, as often as it does. They are those of foundation/version.cpp and dataset/icu.cpp.
#include <exception>
#include <regex>

namespace {

bool matches(const char* expression, const char* text) {
    std::cmatch groups;
    return std::regex_match(text, groups, std::regex{expression});
}

} // namespace

int main() {
    try {
        for (const char* const version : {"2019c.1.0", "2020a.1.0", "2020b.1.0"}) {
            if (!matches(R"(([0-9]+)([a-z]+)(?:\.([0-9]+))?(?:\.([0-9]+))?)", version)) {
                return 1;
            }
        }
        const bool current = matches(R"(icutz([0-9]+[lbe])\.dat)", "icutz44l.dat");
        const bool latest = matches(R"(icutz([0-9]+[lbe])\.dat)", "icutz44l.dat");
        return current && latest ? 0 : 1;
    } catch (const std::exception&) {
        return 1;
    }
}
