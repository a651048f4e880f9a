#include "foundation/text_file.h"

#include "foundation/descriptor.h"
#include "foundation/file_system.h"
#include "foundation/repeat_interrupted.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <sys/types.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <cstddef>
#include <string>
#include <string_view>

namespace initialiser {
namespace {

constexpr std::size_t block_size = 16384;
constexpr mode_t new_file_mode = 0666; // less the process's mask

// Opens `path`. Then looks again, at what is now open: something else may have taken the file's
// place after the caller's look. Returns a closed descriptor for anything but a regular file.
vorl_descriptor open_regular_file(const std::string& path, int flags) noexcept {
    // O_NONBLOCK: a FIFO must not wait for its other end. Nor must /proc/kmsg, which is a regular
    // file to the kernel, wait for the next message.
    vorl_descriptor file{repeat_interrupted([&] {
        return ::open(path.c_str(), flags | O_CLOEXEC | O_NONBLOCK | O_NOCTTY, new_file_mode);
    })};
    struct stat status{};
    if (file.is_open() && (::fstat(file.number(), &status) != 0 || !S_ISREG(status.st_mode))) {
        file.close();
    }
    return file;
}

// Looks before the open: opening a device can set it to work, as it does a watchdog.
vorl_descriptor open_for_reading(const std::string& path) noexcept {
    struct stat status{};
    if (::stat(path.c_str(), &status) != 0 || !S_ISREG(status.st_mode)) {
        return vorl_descriptor{-1};
    }
    return open_regular_file(path, O_RDONLY);
}

vorl_descriptor open_for_writing(const std::string& path) noexcept {
    struct stat status{};
    if (::lstat(path.c_str(), &status) == 0 && !S_ISREG(status.st_mode)) {
        return vorl_descriptor{-1};
    }
    return open_regular_file(path, O_WRONLY | O_CREAT | O_NOFOLLOW);
}

// The white space of the "C" locale: a space, and from the tab to the carriage return five more.
bool is_white_space(char byte) {
    return byte == ' ' || (byte >= '\t' && byte <= '\r');
}

// Adds to `word` what `block` holds of it. True when white space has ended it.
bool extend_word(std::string& word, std::string_view block) {
    const auto* const first =
        word.empty() ? std::ranges::find_if_not(block, is_white_space) : block.begin();
    const auto* const last = std::find_if(first, block.end(), is_white_space);
    word.append(first, last);
    return last != block.end();
}

} // namespace

std::string read_first_word(const std::string& path) {
    const vorl_descriptor file = open_for_reading(path);
    if (!file.is_open()) {
        return {};
    }
    std::string word;
    std::array<char, block_size> block; // not filled: most files hold a few bytes
    bool ended = false;
    while (!ended) {
        const ssize_t length =
            repeat_interrupted([&] { return ::read(file.number(), block.data(), block.size()); });
        if (length < 0) {
            return {};
        }
        ended = length == 0 || extend_word(word, {block.data(), static_cast<std::size_t>(length)});
        if (word.size() > longest_word) {
            throw no_error_number;
        }
    }
    return word;
}

void write_text(const std::string& path, const std::string& text) noexcept {
    // Truncated after the open, not by it: only an open file is known to be regular.
    const vorl_descriptor file = open_for_writing(path);
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
