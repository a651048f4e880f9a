#pragma once

#include <string>

// The operations with which links are read and re-pointed. They share one failure convention: a
// missing path is an ordinary answer where a caller can use one. Any other failure is printed once
// and then thrown as an int, the error number. A failed operation has changed nothing.
namespace initialiser {

// Thrown in place of an error number where no call to the system has failed.
inline constexpr int no_error_number = -1;

// Removes the file or link at `path`, never a directory. A missing file is no error.
// Prints "remove: could not remove PATH" and throws when it can't.
void remove(const std::string& path);

// True when `path` leads to something, links followed. Every failure is a "no"; nothing is printed
// or thrown.
bool exists(const std::string& path);

// The target of the link at `path`, as stored; of a longer one the first 1024 bytes. A missing link
// is no error and gives the empty text. Prints "read_symlink: PATH" and throws when it can't.
std::string read_symlink(const std::string& path);

// Makes a link at `path` that holds `target`; the target need not exist. Prints "create_symlink:
// from PATH to TARGET" and throws when it can't, also when the directory is missing.
void create_symlink(const std::string& target, const std::string& path);

// Removes a file, a link or an empty directory at `path`, as the C library's remove does. Every
// failure is passed over.
void discard(const std::string& path) noexcept;

} // namespace initialiser
