#include <zelmar/autocli/Dispatcher.h>
#include <zelmar/autocli/completion/ExistingValues.h>
#include <zelmar/internal/Split.h>
#include <zelmar/internal/platform/Pipe.h>
#include <zelmar/metaobj/MetaList.h>

#include <fcntl.h>
#include <poll.h>
#include <sys/prctl.h>
#include <sys/wait.h>

#include <algorithm>
#include <cerrno>
#include <chrono>
#include <csignal>
#include <cstdlib>

using MetaObj::MetaCast;
using MetaObj::MetaList;
using MetaObj::MetaObject;
using MetaObj::MetaStruct;
using MetaObj::MetaType;
using std::chrono::steady_clock;

namespace AutoCli {

namespace {

constexpr std::chrono::milliseconds patience(500);
constexpr size_t mostBytes = 1 << 20;

// Terminating signals wait while the values are fetched, so that the process which fetches them is
// always ended first.
class HeldSignals {
public:
    HeldSignals() {
        sigset_t signals;
        sigemptyset(&signals);
        for (const int signal : {SIGINT, SIGQUIT, SIGTERM, SIGHUP, SIGTSTP}) {
            sigaddset(&signals, signal);
        }
        pthread_sigmask(SIG_BLOCK, &signals, &_before);
    }
    HeldSignals(const HeldSignals&) = delete;
    HeldSignals& operator=(const HeldSignals&) = delete;
    ~HeldSignals() { Release(); }

    void Release() const { pthread_sigmask(SIG_SETMASK, &_before, nullptr); }

private:
    sigset_t _before = {};
};

bool NeedsNoParameter(CommandSpec& command) {
    return std::ranges::none_of(command.GetInputSpec()->GetParameterSpecs(),
                                [](const auto& parameter) { return parameter->IsRequired(); });
}

// Each value ends with a zero byte; one that holds such a byte cannot be an argument anyway.
void AppendValue(const MetaObject* value, std::string& values) {
    if (const auto* list = MetaCast<MetaList>(value)) {
        for (const auto& item : list->GetObjects()) {
            AppendValue(item.get(), values);
        }
    } else if (value && value->GetType() != MetaType::Struct) {
        const std::string text = value->ToString();
        if (text.find('\0') == std::string::npos) {
            values.append(text).push_back('\0');
        }
    }
}

// The field of a struct, or of each struct of a list.
void AppendField(const std::shared_ptr<MetaObject>& value, const std::string& field,
                 std::string& values) {
    if (const auto* list = MetaCast<MetaList>(value.get())) {
        for (const auto& item : list->GetObjects()) {
            AppendField(item, field, values);
        }
    } else if (const auto structure = std::dynamic_pointer_cast<MetaStruct>(value)) {
        AppendValue(GetSubField(structure, field).get(), values);
    }
}

bool AppendValues(Dispatcher& dispatcher, const std::list<std::string>& path,
                  const std::string& field, std::string& values) {
    const auto input = CommandInput::New();
    const auto output = CommandOutput::New();
    input->SetCommandPath(path);
    const auto command = dispatcher.GetCommand(input, output);
    if (!command || !NeedsNoParameter(*command) || !dispatcher.ExecuteCommand(input, output)) {
        return false;
    }
    AppendField(output->GetRootObject(), field, values);
    return true;
}

void WriteAll(int descriptor, std::string_view text) {
    while (!text.empty()) {
        const ssize_t written = write(descriptor, text.data(), text.size());
        if (written < 0 && errno != EINTR) {
            return;
        }
        text.remove_prefix(static_cast<size_t>(std::max<ssize_t>(written, 0)));
    }
}

// A session of its own has no terminal, and is the group that is ended as a whole.
void LeaveTerminal() {
    setsid();
    prctl(PR_SET_PDEATHSIG, SIGKILL);
    const int nothing = open("/dev/null", O_RDWR);
    for (const int standard : {STDIN_FILENO, STDOUT_FILENO, STDERR_FILENO}) {
        dup2(nothing, standard);
    }
}

[[noreturn]] void RunInChild(Dispatcher& dispatcher, const std::list<std::string>& path,
                             const std::string& field, int output) {
    LeaveTerminal();
    std::string values;
    bool succeeded = false;
    try {
        succeeded = AppendValues(dispatcher, path, field, values);
    } catch (...) {
        succeeded = false;
    }
    WriteAll(output, values);
    _exit(succeeded ? EXIT_SUCCESS : EXIT_FAILURE);
}

// False when the time or the room is up before the end.
bool ReadInTime(int descriptor, std::string& text) {
    const auto end = steady_clock::now() + patience;
    char block[65536];
    while (text.size() <= mostBytes) {
        const auto left =
            std::chrono::ceil<std::chrono::milliseconds>(end - steady_clock::now()).count();
        pollfd pipe = {descriptor, POLLIN, 0};
        if (left <= 0 || poll(&pipe, 1, static_cast<int>(left)) == 0) {
            return false;
        }
        const ssize_t count = read(descriptor, block, sizeof block);
        if (count == 0) {
            return true;
        }
        if (count < 0 && errno != EINTR) {
            return false;
        }
        text.append(block, static_cast<size_t>(std::max<ssize_t>(count, 0)));
    }
    return false;
}

// Waits for the process and ends what it leaves behind; while it is not collected, nothing else can
// have taken its number.
bool EndsWell(pid_t process) {
    siginfo_t end = {};
    while (waitid(P_PID, static_cast<id_t>(process), &end, WEXITED | WNOWAIT) < 0 &&
           errno == EINTR) {
    }
    kill(-process, SIGKILL);
    while (waitpid(process, nullptr, 0) < 0 && errno == EINTR) {
    }
    return end.si_code == CLD_EXITED && end.si_status == EXIT_SUCCESS;
}

bool Fetch(Dispatcher& dispatcher, const std::list<std::string>& path, const std::string& field,
           std::string& values) {
    Pipe pipe;
    if (!pipe.Open()) {
        return false;
    }
    const HeldSignals held;
    const pid_t child = fork();
    if (child == 0) {
        held.Release();
        RunInChild(dispatcher, path, field, pipe.writeEnd.Get());
    }
    if (child < 0) {
        return false;
    }
    pipe.writeEnd.Close();
    const bool isComplete = ReadInTime(pipe.readEnd.Get(), values);
    if (!isComplete) {
        kill(child, SIGKILL);
    }
    return EndsWell(child) && isComplete;
}

}  // namespace

std::vector<std::string> ExistingValues(Dispatcher& dispatcher, const std::string& source) {
    const size_t colon = source.rfind(':');
    if (colon == std::string::npos) {
        return {};
    }
    std::list<std::string> path;
    ForEachPiece(std::string_view(source).substr(0, colon), ' ', [&path](std::string_view name) {
        if (!name.empty()) {
            path.emplace_back(name);
        }
    });
    std::string text;
    std::vector<std::string> values;
    if (Fetch(dispatcher, path, source.substr(colon + 1), text)) {
        ForEachPiece(text, '\0', [&values](std::string_view value) { values.emplace_back(value); });
    }
    return values;
}

}  // namespace AutoCli
