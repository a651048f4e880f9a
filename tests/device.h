#pragma once

#include "foundation/descriptor.h"

#include <map>
#include <string>
#include <utility>
#include <vector>

namespace initialiser {

// Paths and what is put, or expected, there. tests/scenarios/README.md explains both.
using changes = std::vector<std::pair<std::string, std::string>>;
using tree = std::map<std::string, std::string>;
using messages = std::vector<std::string>;

struct outcome {
    int status; // the exit status; for a signal 128 and its number
    std::string printed;
};

// A device, new from the factory but for the changes of `found`. For this process and its children
// its /var and /usr/share hide the machine's, so that the program's fixed paths are the real ones.
class vorl_device {
public:
    // Throws where neither root nor a namespace can be had: a test never passes unrun.
    explicit vorl_device(const changes& found = {});
    ~vorl_device();

    void put(const changes& list);

    // With `stamped`, a file that was made anew differs from one that was left alone.
    tree contents(bool stamped = false) const;

    // One start-up of the real program. One that doesn't end is killed, and an exception says so.
    outcome start_up() const;

    // The program's path.
    std::string program() const { return "/proc/self/fd/" + std::to_string(program_.number()); }

private:
    vorl_descriptor program_; // opened before something hides it
    messages hidden_;
};

// `contents` after the changes of `list`.
tree after(tree contents, const changes& list);

// The lines that were printed, without the program's name; each also without its error text where
// the line expected in its place has none.
messages lines_of(const std::string& printed, const messages& expected);

} // namespace initialiser
