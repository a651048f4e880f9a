#pragma once

#include <functional>
#include <map>
#include <string>
#include <utility>
#include <vector>

namespace initialiser {

// What is put on a device, in order: a path and what stands there, as tests/scenarios/README.md
// tells both.
using changes = std::vector<std::pair<std::string, std::string>>;
using tree = std::map<std::string, std::string>;
using messages = std::vector<std::string>;

struct outcome {
    int status; // the exit status; for a signal 128 and its number
    std::string printed;
};

// A device of the test's own. Its /var and /usr/share hide the machine's, for this process and its
// children only, so that the program's fixed paths are the real ones.
class device {
public:
    // Throws where neither root nor a namespace can be had: a test never passes unrun.
    device();
    ~device();
    device(const device&) = delete;
    device& operator=(const device&) = delete;

    static void put(const changes& list);
    static tree contents();
    static tree stamps(); // what tells a file made anew from one left alone

    // One start-up: runs the real program. `prepare` runs in the new process just before it,
    // `attend` in this one, with the new one's number, until the program is left to itself.
    static outcome start_up(
        const std::function<void()>& prepare = [] {},
        const std::function<void(int)>& attend = [](int) {});
};

// `contents` of a device after the changes of `list`.
tree after(tree contents, const changes& list);

// The lines of what `program` printed, less its name; each also less the error text after it where
// the line expected in its place has none.
messages lines_of(const std::string& printed, const messages& expected,
                  const std::string& program = "vorl_initialiser");

} // namespace initialiser
