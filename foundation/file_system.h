#pragma once

#include <string>

// The operations on paths with which links are read and re-pointed. They share one failure
// convention: a missing path is an ordinary answer where a caller can use one; any other failure is
// printed once and then thrown as an int, the error number. A failed operation has changed nothing.
namespace initialiser {

// Removes the file or link at `path`, never a folder. A missing file is no error.
// Prints "remove: could not remove PATH" and throws when it can't.
void remove(const std::string& path);

// A literal would fit the C library's remove as well, which does something else: see discard().
void remove(const char* path) = delete;

// True when `path` leads to something, links followed. Prints and throws nothing: every failure is
// "no".
bool exists(const std::string& path);

// The target of the link at `path`, as stored, and of that the first 1024 bytes. A missing link is
// no error and gives the empty text. Prints "read_symlink: PATH" and throws when it can't.
std::string read_symlink(const std::string& path);

// Makes a link at `path` that holds `target`; whether the target exists is not asked. Prints
// "create_symlink: from PATH to TARGET" and throws when it can't, a missing folder included.
void create_symlink(const std::string& target, const std::string& path);

// The C library's remove: takes away a file, a link or an empty folder at `path` where it can, and
// where it can't says nothing.
void discard(const std::string& path) noexcept;

} // namespace initialiser
