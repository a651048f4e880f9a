#pragma once

#include <sys/types.h>

#include <string>

// Data-protection classes say when the keys to a file are at hand. Linux has none, so this layer
// takes the calls' arguments, does what is left of them without classes, and claims no more.
namespace initialiser {

// Class 4: readable at all times, before the first unlock too. Whatever is needed at start-up has
// to be of this class.
inline constexpr int always_readable = 4;

// The file-control command that sets the class of an open folder.
inline constexpr int set_class_command = 64;

// Applies a data-protection command to an open folder. Here: changes nothing, returns -1 and sets
// the error number to ENOTSUP. The command is kept from the kernel, where its number may one day
// mean something else.
int control_protection(int descriptor, int command, int protection_class) noexcept;

// Opens `path`, creating it in a protection class when the flags say so. Returns the descriptor, or
// -1 with the error number set. Here: an ordinary open without a class, that neither follows a link
// at `path` (a file must not appear where a planted link points) nor waits (for a FIFO's reader).
int open_protected(const std::string& path, int flags, int protection_class, int option_flags,
                   mode_t mode) noexcept;

} // namespace initialiser
