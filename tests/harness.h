#pragma once

#include <map>
#include <string>
#include <utility>
#include <vector>

namespace initialiser {

// Paths and what is put, or expected, there. tests/scenarios/README.md explains both.
using changes = std::vector<std::pair<std::string, std::string>>;
using tree = std::map<std::string, std::string>;

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

    void put(const changes& list) const;

    // With `stamped`, a file that was made anew differs from one that was left alone.
    tree contents(bool stamped = false) const;

    // Fails the test, with what differs, unless the device holds just that.
    void expect(const tree& expected, bool stamped = false) const;

    // One start-up of the real program. A command of the shell may do it in its own way: $program
    // starts the program, and $strace is strace, made ready for it. One that doesn't end is killed:
    // status 124.
    outcome start_up(const std::string& command = "") const;
};

// The zoneinfo and ICU links on a stored data set, or on "system".
changes links_on(const std::string& version);

// `contents` after the changes of `list`.
tree after(tree contents, const changes& list);

} // namespace initialiser
