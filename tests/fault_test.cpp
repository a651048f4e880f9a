#include "device.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <linux/filter.h>
#include <linux/seccomp.h>
#include <poll.h>
#include <sys/ioctl.h>
#include <sys/prctl.h>
#include <sys/resource.h>
#include <sys/syscall.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <cerrno>
#include <csignal>
#include <filesystem>
#include <stdexcept>

// What a start-up survives: each of its file-system calls failing, the power cut at each of them,
// and a standard error that can't take a message.
namespace initialiser {
namespace {

constexpr int listener_number = 100; // the same in every new process, so that this one can find it
constexpr int cut_power = -1;

constexpr std::array watched_calls = {
    SYS_rt_sigaction, SYS_exit_group, // these two only tell where the start-up begins and ends
    SYS_openat,       SYS_close,      SYS_read,    SYS_write,  SYS_fstat, SYS_newfstatat,
    SYS_getdents64,   SYS_fcntl,
#ifdef SYS_unlink
    SYS_access,       SYS_readlink,   SYS_symlink, SYS_unlink, SYS_rmdir
#else
    SYS_faccessat,    SYS_readlinkat, SYS_symlinkat, SYS_unlinkat
#endif
};

// In the new process: hands its calls over to a listener, and waits until there is one.
void hand_over_calls() {
    setenv("ASAN_OPTIONS", "detect_leaks=0", 1); // its own calls would be judged as well
    std::vector<sock_filter> filter = {BPF_STMT(BPF_LD | BPF_W | BPF_ABS, 0)}; // the call's number
    for (const long call : watched_calls) {
        filter.push_back(BPF_JUMP(BPF_JMP | BPF_JEQ | BPF_K, static_cast<unsigned>(call), 0, 1));
        filter.push_back(BPF_STMT(BPF_RET | BPF_K, SECCOMP_RET_USER_NOTIF));
    }
    filter.push_back(BPF_STMT(BPF_RET | BPF_K, SECCOMP_RET_ALLOW));
    const sock_fprog program{static_cast<unsigned short>(filter.size()), filter.data()};
    prctl(PR_SET_NO_NEW_PRIVS, 1, 0, 0, 0);
    const long listener =
        syscall(SYS_seccomp, SECCOMP_SET_MODE_FILTER, SECCOMP_FILTER_FLAG_NEW_LISTENER, &program);
    dup3(static_cast<int>(listener), listener_number, O_CLOEXEC);
    raise(SIGSTOP);
}

struct judged_outcome {
    int status = 0;
    int calls = 0;
    std::ptrdiff_t left_open = 0; // descriptors
};

// One start-up of whose file-system calls each, counted from 0, is made (0), fails with an error
// number (above 0), or is what a power cut prevents.
judged_outcome start_up_under(const std::function<int(int)>& judge) {
    judged_outcome result;
    const auto attend = [&](int child) {
        const auto open_descriptors = [child] {
            const auto folder = "/proc/" + std::to_string(child) + "/fd";
            return std::distance(std::filesystem::directory_iterator{folder}, {});
        };
        waitpid(child, nullptr, WUNTRACED);
        const long process = syscall(SYS_pidfd_open, child, 0);
        const auto listener =
            static_cast<int>(syscall(SYS_pidfd_getfd, process, listener_number, 0));
        close(static_cast<int>(process));
        if (listener < 0) {
            kill(child, SIGKILL);
            throw std::runtime_error("nobody may listen to the program's calls here");
        }
        kill(child, SIGCONT);
        bool begun = false;
        pollfd event{listener, POLLIN, 0};
        while (poll(&event, 1, -1) > 0 && (event.revents & POLLIN) != 0) {
            seccomp_notif call{};
            ioctl(listener, SECCOMP_IOCTL_NOTIF_RECV, &call);
            int sentence = 0;
            if (call.data.nr == SYS_rt_sigaction) {
                // The start-up's first own act, and no sanitizer's, is to ignore broken pipes.
                if (call.data.args[0] == SIGPIPE) {
                    begun = true;
                    result.left_open -= open_descriptors();
                }
            } else if (call.data.nr == SYS_exit_group) {
                result.left_open += open_descriptors();
            } else if (begun) {
                sentence = judge(result.calls++);
                // The kernel closes a descriptor even when it reports a failure to do so.
                result.left_open -= call.data.nr == SYS_close && sentence > 0 ? 1 : 0;
            }
            if (sentence == cut_power) {
                kill(child, SIGKILL);
                break;
            }
            const unsigned flags = sentence == 0 ? SECCOMP_USER_NOTIF_FLAG_CONTINUE : 0U;
            seccomp_notif_resp response{call.id, 0, -sentence, flags};
            ioctl(listener, SECCOMP_IOCTL_NOTIF_SEND, &response);
        }
        close(listener);
    };
    result.status = device::start_up(hand_over_calls, attend).status;
    return result;
}

const std::string update = "/var/db/timezone/tz/2022a.1.0";

// Has everything to do: an old ICU link to migrate, data to reject, an update to install, a
// localtime link to correct, leftovers to remove.
class busy_device : public device {
public:
    busy_device() {
        put({{"tz/2022a.1.0", "dataset icutz44l.dat"},
             {"tz_latest", "-> " + update},
             {"zoneinfo", "-> /var/db/timezone/tz/2021a.1.0/zoneinfo"},
             {"localtime", "-> /usr/share/zoneinfo/Asia/Tokyo"},
             {"needs_cleanup", "="},
             {"/var/db/icutz", "-> timezone/tz/2021a.1.0/icutz"},
             {"/var/db/icu", "="}});
    }
};

// The next start-up, on a healthy disk, puts everything right. Returns the ICU link's state.
std::string icu_link_after_next_start_up() {
    EXPECT_EQ(device::start_up().status, 0);
    tree healed = device::contents();
    EXPECT_EQ(healed["/var/db/timezone/zoneinfo"], "-> " + update + "/zoneinfo");
    EXPECT_EQ(healed["/var/db/timezone/localtime"].rfind("-> /var/db/timezone/zoneinfo/", 0), 0);
    EXPECT_FALSE(healed.contains("/var/db/icutz") || healed.contains("/var/db/icu"));
    return healed["/var/db/timezone/icutz"];
}

TEST(faults, any_failing_call_is_healed) {
    int calls = 1;
    for (int failing = 0; failing < calls; ++failing) {
        for (const int error : {EIO, ENOSPC, EROFS, EACCES, EMFILE, ENOMEM}) {
            SCOPED_TRACE("call " + std::to_string(failing) + ", error " + std::to_string(error));
            const busy_device device;
            const judged_outcome outcome =
                start_up_under([&](int call) { return call == failing ? error : 0; });
            EXPECT_LE(outcome.status, 1);
            EXPECT_EQ(outcome.left_open, 0);
            EXPECT_EQ(icu_link_after_next_start_up(), "-> " + update + "/icutz");
            calls = std::max(calls, outcome.calls);
        }
    }
    EXPECT_GT(calls, 60);
}

TEST(faults, a_power_cut_at_any_call_is_healed) {
    int cuts = 0;
    int without_icu_link = 0;
    for (bool cut = true; cut; ++cuts) {
        SCOPED_TRACE("power cut before call " + std::to_string(cuts));
        const busy_device device;
        const int status =
            start_up_under([&](int call) { return call == cuts ? cut_power : 0; }).status;
        cut = status == 128 + SIGKILL;
        EXPECT_TRUE(cut || status == 0);
        const std::string icu_link = icu_link_after_next_start_up();
        without_icu_link += icu_link.empty() ? 1 : 0;
        EXPECT_TRUE(icu_link.empty() || icu_link == "-> " + update + "/icutz") << icu_link;
    }
    EXPECT_GT(cuts, 60);
    // After a cut between the two links of an update, the ICU link is missing until the next one:
    // the system's own ICU files, which have the same schema, are read until then.
    EXPECT_EQ(without_icu_link, 3);
}

TEST(faults, messages_can_not_harm) {
    const auto contents_after = [](const std::function<void()>& prepare) {
        const busy_device device;
        EXPECT_EQ(device::start_up(prepare).status, 0);
        return device::contents();
    };
    const tree expected = contents_after([] {});
    EXPECT_EQ(contents_after([] { close(2); }), expected);
    EXPECT_EQ(contents_after([] { close(0), close(1), close(2); }), expected);
    EXPECT_EQ(contents_after([] { dup2(open("/dev/full", O_WRONLY), 2); }), expected);
    EXPECT_EQ(contents_after([] {
                  std::array<int, 2> ends{};
                  EXPECT_EQ(pipe(ends.data()), 0);
                  dup2(ends[1], 2), close(ends[0]), close(ends[1]);
              }),
              expected);
    // A limit on the size of files costs the record, not the start-up.
    const auto limit_files = [] {
        const rlimit none{0, 0};
        setrlimit(RLIMIT_FSIZE, &none);
    };
    EXPECT_EQ(contents_after(limit_files), after(expected, {{"TZVersionDiffRecord", "="}}));
}

} // namespace
} // namespace initialiser
