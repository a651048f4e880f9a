#include "device.h"

#include "foundation/paths.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <sched.h>
#include <sys/mman.h>
#include <sys/mount.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <sstream>
#include <system_error>

namespace fs = std::filesystem;

namespace initialiser {
namespace {

void must(bool done, const std::string& what) {
    if (!done) {
        throw std::system_error{errno, std::generic_category(), what};
    }
}

void write_file(const fs::path& path, const std::string& text) {
    std::ofstream file{path, std::ios::binary};
    file << text;
    must(file.flush().good(), path);
}

std::string read_file(const fs::path& path) {
    std::ostringstream text;
    text << std::ifstream{path, std::ios::binary}.rdbuf();
    return text.str();
}

// Root makes a mount namespace; anybody else needs a user namespace around it, where the kernel
// allows that.
void enter_namespace() {
    const std::string user = std::to_string(geteuid());
    const std::string group = std::to_string(getegid());
    if (unshare(CLONE_NEWNS) != 0) {
        must(unshare(CLONE_NEWNS | CLONE_NEWUSER) == 0, "no namespace for a private device");
        write_file("/proc/self/setgroups", "deny");
        write_file("/proc/self/uid_map", "0 " + user + " 1");
        write_file("/proc/self/gid_map", "0 " + group + " 1");
    }
    must(mount(nullptr, "/", nullptr, MS_REC | MS_PRIVATE, nullptr) == 0, "no private mounts");
}

// Opened before the first device hides the place where it may have been built.
int program() {
    static const int descriptor = open(VORL_PROGRAM, O_PATH | O_CLOEXEC);
    return descriptor;
}

fs::path full(const std::string& path) {
    return path.starts_with('/') ? path : storage_area + path;
}

std::string description(const fs::path& path) {
    switch (fs::symlink_status(path).type()) {
    case fs::file_type::symlink:
        return "-> " + fs::read_symlink(path).string();
    case fs::file_type::regular:
        return fs::is_empty(path) ? "=" : "= " + read_file(path);
    case fs::file_type::directory:
        return "folder";
    case fs::file_type::fifo:
        return "fifo";
    default:
        return "something else";
    }
}

void put_one(const std::string& path, const std::string& what) {
    if (what.starts_with("dataset ")) {
        device::put({{path + "/zoneinfo/+VERSION", "= an updater's"},
                     {path + "/zoneinfo/Asia/Tokyo", "= TZif"},
                     {path + "/icutz/" + what.substr(8), "= data"}});
        return;
    }
    const fs::path place = full(path);
    fs::remove_all(place);
    fs::create_directories(place.parent_path());
    if (what == "folder") {
        fs::create_directory(place);
    } else if (what == "fifo") {
        must(mkfifo(place.c_str(), 0644) == 0, path);
    } else if (what.starts_with("-> ")) {
        fs::create_symlink(what.substr(3), place);
    } else if (what == "private") {
        write_file(place, "");
        fs::permissions(place, fs::perms::owner_read);
    } else if (what != "nothing") {
        write_file(place, what.substr(std::min(what.size(), std::size_t{2})));
    }
}

tree survey(std::string (*describe)(const fs::path&)) {
    tree all;
    for (const char* const root : {"/var", "/usr/share"}) {
        for (const auto& entry : fs::recursive_directory_iterator{root}) {
            all[entry.path()] = describe(entry.path());
        }
    }
    return all;
}

bool is_error_text(const std::string& text) {
    constexpr int last_error = 133;
    for (int error = 0; error <= last_error; ++error) {
        if (text == strerror(error)) {
            return true;
        }
    }
    return false;
}

} // namespace

tree after(tree contents, const changes& list) {
    for (const auto& [path, what] : list) {
        contents[full(path)] = what;
    }
    std::erase_if(contents, [](const auto& entry) { return entry.second == "nothing"; });
    return contents;
}

device::device() {
    static_cast<void>(program());
    static const bool entered = (enter_namespace(), true);
    static_cast<void>(entered);
    must(mount("device", "/usr/share", "tmpfs", 0, "mode=755") == 0, "no private /usr/share");
    must(mount("device", "/var", "tmpfs", 0, "mode=755") == 0, "no private /var");
    put({{"/usr/share/zoneinfo.default/+VERSION", "= 2019c\n"},
         {"/usr/share/zoneinfo.default/Asia/Tokyo", "= TZif"},
         {"/usr/share/icu/icutzformat.txt", "= 44l\n"},
         {"tz/2019a.1.0", "dataset icutz44l.dat"},
         {"tz/2020a.1.0", "dataset icutz44l.dat"},
         {"tz/2020b.1.0", "dataset icutz44l.dat"},
         {"tz/2021a.1.0", "dataset icutz46l.dat"},
         {"zoneinfo", "-> /usr/share/zoneinfo.default"},
         {"localtime", "-> /var/db/timezone/zoneinfo/Europe/Paris"}});
}

device::~device() {
    umount2("/var", MNT_DETACH);
    umount2("/usr/share", MNT_DETACH);
}

void device::put(const changes& list) {
    for (const auto& [path, what] : list) {
        put_one(path, what);
    }
}

tree device::contents() {
    return survey(description);
}

tree device::stamps() {
    return survey([](const fs::path& path) {
        struct stat status {};
        must(lstat(path.c_str(), &status) == 0, path);
        std::ostringstream stamp;
        stamp << status.st_ino << ' ' << status.st_mode << ' ' << status.st_ctim.tv_sec << '.'
              << status.st_ctim.tv_nsec;
        return stamp.str();
    });
}

outcome device::start_up(const std::function<void()>& prepare,
                         const std::function<void(int)>& attend) {
    static char name[] = "/any/where/started as something else";
    char* const arguments[] = {name, nullptr};
    const int log = memfd_create("log", MFD_CLOEXEC);
    const pid_t child = fork();
    must(log >= 0 && child >= 0, "no process for the program");
    if (child == 0) {
        dup2(log, STDERR_FILENO);
        prepare();
        fexecve(program(), arguments, environ);
        _exit(127);
    }
    attend(child);
    int status = 0;
    must(waitpid(child, &status, 0) == child, "the program is lost");
    const std::string printed = read_file("/proc/self/fd/" + std::to_string(log));
    close(log);
    return {WIFSIGNALED(status) ? 128 + WTERMSIG(status) : WEXITSTATUS(status), lines_of(printed)};
}

messages lines_of(const std::string& printed, const std::string& program) {
    messages lines;
    std::istringstream stream{printed};
    for (std::string line; std::getline(stream, line);) {
        const std::string start = program + ": ";
        const auto end = line.rfind(": ");
        const bool complete = line.starts_with(start) && end >= start.size() - 2 &&
                              is_error_text(line.substr(end + 2));
        lines.push_back(complete ? line.substr(start.size(), end - start.size()) : line);
    }
    return lines;
}

messages printed_by(const std::function<void()>& action) {
    testing::internal::CaptureStderr();
    action();
    return lines_of(testing::internal::GetCapturedStderr(), program_invocation_short_name);
}

} // namespace initialiser
