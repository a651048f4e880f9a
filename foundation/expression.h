#pragma once

#include <memory>
#include <string>
#include <vector>

namespace initialiser {

// A regular expression (ECMAScript grammar) over bytes. It needs little stack and time in
// proportion to the text's length.
//
// The standard library's default matcher recurses once per character. A version word of 50,000
// letters then overflows the stack and ends every start-up by a signal. And with the default
// traits, building an expression asks the locale about every byte of every bracket, which costs
// more than the rest of a start-up. So the expressions here are matched without recursion, and
// their traits know no locale. They may not name a character class (\d, \w, [[:alpha:]]): the
// constructor then throws std::regex_error.
class vorl_expression {
public:
    explicit vorl_expression(const char* pattern);
    ~vorl_expression();
    vorl_expression(const vorl_expression&) = delete;
    vorl_expression& operator=(const vorl_expression&) = delete;

    // Matches the whole of `text`. Returns the text itself and then each group's part, empty where
    // the group took none; nothing at all when the text doesn't match.
    std::vector<std::string> match_whole(const std::string& text) const;

private:
    struct automaton;
    std::unique_ptr<const automaton> automaton_;
};

} // namespace initialiser
