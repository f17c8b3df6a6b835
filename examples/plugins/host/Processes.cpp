#include "Processes.h"

#include <algorithm>
#include <cctype>
#include <cstdlib>
#include <fstream>
#include <iterator>
#include <map>

namespace Host {

namespace {

// A process may call itself anything; what steers a terminal is kept away from it.
std::string WithoutControls(std::string text) {
    std::ranges::replace_if(
        text, [](unsigned char c) { return std::iscntrl(c) != 0; }, ' ');
    return text;
}

// The lines "Name:<tab>value" of a status file.
std::map<std::string, std::string> ReadStatus(const std::filesystem::path& file) {
    std::map<std::string, std::string> fields;
    std::ifstream status(file);
    for (std::string name, value; std::getline(status, name, ':') && std::getline(status, value);) {
        fields[name] = value.substr(std::min<size_t>(value.size(), 1));
    }
    return fields;
}

int Number(const std::string& text) {
    return static_cast<int>(std::strtol(text.c_str(), nullptr, 10));
}

// "0<tab>1000<tab>...": the real user, the effective one, and others.
uid_t EffectiveUser(const std::string& users) {
    return static_cast<uid_t>(std::strtoul(users.c_str() + users.find('\t') + 1, nullptr, 10));
}

// "S (sleeping)"
std::string StateWord(const std::string& state) {
    const size_t begin = state.find('(') + 1;
    return state.substr(begin, state.find(')') - begin);
}

std::string ReadCommandLine(const std::filesystem::path& file) {
    std::ifstream stream(file);
    std::string line{std::istreambuf_iterator<char>(stream), {}};
    std::ranges::replace_if(
        line, [](unsigned char c) { return std::iscntrl(c) != 0; }, ' ');
    line.erase(line.find_last_not_of(' ') + 1);
    return line;
}

bool IsNumber(const std::string& name) {
    return std::ranges::all_of(name, [](unsigned char c) { return std::isdigit(c) != 0; });
}

}  // namespace

std::optional<Process> ReadProcess(const std::filesystem::path& directory) {
    auto status = ReadStatus(directory / "status");
    if (!status.contains("Uid")) {
        return std::nullopt;
    }
    Process process;
    process.number = Number(status["Pid"]);
    process.parent = Number(status["PPid"]);
    process.user = EffectiveUser(status["Uid"]);
    process.state = StateWord(status["State"]);
    process.memory = Number(status["VmRSS"]);
    process.name = WithoutControls(status["Name"]);
    process.command = ReadCommandLine(directory / "cmdline");
    if (process.command.empty()) {
        process.command = "[" + process.name + "]";
    }
    return process;
}

std::vector<Process> ReadProcesses(const std::filesystem::path& table) {
    std::vector<Process> processes;
    for (const auto& entry : std::filesystem::directory_iterator(table)) {
        if (IsNumber(entry.path().filename())) {
            if (auto process = ReadProcess(entry.path())) {
                processes.push_back(std::move(*process));
            }
        }
    }
    std::ranges::sort(processes, {}, &Process::number);
    return processes;
}

}  // namespace Host
