#pragma once

#include <sys/types.h>

#include <chrono>
#include <functional>
#include <string>

#include "Channel.h"

using Clock = std::chrono::steady_clock;

/// Work in a process of its own, the leader of a process group, so that whatever it starts ends
/// with it: a text that it makes, and lines that it and its children print on both streams.
class Call {
public:
    /// Starts the process, which sees this process as it is now and ends behind `work`. Throws
    /// `std::system_error`.
    explicit Call(const std::function<std::string()>& work);
    Call(const Call&) = delete;
    Call& operator=(const Call&) = delete;
    /// Kills the group when it was asked to end or the process still runs.
    ~Call();

    /// Readable when there is more of the text, a line, or when the process has ended; below 0 when
    /// nothing more can come.
    [[nodiscard]] int ResultDescriptor() const { return _result.Get(); }
    [[nodiscard]] int LogDescriptor() const { return _log.Get(); }
    [[nodiscard]] int ProcessDescriptor() const { return _process.Get(); }

    /// Reads what is there, without waiting.
    void Read();
    [[nodiscard]] bool HasLine() const { return _lines.HasLine(); }
    std::string TakeLine() { return _lines.TakeLine(); }

    [[nodiscard]] bool HasEnded() const;
    /// What `Read` has read of the text. Once the process has ended, one more `Read` gives the
    /// whole of it; an empty one is that of a process that died before it was done.
    [[nodiscard]] const std::string& Text() const { return _text; }
    /// How the process ended, such as "signal 11 (Segmentation fault)".
    [[nodiscard]] std::string CauseOfDeath() const;

    /// Asks the group to end; the destructor insists.
    void End();

private:
    [[noreturn]] static void Work(const std::function<std::string()>& work, Descriptor result,
                                  Descriptor log);
    void ReadResult();

    pid_t _pid = -1;
    Descriptor _process, _result, _log;
    std::string _text;
    LineReader _lines;
    bool _endWanted = false;
};
