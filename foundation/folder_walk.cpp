#include "foundation/folder_walk.h"

#include <fcntl.h>
#include <sys/stat.h>

#include <cerrno>

namespace initialiser {

vorl_folder_walk::vorl_folder_walk(const std::string& path)
    : folder_(::opendir(path.c_str())), is_open_(folder_ != nullptr || errno != ENOMEM) {}

const char* vorl_folder_walk::next() {
    const dirent* const entry = folder_ ? ::readdir(folder_.get()) : nullptr;
    return entry != nullptr ? entry->d_name : nullptr;
}

bool vorl_folder_walk::is_public_file(const char* name) const {
    struct stat status {};
    return ::fstatat(::dirfd(folder_.get()), name, &status, AT_SYMLINK_NOFOLLOW) == 0 &&
           S_ISREG(status.st_mode) && (status.st_mode & S_IROTH) != 0;
}

} // namespace initialiser
