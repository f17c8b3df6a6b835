#include <zelmar/internal/platform/Drnuser.h>

#include <fcntl.h>
#include <spawn.h>
#include <unistd.h>

#include <csignal>
#include <cstdio>
#include <cstring>

namespace {

// The scoped owners of what a start needs; each initialisation here only fails for want of memory.
struct SpawnActions {
    posix_spawn_file_actions_t actions;
    SpawnActions() { posix_spawn_file_actions_init(&actions); }
    SpawnActions(const SpawnActions&) = delete;
    SpawnActions& operator=(const SpawnActions&) = delete;
    ~SpawnActions() { posix_spawn_file_actions_destroy(&actions); }
};

struct SpawnAttributes {
    posix_spawnattr_t attributes;
    SpawnAttributes() { posix_spawnattr_init(&attributes); }
    SpawnAttributes(const SpawnAttributes&) = delete;
    SpawnAttributes& operator=(const SpawnAttributes&) = delete;
    ~SpawnAttributes() { posix_spawnattr_destroy(&attributes); }
};

void ResetBrokenPipeSignal(posix_spawnattr_t& attributes) {
    sigset_t signals;
    sigemptyset(&signals);
    sigaddset(&signals, SIGPIPE);
    posix_spawnattr_setsigdefault(&attributes, &signals);
    posix_spawnattr_setflags(&attributes, POSIX_SPAWN_SETSIGDEF);
}

bool IsOpen(int descriptor) {
    return fcntl(descriptor, F_GETFD) >= 0;
}

}  // namespace

int DrnuserCompat_ForkExec(const char* program, char* const* arguments, char* const* environment,
                           int, const int* descriptors, int count, int, int, int, int* processId) {
    SpawnActions files;
    for (int place = 0; place < count; ++place) {
        // A descriptor that is put in its own place loses its close-on-exec mark.
        if (descriptors[place] != place || IsOpen(place)) {
            posix_spawn_file_actions_adddup2(&files.actions, descriptors[place], place);
        }
    }
    SpawnAttributes signals;
    ResetBrokenPipeSignal(signals.attributes);
    return posix_spawn(processId, program, &files.actions, &signals.attributes, arguments,
                       environment ? environment : environ);
}

void DrnuserStatus_CodeToString(int status, char* buffer, size_t size, int) {
    char text[200];
    std::snprintf(buffer, size, "%s", strerror_r(status, text, sizeof text));
}
