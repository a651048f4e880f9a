#include "foundation/text_file.h"

#include "foundation/descriptor.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <array>
#include <cerrno>
#include <fstream>
#include <string_view>

namespace initialiser {
namespace {

// The white space of the classic "C" locale.
constexpr std::string_view white_space = " \t\n\v\f\r";

constexpr std::size_t block_size = 4096;

// Asked before the open: opening a FIFO can wait, and opening a device can act (a watchdog starts).
bool leads_to_regular_file(const std::string& path) {
    struct stat status {};
    return ::stat(path.c_str(), &status) == 0 && S_ISREG(status.st_mode);
}

bool is_free_or_regular_file(const std::string& path) {
    struct stat status {};
    if (::lstat(path.c_str(), &status) != 0) {
        return errno == ENOENT;
    }
    return S_ISREG(status.st_mode);
}

// Adds to `word` what `block` holds of it. True when white space has ended it.
bool extend_word(std::string& word, std::string_view block) {
    for (const char byte : block) {
        const bool blank = white_space.find(byte) != std::string_view::npos;
        if (blank && !word.empty()) {
            return true;
        }
        if (!blank) {
            word += byte;
        }
    }
    return false;
}

} // namespace

std::string read_first_word(const std::string& path) {
    if (!leads_to_regular_file(path)) {
        return {};
    }
    // O_NONBLOCK: some kernel files pass for regular ones and wait for their next line.
    const vorl_descriptor file{::open(path.c_str(), O_RDONLY | O_CLOEXEC | O_NONBLOCK | O_NOCTTY)};
    if (!file.is_open()) {
        return {};
    }
    std::string word;
    std::array<char, block_size> block{};
    while (true) {
        const ssize_t length = ::read(file.number(), block.data(), block.size());
        if (length < 0) {
            return {};
        }
        const std::string_view read{block.data(), static_cast<std::size_t>(length)};
        if (read.empty() || extend_word(word, read)) {
            return word;
        }
    }
}

void write_text(const std::string& path, const std::string& text) {
    if (is_free_or_regular_file(path)) {
        std::ofstream{path, std::ios::trunc} << text;
    }
}

} // namespace initialiser
