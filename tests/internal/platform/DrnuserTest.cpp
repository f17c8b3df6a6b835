#include <zelmar/internal/platform/Drnuser.h>
#include <zelmar/internal/platform/Pipe.h>

#include <gtest/gtest.h>

#include <sys/wait.h>

#include <csignal>
#include <string>

namespace {

// The signals that a program sees in one line of /proc/self/status when it starts.
unsigned long SignalsAtStart(const char* line) {
    Pipe pipe;
    EXPECT_TRUE(pipe.Open());
    const char* arguments[] = {"grep", line, "/proc/self/status", nullptr};
    const int descriptors[] = {0, pipe.writeEnd.Get(), 2};
    int child = -1;
    EXPECT_EQ(DrnuserCompat_ForkExec("/bin/grep", const_cast<char* const*>(arguments), nullptr, -1,
                                     descriptors, 3, -1, -1, 0, &child),
              0);
    char text[100] = {};
    EXPECT_GT(read(pipe.readEnd.Get(), text, sizeof text - 1), 0);
    waitpid(child, nullptr, 0);
    return std::stoul(std::string(text).substr(std::string(line).size() + 1), nullptr, 16);
}

constexpr unsigned long Bit(int signal) {
    return 1UL << (signal - 1);
}

// As a program expects to start, whatever the host has done to itself.
TEST(Drnuser, StartsAProgramWithTheCallersMaskAndAnOrdinaryBrokenPipe) {
    sigset_t user;
    sigset_t before;
    sigemptyset(&user);
    sigaddset(&user, SIGUSR1);
    pthread_sigmask(SIG_SETMASK, &user, &before);
    signal(SIGPIPE, SIG_IGN);
    signal(SIGUSR2, SIG_IGN);
    EXPECT_EQ(SignalsAtStart("SigBlk:"), Bit(SIGUSR1));
    EXPECT_EQ(SignalsAtStart("SigIgn:") & (Bit(SIGPIPE) | Bit(SIGUSR2)), Bit(SIGUSR2));
    signal(SIGPIPE, SIG_DFL);
    signal(SIGUSR2, SIG_DFL);
    pthread_sigmask(SIG_SETMASK, &before, nullptr);
}

TEST(Drnuser, TellsWhyAProgramDoesNotStart) {
    const char* arguments[] = {"none", nullptr};
    const int descriptors[] = {0, 1, 2};
    int child = -1;
    const int status = DrnuserCompat_ForkExec("/nowhere/none", const_cast<char* const*>(arguments),
                                              nullptr, -1, descriptors, 3, -1, -1, 0, &child);
    char text[8];
    DrnuserStatus_CodeToString(status, text, sizeof text, 0);
    EXPECT_STREQ(text, "No such");
}

}  // namespace
