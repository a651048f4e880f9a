#include "device.h"

#include "foundation/paths.h"

#include <fcntl.h>
#include <sched.h>
#include <sys/mount.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <array>
#include <cerrno>
#include <cstdio>
#include <filesystem>
#include <fstream>
#include <sstream>
#include <stdexcept>
#include <system_error>

namespace fs = std::filesystem;

namespace initialiser {
namespace {

constexpr off_t huge = off_t{3} << 30U; // too large for 32 bits
constexpr time_t in_2040 = 2208988800;  // too late for 32 bits

void must(bool done, const std::string& what) {
    if (!done) {
        throw std::system_error{errno, std::generic_category(), what};
    }
}

void write_file(const fs::path& path, const std::string& text) {
    must((std::ofstream{path} << text).flush().good(), path);
}

std::string read_file(const fs::path& path) {
    std::ostringstream text;
    text << std::ifstream{path}.rdbuf();
    return text.str();
}

// Root makes a mount namespace. Anybody else needs a user namespace around it, where the kernel
// allows that.
bool enter_namespace() {
    const std::string ids[] = {std::to_string(geteuid()), std::to_string(getegid())};
    if (unshare(CLONE_NEWNS) != 0) {
        must(unshare(CLONE_NEWNS | CLONE_NEWUSER) == 0, "no namespace for a private device");
        write_file("/proc/self/setgroups", "deny");
        write_file("/proc/self/uid_map", "0 " + ids[0] + " 1");
        write_file("/proc/self/gid_map", "0 " + ids[1] + " 1");
    }
    // In a chroot "/" is no mount: step out to the namespace's own root, and back in again.
    const int root = open("/", O_PATH | O_CLOEXEC);
    const int mounts = open("/proc/self/ns/mnt", O_RDONLY | O_CLOEXEC);
    must(setns(mounts, CLONE_NEWNS) == 0 &&
             mount(nullptr, "/", nullptr, MS_REC | MS_PRIVATE, nullptr) == 0 && fchdir(root) == 0 &&
             chroot(".") == 0,
         "no private mounts");
    return true;
}

// The same changes with full paths, and each shorthand as what it stands for.
changes in_full(const changes& list) {
    changes all;
    for (const auto& [path, what] : list) {
        const std::string stored = std::string{"-> "}.append(stored_datasets).append(what);
        const std::string place = path.starts_with('/') ? path : storage_area + path;
        if (path == "update") {
            all.insert(all.end(), {{latest_link, stored}});
        } else if (path == "links" && what == "system") {
            all.insert(all.end(),
                       {{zoneinfo_link, "-> " + system_zoneinfo}, {icu_link, "nothing"}});
        } else if (path == "links") {
            all.insert(all.end(),
                       {{zoneinfo_link, stored + "/zoneinfo"}, {icu_link, stored + "/icutz"}});
        } else if (what.starts_with("dataset ")) {
            all.insert(all.end(), {{place + "/zoneinfo/+VERSION", "= an updater's"},
                                   {place + "/zoneinfo/Asia/Tokyo", "= TZif"},
                                   {place + "/icutz/" + what.substr(8), "= data"}});
        } else {
            all.insert(all.end(), {{place, what}});
        }
    }
    return all;
}

void put_one(const fs::path& path, const std::string& what) {
    if (what == "huge") {
        return must(truncate(path.c_str(), huge) == 0, path);
    }
    if (what == "late") {
        const std::array times = {timespec{in_2040, 0}, timespec{in_2040, 0}};
        return must(utimensat(AT_FDCWD, path.c_str(), times.data(), 0) == 0, path);
    }
    fs::remove_all(path);
    fs::create_directories(path.parent_path());
    if (what == "directory") {
        fs::create_directory(path);
    } else if (what == "fifo") {
        must(mkfifo(path.c_str(), 0644) == 0, path);
    } else if (what.starts_with("-> ")) {
        fs::create_symlink(what.substr(3), path);
    } else if (what == "=" || what == "private" || what.starts_with("= ")) {
        write_file(path, what.starts_with("= ") ? what.substr(2) : "");
        fs::permissions(path, fs::perms{what == "private" ? 0640U : 0644U});
    } else if (what != "nothing") {
        throw std::invalid_argument("no such thing: " + what);
    }
}

std::string description(const fs::path& path, const struct stat& status) {
    if (S_ISLNK(status.st_mode)) {
        return "-> " + fs::read_symlink(path).string();
    }
    if (S_ISREG(status.st_mode)) {
        if ((status.st_mode & S_IROTH) == 0) {
            return "private";
        }
        return status.st_size == 0 ? "=" : "= " + (status.st_size < huge ? read_file(path) : "");
    }
    return S_ISDIR(status.st_mode) ? "directory" : "fifo";
}

} // namespace

vorl_device::vorl_device(const changes& found)
    : program_(open(VORL_PROGRAM, O_PATH)), hidden_{"/usr/share", "/var"} {
    static const bool entered = program_.is_open() && enter_namespace();
    must(entered, "no program");
    for (const std::string& path : hidden_) {
        must(mount("device", path.c_str(), "tmpfs", 0, "mode=755") == 0, "no private " + path);
    }
    put({{"/usr/share/zoneinfo.default/+VERSION", "= 2019c\n"},
         {"/usr/share/zoneinfo.default/Asia/Tokyo", "= TZif"},
         {"/usr/share/icu/icutzformat.txt", "= 44l\n"},
         {"tz/2019a.1.0", "dataset icutz44l.dat"},
         {"tz/2020a.1.0", "dataset icutz44l.dat"},
         {"tz/2020b.1.0", "dataset icutz44l.dat"},
         {"tz/2021a.1.0", "dataset icutz46l.dat"},
         {"links", "system"},
         {"localtime", "-> /var/db/timezone/zoneinfo/Europe/Paris"}});
    put(found);
}

vorl_device::~vorl_device() {
    for (const std::string& path : hidden_) {
        umount2(path.c_str(), MNT_DETACH);
    }
}

void vorl_device::put(const changes& list) {
    for (const auto& [path, what] : in_full(list)) {
        if (!path.starts_with(hidden_[0]) && !path.starts_with(hidden_[1])) {
            throw std::invalid_argument("the machine's own: " + path);
        }
        put_one(path, what);
    }
}

tree vorl_device::contents(bool stamped) const {
    tree all;
    for (const std::string& path : hidden_) {
        for (const auto& entry : fs::recursive_directory_iterator{path}) {
            struct stat status {}; // the library's own knows no huge or late file on 32 bits
            must(lstat(entry.path().c_str(), &status) == 0, entry.path());
            const auto stamp =
                std::to_string(status.st_ino) + " " + std::to_string(status.st_ctim.tv_nsec);
            all[entry.path()] = description(entry.path(), status) + (stamped ? stamp : "");
        }
    }
    return all;
}

outcome vorl_device::start_up() const {
    const std::string command =
        "timeout --kill-after=1 10 " VORL_EMULATOR " " + program() + " 2>&1 >/dev/null";
    FILE* const output = popen(command.c_str(), "re");
    must(output != nullptr, "no process");
    std::string printed;
    for (int byte = fgetc(output); byte != EOF; byte = fgetc(output)) {
        printed += static_cast<char>(byte);
    }
    const int status = pclose(output);
    if (WIFEXITED(status) && WEXITSTATUS(status) == 124) { // timeout's own
        throw std::runtime_error("the program did not end, and was killed");
    }
    return {WIFSIGNALED(status) ? 128 + WTERMSIG(status) : WEXITSTATUS(status), printed};
}

tree after(tree contents, const changes& list) {
    for (const auto& [path, what] : in_full(list)) {
        contents[path] = what;
    }
    std::erase_if(contents, [](const auto& entry) { return entry.second == "nothing"; });
    return contents;
}

messages lines_of(const std::string& printed, const messages& expected) {
    const std::string program = "vorl_initialiser: ";
    messages lines;
    std::istringstream stream{printed};
    for (std::string line; std::getline(stream, line); lines.push_back(line)) {
        if (line.starts_with(program)) {
            line.erase(0, program.size());
        }
        const std::string wanted = lines.size() < expected.size() ? expected[lines.size()] : "";
        if (line.starts_with(wanted + ": ") && line.rfind(": ") == wanted.size()) {
            line = wanted;
        }
    }
    return lines;
}

} // namespace initialiser
