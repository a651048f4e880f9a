#pragma once

#include <fcntl.h>
#include <sys/types.h>

#include <string>

// A file's data-protection class says when the file can be read. Linux has no such classes. These
// are stand-ins for the platform's calls: they take the same arguments and do the part that needs
// no classes.
namespace initialiser {

// Class 4: readable at all times, before the first unlock too, as everything needed at start-up is.
inline constexpr int always_readable = 4;

// The file-control command that sets the class of an open directory.
inline constexpr int set_class_command = 64;

// Applies a data-protection command to an open directory. Here it changes nothing and returns -1.
// It makes no system call, since Linux may one day give the command's number another meaning. It
// leaves the error number alone, because the next message shows it.
inline int control_protection(int /*descriptor*/, int /*command*/,
                              int /*protection_class*/) noexcept {
    return -1;
}

// Opens `path`, and creates it in a protection class when the flags say so. Returns the descriptor,
// or -1 with the error number set. Here it is an ordinary open without a class.
inline int open_protected(const std::string& path, int flags, int /*protection_class*/,
                          int /*option_flags*/, mode_t mode) noexcept {
    return ::open(path.c_str(), flags, mode);
}

} // namespace initialiser
