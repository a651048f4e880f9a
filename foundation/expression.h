#pragma once

#include <memory>
#include <string>
#include <vector>

namespace initialiser {

// A regular expression (ECMAScript grammar) over bytes, matched in bounded stack and linear time.
//
// The standard library's usual matcher recurses once per character: a version word of 50,000
// letters overflows the stack and ends every start-up by a signal. And building an expression with
// the usual traits asks the locale about every byte of every bracket, which alone would cost more
// than all the rest of a start-up. So the expressions here are matched without recursion and built
// over traits that know no locale. The price: an expression may not name a character class (\d, \w,
// [[:alpha:]]), for which std::regex_error is thrown.
class vorl_expression {
public:
    explicit vorl_expression(const char* pattern);
    ~vorl_expression();
    vorl_expression(const vorl_expression&) = delete;
    vorl_expression& operator=(const vorl_expression&) = delete;

    // Matches the whole of `text`. Returns no entry when it doesn't match, otherwise the text
    // itself and then each group's part, empty where the group took none.
    std::vector<std::string> match_whole(const std::string& text) const;

private:
    struct automaton;
    std::unique_ptr<const automaton> automaton_;
};

} // namespace initialiser
