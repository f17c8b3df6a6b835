#include <zelmar/ZelmarException.h>
#include <zelmar/autocli/extension/Panic.h>
#include <zelmar/autocli/extension/ShellCmd.h>

#include <gtest/gtest.h>

#include <fcntl.h>
#include <sys/resource.h>
#include <sys/time.h>
#include <sys/wait.h>

#include <csignal>
#include <filesystem>
#include <iterator>

using AutoCli::AutoCli_ShellCmd;
using AutoCli::AutoCli_ShellCmdWithOxUsername;

namespace {

// What the command prints, or what was thrown.
std::string Shell(const std::string& command, const std::string& input = "") {
    std::string output;
    try {
        AutoCli_ShellCmd(command, output, input);
    } catch (const Zelmar::ZelmarException& error) {
        return error.what();
    }
    return output;
}

auto CountDescriptors() {
    return std::distance(std::filesystem::directory_iterator("/proc/self/fd"), {});
}

long CountInheritable() {
    long count = 0;
    for (int descriptor = 0; descriptor < 1000; ++descriptor) {
        const int flags = fcntl(descriptor, F_GETFD);
        count += flags >= 0 && !(flags & FD_CLOEXEC) ? 1 : 0;
    }
    return count;
}

bool HasChild() {
    return waitpid(-1, nullptr, WNOHANG) >= 0;
}

constexpr size_t megabyte = 1 << 20;
// Closes its standard input before it has read a text larger than a pipe.
constexpr const char* deafCommand = "exec <&-; sleep 0.05; echo done";

TEST(ShellCmd, AppendsWhatTheCommandPrintsAndReturnsItsRawStatus) {
    std::string output = "before ";
    EXPECT_EQ(AutoCli_ShellCmd("cat; echo after; exit 3", output, "input "), 3 << 8);
    EXPECT_EQ(output, "before input after\n");
    EXPECT_EQ(AutoCli_ShellCmd("kill -TERM $$", output, ""), SIGTERM);
    EXPECT_EQ(Shell("cat"), "");
    EXPECT_EQ(Shell("exec 2>/dev/null\n(unclosed", "x"), "");
}

TEST(ShellCmd, LetsNeitherSideWaitForTheOther) {
    const std::string large(8 * megabyte, 'x');
    EXPECT_EQ(Shell("cat; cat /dev/null", large), large);
    EXPECT_EQ(Shell("head -c 3000000 /dev/zero; cat", large).size(), large.size() + 3000000);
    EXPECT_EQ(Shell("exec >&-; cat >/dev/null", large), "");
}

TEST(ShellCmd, WritesAShortInputThatNobodyReads) {
    EXPECT_EQ(Shell(deafCommand, "short"), "done\n");
}

void IgnoreSignal(int) {}

TEST(ShellCmd, ReportsAnInputThatNobodyReadsAndLeavesSignalsAlone) {
    const std::string large(megabyte, 'x');
    for (const auto handler : {SIG_DFL, SIG_IGN, IgnoreSignal}) {
        signal(SIGPIPE, handler);
        EXPECT_EQ(Shell(deafCommand, large), "Unable to write to sub-process: Broken pipe");
        EXPECT_EQ(signal(SIGPIPE, SIG_DFL), handler);
    }
    sigset_t signals;
    pthread_sigmask(SIG_BLOCK, nullptr, &signals);
    EXPECT_FALSE(sigismember(&signals, SIGPIPE));
    sigpending(&signals);
    EXPECT_FALSE(sigismember(&signals, SIGPIPE));
    EXPECT_FALSE(HasChild());
}

// Calls that wait are cut short every millisecond, in each of the places where one waits.
TEST(ShellCmd, GoesOnAfterASignal) {
    struct sigaction before = {};
    struct sigaction tick = {};
    tick.sa_handler = IgnoreSignal;
    sigaction(SIGALRM, &tick, &before);
    const itimerval fast = {{0, 1000}, {0, 1000}};
    const itimerval never = {};
    setitimer(ITIMER_REAL, &fast, nullptr);
    EXPECT_EQ(Shell("sleep 0.02; cat; exec >&-; sleep 0.02", std::string(megabyte, 'x')).size(),
              megabyte);
    setitimer(ITIMER_REAL, &never, nullptr);
    sigaction(SIGALRM, &before, nullptr);
}

TEST(ShellCmd, KeepsASignalThatWasWaitingBefore) {
    sigset_t brokenPipe;
    sigset_t pending;
    sigemptyset(&brokenPipe);
    sigaddset(&brokenPipe, SIGPIPE);
    pthread_sigmask(SIG_BLOCK, &brokenPipe, nullptr);
    raise(SIGPIPE);
    EXPECT_EQ(Shell(deafCommand, std::string(megabyte, 'x')),
              "Unable to write to sub-process: Broken pipe");
    sigpending(&pending);
    EXPECT_TRUE(sigismember(&pending, SIGPIPE));
    const timespec atOnce = {};
    sigtimedwait(&brokenPipe, nullptr, &atOnce);
    pthread_sigmask(SIG_UNBLOCK, &brokenPipe, nullptr);
}

TEST(ShellCmd, LeaksNoDescriptorToAnyone) {
    const auto before = CountDescriptors();
    // What it inherits anyway, and the directory that it reads.
    EXPECT_EQ(Shell("ls /proc/self/fd | wc -l"), std::to_string(CountInheritable() + 1) + "\n");
    Shell(deafCommand, std::string(megabyte, 'x'));
    Shell(std::string(megabyte, ' '));
    EXPECT_EQ(CountDescriptors(), before);
}

TEST(ShellCmd, NeedsLittleStack) {
    pthread_attr_t attributes;
    pthread_attr_init(&attributes);
    pthread_attr_setstacksize(&attributes, 65536);
    std::string printed;
    pthread_t thread = {};
    const auto run = [](void* text) -> void* {
        *static_cast<std::string*>(text) = Shell("cat", "x");
        return nullptr;
    };
    ASSERT_EQ(pthread_create(&thread, &attributes, run, &printed), 0);
    pthread_join(thread, nullptr);
    EXPECT_EQ(printed, "x");
}

TEST(ShellCmd, TellsWhyTheShellDoesNotStart) {
    const std::string long_line = "true " + std::string(200000, 'x');
    EXPECT_EQ(Shell(long_line),
              "Failed to call process '" + long_line + "': Argument list too long");

    rlimit before = {};
    getrlimit(RLIMIT_NOFILE, &before);
    const auto runWith = [&before](long free) {
        const int next = open("/dev/null", O_RDONLY | O_CLOEXEC);
        close(next);
        const rlimit few = {static_cast<rlim_t>(next + free), before.rlim_max};
        setrlimit(RLIMIT_NOFILE, &few);
        std::string result = Shell("echo ran");
        setrlimit(RLIMIT_NOFILE, &before);
        return result;
    };
    EXPECT_EQ(runWith(1), "Can't create input pipe: Too many open files");
    EXPECT_EQ(runWith(3), "Can't create output pipe: Too many open files");
    EXPECT_EQ(runWith(4), "ran\n");
}

// A daemon may run without the standard descriptors: then the ends of the pipes would come to stand
// in their places, and a child that holds the writing end of its own input waits for ever.
TEST(ShellCmd, WorksWithoutStandardDescriptors) {
    const std::string large(megabyte, 'x');
    for (int closed = 1; closed < 8; ++closed) {
        const pid_t child = fork();
        if (child == 0) {
            for (int descriptor = 0; descriptor < 3; ++descriptor) {
                if (closed & (1 << descriptor)) {
                    close(descriptor);
                }
            }
            alarm(10);
            _exit(Shell("cat; echo x", large) == large + "x\n" ? 0 : 1);
        }
        int status = -1;
        waitpid(child, &status, 0);
        EXPECT_EQ(status, 0) << closed;
    }
}

std::string heard;

TEST(ShellCmd, TellsTheListenerTheLineAsItRan) {
    AutoCli::SetCommandExecListener([](const std::string& command, int status) {
        heard += command + " -> " + std::to_string(status) + "\n";
    });
    std::string output;
    AutoCli_ShellCmdWithOxUsername("exit 1", "o'neil", output, "");
    AutoCli_ShellCmdWithOxUsername("exit 2", "", output, "");
    AutoCli::SetCommandExecListener(nullptr);
    Shell("exit 3");
    EXPECT_EQ(heard, "OX_USERNAME='o'\\''neil' exit 1 -> 256\nexit 2 -> 512\n");
}

TEST(ShellCmd, HandsTheUsersNameToTheFirstCommand) {
    std::string output;
    AutoCli_ShellCmdWithOxUsername("printenv OX_USERNAME; echo [$OX_USERNAME]", "a'b\\c\n$(x)\"",
                                   output, "");
    EXPECT_EQ(output, "a'b\\c\n$(x)\"\n[]\n");
}

TEST(ShellCmd, PutsTheMakersOptionInFrontOfTheCommand) {
    EXPECT_EQ(AutoCli::MakeChildRpDrnOption(5), "");
    AutoCli::SetChildRpDrnOptionMaker(
        [](int argument) { return std::string(argument == -1 ? "-f" : ""); });
    EXPECT_EQ(Shell("echo $-"), "f\n");
    AutoCli::SetChildRpDrnOptionMaker(nullptr);
    EXPECT_EQ(Shell("echo $-"), "\n");
}

TEST(PanicDeathTest, SaysWhyAndAborts) {
    const std::string text(300, 'x');
    EXPECT_EXIT(Panic("%d %s", 7, text.c_str()), testing::KilledBySignal(SIGABRT),
                "^panic: 7 x{253}$");
}

}  // namespace
