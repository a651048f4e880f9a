#include "foundation/text_file.h"

#include "foundation/descriptor.h"
#include "foundation/repeat_interrupted.h"

#include <fcntl.h>
#include <sys/stat.h>

#include <algorithm>
#include <array>
#include <string_view>

namespace initialiser {
namespace {

constexpr std::size_t block_size = 16384;
constexpr mode_t new_file_mode = 0666; // less the process's mask

// Opens the regular file at `path`, without following a link there when the flags say so. Gives a
// closed descriptor for anything else. It looks before the open, since opening a device can act (a
// watchdog starts), and after it, since another file may have taken the place in between.
vorl_descriptor open_regular_file(const std::string& path, int flags) noexcept {
    const int follow = (flags & O_NOFOLLOW) != 0 ? AT_SYMLINK_NOFOLLOW : 0;
    struct stat status {};
    const bool is_there = ::fstatat(AT_FDCWD, path.c_str(), &status, follow) == 0;
    if (is_there ? !S_ISREG(status.st_mode) : (flags & O_CREAT) == 0) {
        return vorl_descriptor{-1};
    }
    // O_NONBLOCK: a FIFO may have come, and some kernel files pass for regular ones and wait for
    // their next line.
    vorl_descriptor file{repeat_interrupted([&] {
        return ::open(path.c_str(), flags | O_CLOEXEC | O_NONBLOCK | O_NOCTTY, new_file_mode);
    })};
    if (file.is_open() && (::fstat(file.number(), &status) != 0 || !S_ISREG(status.st_mode))) {
        file.close();
    }
    return file;
}

// White space of the classic "C" locale.
bool is_blank(char byte) {
    return byte == ' ' || (byte >= '\t' && byte <= '\r');
}

// Adds to `word` what `block` holds of it. True when white space has ended it.
bool extend_word(std::string& word, std::string_view block) {
    const auto* const first =
        word.empty() ? std::find_if_not(block.begin(), block.end(), is_blank) : block.begin();
    const auto* const last = std::find_if(first, block.end(), is_blank);
    word.append(first, last);
    return last != block.end();
}

} // namespace

std::string read_first_word(const std::string& path) {
    const vorl_descriptor file = open_regular_file(path, O_RDONLY);
    if (!file.is_open()) {
        return {};
    }
    std::string word;
    std::array<char, block_size> block; // not filled: most files hold a few bytes
    while (true) {
        const ssize_t length =
            repeat_interrupted([&] { return ::read(file.number(), block.data(), block.size()); });
        if (length < 0) {
            return {};
        }
        const std::string_view read{block.data(), static_cast<std::size_t>(length)};
        if (read.empty() || extend_word(word, read)) {
            return word;
        }
    }
}

void write_text(const std::string& path, const std::string& text) noexcept {
    // Truncated only once it is known to be the file that is meant.
    const vorl_descriptor file = open_regular_file(path, O_WRONLY | O_CREAT | O_NOFOLLOW);
    if (!file.is_open() || repeat_interrupted([&] { return ::ftruncate(file.number(), 0); }) != 0) {
        return;
    }
    std::string_view rest{text};
    while (!rest.empty()) {
        const ssize_t length =
            repeat_interrupted([&] { return ::write(file.number(), rest.data(), rest.size()); });
        if (length <= 0) {
            return;
        }
        rest.remove_prefix(static_cast<std::size_t>(length));
    }
    static_cast<void>(repeat_interrupted([&] { return ::fsync(file.number()); }));
}

} // namespace initialiser
