#pragma once

#include <functional>
#include <map>
#include <string>
#include <utility>
#include <vector>

namespace initialiser {

// What is put on a device, in order: a path, in the storage area unless it begins with "/", and
// what stands there. tests/scenarios/README.md lists what can.
using changes = std::vector<std::pair<std::string, std::string>>;

// What stands at every path of a device, in the same words.
using tree = std::map<std::string, std::string>;

using messages = std::vector<std::string>;

struct outcome {
    int status; // the exit status; for a signal 128 and its number
    messages printed;
};

// A device of the test's own. Its /var and /usr/share hide the machine's, for this process and its
// children only, so that the program's fixed paths are the real ones.
class device {
public:
    // As tests/scenarios/README.md describes it. Throws where neither root nor a namespace can be
    // had: a test never passes unrun.
    device();
    ~device();
    device(const device&) = delete;
    device& operator=(const device&) = delete;

    static void put(const changes& list);
    static tree contents();

    // Inode, mode and time stamps at every path: they tell a file made anew from one left alone.
    static tree stamps();

    // One start-up: runs the real program. `prepare` runs in the new process just before it,
    // `attend` in this one, with the new one's number, until the program is left to itself.
    static outcome start_up(
        const std::function<void()>& prepare = [] {},
        const std::function<void(int)>& attend = [](int) {});
};

// `contents` of a device after the changes of `list`.
tree after(tree contents, const changes& list);

// What was printed, line by line, less the program's name before it and the error text after it. A
// line that lacks either is kept whole, and so matches no message.
messages lines_of(const std::string& printed, const std::string& program = "vorl_initialiser");

// The same of what `action` prints in this process.
messages printed_by(const std::function<void()>& action);

} // namespace initialiser
