#include "foundation/file_system.h"

#include <err.h>
#include <sys/types.h>
#include <unistd.h>

#include <array>
#include <cerrno>
#include <cstddef>
#include <cstdio>
#include <string>

namespace initialiser {
namespace {

// Longer targets are cut here. No usable path comes near it.
constexpr std::size_t longest_target = 1024;

} // namespace

void remove(const std::string& path) {
    if (::unlink(path.c_str()) == 0 || errno == ENOENT) {
        return;
    }
    const int error = errno;
    warn("remove: could not remove %s", path.c_str());
    throw error;
}

bool exists(const std::string& path) {
    return ::access(path.c_str(), F_OK) == 0;
}

std::string read_symlink(const std::string& path) {
    std::array<char, longest_target> target{};
    const ssize_t length = ::readlink(path.c_str(), target.data(), target.size());
    if (length >= 0) {
        return {target.data(), static_cast<std::size_t>(length)};
    }
    const int error = errno;
    if (error == ENOENT) {
        return {};
    }
    warn("read_symlink: %s", path.c_str());
    throw error;
}

void create_symlink(const std::string& target, const std::string& path) {
    if (::symlink(target.c_str(), path.c_str()) == 0) {
        return;
    }
    const int error = errno;
    warn("create_symlink: from %s to %s", path.c_str(), target.c_str());
    throw error;
}

void discard(const std::string& path) noexcept {
    static_cast<void>(std::remove(path.c_str()));
}

} // namespace initialiser
