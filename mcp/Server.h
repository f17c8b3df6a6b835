#pragma once

#include <zelmar/zelmar.h>

#include <ctime>
#include <deque>
#include <list>
#include <memory>
#include <optional>
#include <string>

#include "Call.h"
#include "Channel.h"
#include "Json.h"
#include "Tools.h"

struct Limits {
    std::chrono::seconds time{60};  ///< for a call
    size_t result = 10'000'000;     ///< bytes of JSON
    size_t parallel = 1;            ///< calls at a time; the others wait their turn
};

/// Speaks the Model Context Protocol (modelcontextprotocol.io, revisions 2024-11-05, 2025-03-26 and
/// 2025-06-18) over two descriptors: JSON-RPC 2.0, a message a line. It offers tools and logging.
///
/// A call runs in a process of its own, so that whatever a command does, the server goes on, a
/// client can cancel it, and its time can be limited.
class Server {
public:
    Server(AutoCli::Dispatcher& dispatcher, const Tools& tools, const Limits& limits, int input,
           int output);

    /// Serves until the input has ended and everything is answered. Returns the status for the
    /// process: 1 when the client could not be written to, 128 and the signal behind SIGTERM,
    /// SIGINT and SIGHUP. Calls that still run are ended.
    int Run();

private:
    /// The answers to the requests of one batch, which leave together.
    struct Batch {
        size_t open = 0;
        std::string answers;
    };
    struct Request {
        Json id;
        std::shared_ptr<Batch> batch;  // null for a request that came alone
    };
    struct ToolCall {
        Request request;
        std::string tool;
        std::shared_ptr<AutoCli::Command> command;
        Json arguments;
        Json progressToken;          // null when no progress is asked for
        std::unique_ptr<Call> call;  // null until its turn comes
        Clock::time_point start, nextProgress;
        Clock::time_point end;    // of its time, and once it is answered of its processes
        bool isAnswered = false;  // or cancelled
        size_t logLines = 0;
    };

    [[nodiscard]] bool IsDone() const;
    bool WaitAndTransfer();
    [[nodiscard]] std::optional<timespec> TimeToNextEvent() const;

    void HandleLine(const std::string& line, bool wasCut);
    void HandleMessage(const Json& message, const std::shared_ptr<Batch>& batch);
    void HandleNotification(const std::string& method, const Json& parameters);
    void HandleRequest(const Request& request, const std::string& method, const Json& parameters);
    void Initialize(const Request& request, const Json& parameters);
    void SetLevel(const Request& request, const Json& parameters);
    void ListTools(const Request& request, const Json& parameters);

    // A call: taken, started when its turn comes, attended to, ended if need be.
    void Take(const Request& request, const Json& parameters);
    void StartCalls();
    void Attend(ToolCall& call);
    void Log(ToolCall& call);
    void Cancel(const Json& id);
    static void End(ToolCall& call);
    void EndAll();

    void Answer(const Request& request, const std::string& result);
    void Refuse(const Request& request, int code, const std::string& reason);
    void Send(const Request& request, const std::string& answer);
    void Drop(const Request& request);
    void Close(Batch& batch);
    void Notify(const char* method, const Json& parameters);

    AutoCli::Dispatcher& _dispatcher;
    const Tools& _tools;
    const Limits _limits;
    const int _inputDescriptor, _outputDescriptor;
    LineReader _input;
    LineWriter _output;
    bool _inputEnded = false;
    size_t _logLevel = 0;
    std::deque<ToolCall> _waiting;
    std::list<ToolCall> _running;
};
