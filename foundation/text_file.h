#pragma once

#include <cstddef>
#include <string>

// Small text files. Neither operation prints, or waits for another program. Only a regular file is
// read or written, even when something else takes its place meanwhile. A device that stands there
// is not opened, since opening one can set it to work. One that takes a file's place between the
// look and the open is opened, but not read or written.
namespace initialiser {

// The longest word that is read, in bytes. It is far above what any real data need. It keeps an
// endless file from taking all memory.
inline constexpr std::size_t longest_word = 24'000'000;

// The first word of the file at `path`, links followed: leading white space is skipped, and the
// next white space or the end of the file ends the word. The text is empty for a missing file, for
// one that can't be read, and for anything but a regular file. Throws no_error_number for a word
// that is too long.
std::string read_first_word(const std::string& path);

// Overwrites the regular file at `path` with `text`, and flushes it to the disk. A missing file is
// created with mode 0666 less the mask. Where anything else stands, a link included, nothing is
// written. A failure is passed over.
void write_text(const std::string& path, const std::string& text) noexcept;

} // namespace initialiser
