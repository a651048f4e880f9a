#pragma once

#include <dirent.h>

#include <memory>
#include <string>

namespace initialiser {

// A walk over the entries of one folder, in the order in which the file system yields them. It
// reads on only as far as it is asked to and never looks below the folder, so neither a huge folder
// nor a deep one costs more than what stands before the entry sought.
class vorl_folder_walk {
public:
    // Opens the walk; `path` itself may be a link. A missing folder is no error, nor is one that
    // can't be read or isn't a folder: the walk then has no entries.
    explicit vorl_folder_walk(const std::string& path);

    // False when memory ran out; the error number is then set.
    bool is_open() const { return is_open_; }

    // The name of the next entry, or nullptr at the end and after a failure, which ends the walk.
    const char* next();

    // True when the entry `name` is a regular file, not a link to one, that everyone may read.
    bool is_public_file(const char* name) const;

private:
    struct folder_closer {
        void operator()(DIR* folder) const { ::closedir(folder); }
    };
    std::unique_ptr<DIR, folder_closer> folder_;
    bool is_open_;
};

} // namespace initialiser
