#pragma once

#include <string>

// The operations with which links are read and re-pointed. For remove, exists and read_symlink a
// missing path is no failure. A failure of remove, read_symlink or create_symlink is printed once
// and then thrown as an int, the error number. A failed operation has changed nothing.
namespace initialiser {

// Thrown in place of an error number where no call to the system has failed.
inline constexpr int no_error_number = -1;

// Removes the file or link at `path`, never a directory. When it can't, prints "remove: could not
// remove PATH" and throws.
void remove(const std::string& path);

// True when `path` leads to something, links followed. False after any failure; prints and throws
// nothing.
bool exists(const std::string& path);

// The target of the link at `path`, as stored, but at most its first 1024 bytes. The empty text for
// a missing link. When it can't be read, prints "read_symlink: PATH" and throws.
std::string read_symlink(const std::string& path);

// Makes a link at `path` that holds `target`; the target need not exist. When it can't, prints
// "create_symlink: from PATH to TARGET" and throws.
void create_symlink(const std::string& target, const std::string& path);

// Removes a file, a link or an empty directory at `path`, as the C library's remove does. A failure
// is passed over.
void discard(const std::string& path) noexcept;

} // namespace initialiser
