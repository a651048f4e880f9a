#include "harness.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/mount.h>
#include <sys/stat.h>

#include <algorithm>
#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <sstream>
#include <stdexcept>
#include <string>
#include <system_error>

namespace fs = std::filesystem;

namespace initialiser {
namespace {

const std::string hidden[] = {"/usr/share", "/var"};

void must(bool done, const std::string& what) {
    if (!done) {
        throw std::system_error{errno, std::generic_category(), what};
    }
}

// The program is opened before something hides it.
bool make_ready() {
    must(getenv("own_mounts") != nullptr, "start the tests by scripts/own_mounts");
    const int program = open(VORL_PROGRAM, O_PATH);
    must(program >= 0, "no program");
    setenv("program", (VORL_EMULATOR " /proc/self/fd/" + std::to_string(program)).c_str(), 1);
    // The sanitizers' search for leaks can't run beside strace.
    setenv("strace", "strace -e quiet=all -o /dev/null -E ASAN_OPTIONS=detect_leaks=0", 1);
    umask(022);
    return true;
}

std::string in_full(const std::string& path) {
    return fs::path{"/var/db/timezone"} / path;
}

std::string description(const fs::path& path, const struct stat& status) {
    if (status.st_size > 1U << 30U) {
        return "huge";
    }
    if (S_ISLNK(status.st_mode)) {
        return "-> " + fs::read_symlink(path).string();
    }
    if (!S_ISREG(status.st_mode)) {
        return S_ISDIR(status.st_mode) ? "directory" : "fifo";
    }
    std::ostringstream text;
    text << "= " << std::ifstream{path}.rdbuf();
    return status.st_size == 0 ? "=" : text.str();
}

} // namespace

vorl_device::vorl_device(const changes& found) {
    static const bool ready = make_ready();
    for (const std::string& path : hidden) {
        must(ready && mount("device", path.c_str(), "tmpfs", 0, "mode=755") == 0, path);
    }
    put({{"/usr/share/zoneinfo.default/+VERSION", "= 2019c\n"},
         {"/usr/share/zoneinfo.default/Asia/Tokyo", "= TZif"},
         {"/usr/share/icu/icutzformat.txt", "= 44l\n"},
         {"tz/2019a.1.0/icutz/icutz44l.dat", "= data"},
         {"tz/2020a.1.0/icutz/icutz44l.dat", "= data"},
         {"tz/2020a.1.0/zoneinfo/+VERSION", "= an updater's"},
         {"tz/2020b.1.0/icutz/icutz44l.dat", "= data"},
         {"tz/2020b.1.0/zoneinfo/+VERSION", "= an updater's"},
         {"tz/2021a.1.0/icutz/icutz46l.dat", "= data"},
         {"localtime", "-> /var/db/timezone/zoneinfo/Europe/Paris"}});
    put(links_on("system"));
    put(found);
}

vorl_device::~vorl_device() {
    for (const std::string& path : hidden) {
        umount2(path.c_str(), MNT_DETACH);
    }
}

void vorl_device::put(const changes& list) const {
    for (const auto& [name, what] : list) {
        const fs::path path = in_full(name);
        if (!path.string().starts_with("/usr/share/") && !path.string().starts_with("/var/")) {
            throw std::invalid_argument("the machine's own: " + path.string());
        }
        fs::remove_all(path);
        fs::create_directories(path.parent_path());
        if (what == "directory") {
            fs::create_directory(path);
        } else if (what == "fifo") {
            must(mkfifo(path.c_str(), 0644) == 0, path);
        } else if (what.starts_with("-> ")) {
            fs::create_symlink(what.substr(3), path);
        } else if (what == "=" || what.starts_with("= ")) {
            const std::string text = what.starts_with("= ") ? what.substr(2) : "";
            must((std::ofstream{path} << text).flush().good(), path);
        } else if (what != "nothing") {
            throw std::invalid_argument("no such thing: " + what);
        }
    }
}

tree vorl_device::contents(bool stamped) const {
    tree all;
    for (const std::string& path : hidden) {
        for (const auto& entry : fs::recursive_directory_iterator{path}) {
            struct stat status{}; // the library's own knows no huge or late file on 32 bits
            must(lstat(entry.path().c_str(), &status) == 0, entry.path());
            const auto stamp =
                std::to_string(status.st_ino) + " " + std::to_string(status.st_mtim.tv_nsec);
            all[entry.path()] = description(entry.path(), status) + (stamped ? stamp : "");
        }
    }
    return all;
}

void vorl_device::expect(const tree& expected, bool stamped) const {
    const tree found = contents(stamped);
    tree is;
    tree should_be;
    std::ranges::set_difference(found, expected, std::inserter(is, is.end()));
    std::ranges::set_difference(expected, found, std::inserter(should_be, should_be.end()));
    EXPECT_EQ(is, should_be);
}

outcome vorl_device::start_up(const std::string& command) const {
    setenv("command", command.c_str(), 1);
    FILE* const output = popen(
        "timeout --kill-after=1 10 sh -c \"${command:-$program}\" 2>&1 >/dev/null; exit $?", "re");
    must(output != nullptr, "no process");
    std::string printed;
    for (int byte = fgetc(output); byte != EOF; byte = fgetc(output)) {
        printed += static_cast<char>(byte);
    }
    return {.status = WEXITSTATUS(pclose(output)), .printed = printed};
}

changes links_on(const std::string& version) {
    if (version == "system") {
        return {{"zoneinfo", "-> /usr/share/zoneinfo.default"}, {"icutz", "nothing"}};
    }
    const std::string target = "-> /var/db/timezone/tz/" + version;
    return {{"zoneinfo", target + "/zoneinfo"}, {"icutz", target + "/icutz"}};
}

tree after(tree contents, const changes& list) {
    for (const auto& [path, what] : list) {
        if (what == "nothing") {
            contents.erase(in_full(path));
        } else {
            contents[in_full(path)] = what;
        }
    }
    return contents;
}

} // namespace initialiser
