#include "foundation/expression.h"

#include <locale>
#include <regex>

#ifndef __GLIBCXX__
#error "libstdc++ is needed: other standard libraries match regular expressions by recursion"
#endif

namespace initialiser {
namespace {

// Each byte stands for itself. None is looked up in a locale.
class byte_traits {
public:
    using char_type = char;
    using string_type = std::string;
    using locale_type = std::locale;
    using char_class_type = unsigned char; // always 0: no class is known

    static std::size_t length(const char* text) { return std::char_traits<char>::length(text); }
    static char translate(char byte) { return byte; }
    static char translate_nocase(char byte) { return byte; }
    template <typename iterator> static std::string transform(iterator first, iterator last) {
        return {first, last};
    }
    // The library compares this with a bracket's equivalence classes, of which there are none.
    template <typename iterator>
    static std::string transform_primary(iterator /*first*/, iterator /*last*/) {
        return {};
    }
    template <typename iterator>
    static std::string lookup_collatename(iterator /*first*/, iterator /*last*/) {
        return {};
    }
    template <typename iterator>
    static char_class_type lookup_classname(iterator /*first*/, iterator /*last*/,
                                            bool /*any_case*/ = false) {
        return 0;
    }
    static bool isctype(char /*byte*/, char_class_type /*classes*/) { return false; }
    static int value(char digit, int /*radix*/) {
        return digit >= '0' && digit <= '9' ? digit - '0' : -1;
    }
    static locale_type imbue(const locale_type& /*locale*/) { return std::locale::classic(); }
    static locale_type getloc() { return std::locale::classic(); }
};

} // namespace

struct vorl_expression::automaton {
    std::basic_regex<char, byte_traits> regex;
};

// __polynomial is libstdc++'s name for the matcher without recursion.
vorl_expression::vorl_expression(const char* pattern)
    : automaton_(new automaton{std::basic_regex<char, byte_traits>{
          pattern, std::regex_constants::ECMAScript | std::regex_constants::__polynomial}}) {}

vorl_expression::~vorl_expression() = default;

std::vector<std::string> vorl_expression::match_whole(const std::string& text) const {
    std::smatch groups;
    if (!std::regex_match(text, groups, automaton_->regex)) {
        return {};
    }
    return {groups.begin(), groups.end()};
}

} // namespace initialiser
