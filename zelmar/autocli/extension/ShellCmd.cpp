#include <zelmar/ZelmarException.h>
#include <zelmar/autocli/extension/ShellCmd.h>
#include <zelmar/internal/platform/Drnuser.h>
#include <zelmar/internal/platform/Pipe.h>

#include <fcntl.h>
#include <poll.h>
#include <sys/wait.h>

#include <boost/algorithm/string/replace.hpp>

#include <cerrno>
#include <string_view>
#include <system_error>
#include <vector>

using Zelmar::ZelmarException;

namespace AutoCli {

namespace {

CommandExecListener commandExecListener = nullptr;
ChildRpDrnOptionMaker childRpDrnOptionMaker = nullptr;

ZelmarException SystemFailure(const std::string& what) {
    return ZelmarException(what + ": " + std::generic_category().message(errno));
}

bool IsWorthRepeating() {
    return errno == EINTR || errno == EAGAIN;
}

// Returns the process id of the shell.
int StartShell(const std::string& command, const Pipe& input, const Pipe& output) {
    const std::string option = MakeChildRpDrnOption(-1);
    std::vector<const char*> arguments = {"/bin/sh"};
    if (!option.empty()) {
        arguments.push_back(option.c_str());
    }
    arguments.insert(arguments.end(), {"-c", command.c_str(), nullptr});
    const int descriptors[] = {input.readEnd.Get(), output.writeEnd.Get(), 2};

    int processId = -1;
    const int status =
        DrnuserCompat_ForkExec("/bin/sh", const_cast<char* const*>(arguments.data()), nullptr, -1,
                               descriptors, std::size(descriptors), -1, -1, 0, &processId);
    if (status != 0) {
        char text[200];
        DrnuserStatus_CodeToString(status, text, sizeof text, 0);
        throw ZelmarException("Failed to call process '" + command + "': " + text);
    }
    return processId;
}

// Writes as much as the pipe takes now, and closes it behind the last byte.
void Feed(FileDescriptor& pipe, std::string_view& text) {
    if (!text.empty()) {
        const ssize_t written = WriteWithoutSignal(pipe.Get(), text.data(), text.size());
        if (written >= 0) {
            text.remove_prefix(static_cast<size_t>(written));
        } else if (!IsWorthRepeating()) {
            throw SystemFailure("Unable to write to sub-process");
        }
    }
    if (text.empty()) {
        pipe.Close();
    }
}

// Appends what the pipe holds now, and closes it when nothing more can come.
void Drain(FileDescriptor& pipe, std::vector<char>& block, std::string& text) {
    const ssize_t count = read(pipe.Get(), block.data(), block.size());
    if (count > 0) {
        text.append(block.data(), static_cast<size_t>(count));
    } else if (count == 0) {
        pipe.Close();
    } else if (!IsWorthRepeating()) {
        throw SystemFailure("Unable to read from sub-process");
    }
}

// Both directions at once: a process may print more than a pipe holds before it has read its input.
void Pump(FileDescriptor& input, std::string_view inputText, FileDescriptor& output,
          std::string& outputText) {
    std::vector<char> block(65536);  // as much as a pipe holds, and more than a small stack does
    while (input.Get() >= 0 || output.Get() >= 0) {
        pollfd ends[] = {{input.Get(), POLLOUT, 0}, {output.Get(), POLLIN, 0}};
        if (poll(ends, std::size(ends), -1) < 0 && !IsWorthRepeating()) {
            throw SystemFailure("Unable to read from sub-process");
        }
        if (ends[0].revents != 0) {
            Feed(input, inputText);
        }
        if (ends[1].revents != 0) {
            Drain(output, block, outputText);
        }
    }
}

// False, with the reason in `errno`, when the process cannot be waited for.
bool WaitFor(int processId, int& status) {
    while (waitpid(processId, &status, 0) < 0) {
        if (errno != EINTR) {
            return false;
        }
    }
    return true;
}

}  // namespace

int AutoCli_ShellCmd(const std::string& command, std::string& output, const std::string& input) {
    Pipe inputPipe;
    if (!inputPipe.Open()) {
        throw SystemFailure("Can't create input pipe");
    }
    Pipe outputPipe;
    if (!outputPipe.Open()) {
        throw SystemFailure("Can't create output pipe");
    }
    // As long as the reading end is open here, no write fails: a short text is written before there
    // is a process that could end without having read it.
    fcntl(inputPipe.writeEnd.Get(), F_SETFL, O_NONBLOCK);
    std::string_view unwritten = input;
    Feed(inputPipe.writeEnd, unwritten);
    const int processId = StartShell(command, inputPipe, outputPipe);
    inputPipe.readEnd.Close();
    outputPipe.writeEnd.Close();

    int status = 0;
    try {
        Pump(inputPipe.writeEnd, unwritten, outputPipe.readEnd, output);
    } catch (...) {
        inputPipe.writeEnd.Close();
        outputPipe.readEnd.Close();
        WaitFor(processId, status);
        throw;
    }
    if (!WaitFor(processId, status)) {
        throw SystemFailure("Error waiting for process '" + command + "'");
    }
    if (commandExecListener) {
        commandExecListener(command, status);
    }
    return status;
}

int AutoCli_ShellCmdWithOxUsername(const std::string& command, const std::string& username,
                                   std::string& output, const std::string& input) {
    if (username.empty()) {
        return AutoCli_ShellCmd(command, output, input);
    }
    const std::string quoted = boost::algorithm::replace_all_copy(username, "'", R"('\'')");
    return AutoCli_ShellCmd("OX_USERNAME='" + quoted + "' " + command, output, input);
}

void SetCommandExecListener(CommandExecListener listener) {
    commandExecListener = listener;
}

void SetChildRpDrnOptionMaker(ChildRpDrnOptionMaker maker) {
    childRpDrnOptionMaker = maker;
}

std::string MakeChildRpDrnOption(int argument) {
    return childRpDrnOptionMaker ? childRpDrnOptionMaker(argument) : std::string();
}

}  // namespace AutoCli
