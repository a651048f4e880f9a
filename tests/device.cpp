#include "device.h"

#include "foundation/paths.h"

#include <fcntl.h>
#include <sched.h>
#include <sys/mman.h>
#include <sys/mount.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cerrno>
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
    std::ofstream file{path};
    file << text;
    must(file.flush().good(), path);
}

std::string read_file(const fs::path& path) {
    std::ostringstream text;
    text << std::ifstream{path}.rdbuf();
    return text.str();
}

// Root makes a mount namespace; anybody else needs a user namespace around it, where the kernel
// allows that.
bool enter_namespace() {
    const std::string user = std::to_string(geteuid());
    const std::string group = std::to_string(getegid());
    if (unshare(CLONE_NEWNS) != 0) {
        must(unshare(CLONE_NEWNS | CLONE_NEWUSER) == 0, "no namespace for a private device");
        write_file("/proc/self/setgroups", "deny");
        write_file("/proc/self/uid_map", "0 " + user + " 1");
        write_file("/proc/self/gid_map", "0 " + group + " 1");
    }
    // In a chroot "/" is no mount: step out to the namespace's own root, and back in again.
    const int root = open("/", O_PATH | O_CLOEXEC);
    const int mounts = open("/proc/self/ns/mnt", O_RDONLY | O_CLOEXEC);
    must(setns(mounts, CLONE_NEWNS) == 0, "no way to the root of the mounts");
    must(mount(nullptr, "/", nullptr, MS_REC | MS_PRIVATE, nullptr) == 0, "no private mounts");
    must(fchdir(root) == 0 && chroot(".") == 0, "no way back");
    return true;
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
    const fs::file_status status = fs::symlink_status(path);
    if (fs::is_symlink(status)) {
        return "-> " + fs::read_symlink(path).string();
    }
    if (fs::is_regular_file(status)) {
        return fs::is_empty(path) ? "=" : "= " + read_file(path);
    }
    return fs::is_directory(status) ? "folder" : "fifo";
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
    } else if (what.starts_with("= ")) {
        write_file(place, what.substr(2));
    } else if (what != "nothing") {
        write_file(place, "");
        fs::permissions(place, fs::perms{what == "private" ? 0600U : 0644U});
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

} // namespace

device::device() {
    static const bool entered = program() >= 0 && enter_namespace();
    must(entered, "no program");
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
        return std::to_string(status.st_ino) + " " + std::to_string(status.st_ctim.tv_sec) + "." +
               std::to_string(status.st_ctim.tv_nsec);
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
    return {WIFSIGNALED(status) ? 128 + WTERMSIG(status) : WEXITSTATUS(status), printed};
}

tree after(tree contents, const changes& list) {
    for (const auto& [path, what] : list) {
        contents[full(path)] = what;
    }
    std::erase_if(contents, [](const auto& entry) { return entry.second == "nothing"; });
    return contents;
}

messages lines_of(const std::string& printed, const messages& expected,
                  const std::string& program) {
    messages lines;
    std::istringstream stream{printed};
    for (std::string line; std::getline(stream, line); lines.push_back(line)) {
        if (line.starts_with(program + ": ")) {
            line.erase(0, program.size() + 2);
        }
        const std::string wanted = lines.size() < expected.size() ? expected[lines.size()] : "";
        if (line.starts_with(wanted + ": ") && line.rfind(": ") == wanted.size()) {
            line = wanted;
        }
    }
    return lines;
}

} // namespace initialiser
