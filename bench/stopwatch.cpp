// stopwatch ROUNDS PROGRAM...: starts every program once a round. Prints a line for each: its
// median and its shortest time in nanoseconds and its peak memory in KiB. Before each start,
// untimed, the links in the storage area are put back as they were and the files there removed.
#include "foundation/paths.h"

#include <spawn.h>
#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <chrono>
#include <cstdio>
#include <exception>
#include <filesystem>
#include <map>
#include <stdexcept>
#include <string>
#include <system_error>
#include <vector>

namespace fs = std::filesystem;

namespace {

using links = std::map<fs::path, fs::path>;

struct program {
    std::string path;
    std::vector<long> times;
    long peak = 0;
};

links read_links() {
    links all;
    for (const auto& entry : fs::directory_iterator{initialiser::storage_area}) {
        if (entry.is_symlink()) {
            all[entry.path()] = fs::read_symlink(entry.path());
        }
    }
    return all;
}

void restore(const links& all) {
    for (const auto& entry : fs::directory_iterator{initialiser::storage_area}) {
        if (entry.is_symlink() || !entry.is_directory()) {
            fs::remove(entry.path());
        }
    }
    for (const auto& [path, target] : all) {
        fs::create_symlink(target, path);
    }
}

void start(program& started) {
    char* const arguments[] = {started.path.data(), nullptr};
    pid_t child = 0;
    int status = 0;
    rusage usage{};

    const auto begin = std::chrono::steady_clock::now();
    const int error =
        posix_spawn(&child, started.path.c_str(), nullptr, nullptr, arguments, environ);
    const pid_t ended = error == 0 ? wait4(child, &status, 0, &usage) : 0;
    const auto end = std::chrono::steady_clock::now();

    if (error != 0 || ended != child || status != 0) {
        throw std::runtime_error{started.path + " failed"};
    }
    started.times.push_back(std::chrono::nanoseconds{end - begin}.count());
    started.peak = std::max(started.peak, usage.ru_maxrss);
}

void run(int rounds, std::vector<program>& programs) {
    const links all = read_links();
    std::vector<std::size_t> order;
    for (std::size_t i = 0; i < programs.size(); ++i) {
        order.push_back(i);
    }
    for (int round = 0; round < rounds; ++round) {
        for (const std::size_t i : order) {
            restore(all);
            start(programs[i]);
        }
        // Another order each round: who goes before leaves the caches.
        std::next_permutation(order.begin(), order.end());
    }
    restore(all);
}

void print(program& measured) {
    std::vector<long>& times = measured.times;
    std::sort(times.begin(), times.end());
    std::printf("%s %ld %ld %ld\n", measured.path.c_str(), times.at(times.size() / 2),
                times.front(), measured.peak);
}

} // namespace

int main(int argc, char** argv) {
    try {
        const std::vector<std::string> arguments{argv, argv + argc};
        std::vector<program> programs;
        for (std::size_t i = 2; i < arguments.size(); ++i) {
            programs.push_back({arguments[i], {}});
        }
        run(std::stoi(arguments.at(1)), programs);
        std::for_each(programs.begin(), programs.end(), print);
        return 0;
    } catch (const std::exception& failure) {
        std::fprintf(stderr, "stopwatch: %s\n", failure.what());
        return 1;
    }
}
