#pragma once

#include "foundation/repeat_interrupted.h"

#include <dirent.h>
#include <fcntl.h>
#include <sys/stat.h>

#include <cerrno>
#include <memory>
#include <string>
#include <utility>

namespace initialiser {

// A walk over the entries of one directory, in the order in which the file system yields them. It
// stops at the entry sought and never looks below the directory.
class vorl_directory_walk {
public:
    // Opens the walk; `path` itself may be a link. The walk has no entries when the directory is
    // missing or can't be read, or when something else stands there.
    explicit vorl_directory_walk(const std::string& path)
        : directory_(repeat_interrupted([&] { return ::opendir(path.c_str()); })),
          opening_error_((directory_ == nullptr && errno == ENOMEM) ? ENOMEM : 0) {}

    // The error number when there was no memory to open the walk, otherwise 0.
    int opening_error() const { return opening_error_; }

    // The name of the next entry, or nullptr at the end and after a failure, which ends the walk.
    const char* next() {
        const dirent* const entry = directory_ ? read_entry() : nullptr;
        return entry != nullptr ? entry->d_name : nullptr;
    }

    // True when the entry `name` is a regular file, not a link to one, that everyone may read.
    bool is_public_file(const char* name) const {
        const int directory = ::dirfd(directory_.get());
        struct stat status{};
        return directory >= 0 && ::fstatat(directory, name, &status, AT_SYMLINK_NOFOLLOW) == 0 &&
               S_ISREG(status.st_mode) && (status.st_mode & S_IROTH) != 0;
    }

private:
    struct directory_closer {
        void operator()(DIR* directory) const { ::closedir(directory); }
    };

    // readdir sets no error number at the end of a directory. An EINTR left by an earlier call
    // would then look like an interruption, so the number is cleared first and put back.
    const dirent* read_entry() {
        const int earlier = std::exchange(errno, 0);
        const dirent* const entry =
            repeat_interrupted([this] { return ::readdir(directory_.get()); });
        if (errno == 0) {
            errno = earlier;
        }
        return entry;
    }

    std::unique_ptr<DIR, directory_closer> directory_;
    int opening_error_;
};

} // namespace initialiser
