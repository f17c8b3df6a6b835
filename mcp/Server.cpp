#include "Server.h"

#include <poll.h>

#include <algorithm>
#include <array>
#include <cerrno>
#include <csignal>
#include <cstring>
#include <iostream>
#include <string_view>
#include <system_error>

#include "Result.h"

namespace {

constexpr std::array<std::string_view, 3> revisions = {"2024-11-05", "2025-03-26", "2025-06-18"};
constexpr std::array<std::string_view, 8> logLevels = {"debug", "info",     "notice", "warning",
                                                       "error", "critical", "alert",  "emergency"};
constexpr size_t levelOfScripts = 3;  // what they say on their error stream is a warning

// The codes of JSON-RPC 2.0.
constexpr int parseError = -32700;
constexpr int invalidRequest = -32600;
constexpr int methodNotFound = -32601;
constexpr int invalidParameters = -32602;
constexpr int internalError = -32603;

constexpr size_t longestMessage = 16'000'000;
constexpr size_t largestBacklog = 1'000'000;  // bytes: above, no more is read from the client
constexpr size_t toolsOnAPage = 250;
constexpr size_t mostWaiting = 1000;
constexpr size_t mostLogLines = 1000;  // of one call
constexpr std::chrono::seconds progressInterval{1};
constexpr std::chrono::seconds grace{1};

volatile std::sig_atomic_t receivedSignal = 0;

void Remember(int signal) {
    receivedSignal = signal;
}

// They arrive while the server waits, and at no other time.
void HoldSignals() {
    struct sigaction action = {};
    action.sa_handler = &Remember;
    sigset_t held;
    sigemptyset(&held);
    for (const int signal : {SIGTERM, SIGINT, SIGHUP}) {
        sigaction(signal, &action, nullptr);
        sigaddset(&held, signal);
    }
    sigprocmask(SIG_BLOCK, &held, nullptr);
    std::signal(SIGPIPE, SIG_IGN);
    std::signal(SIGCHLD, SIG_DFL);
}

// Nothing that the protocol asks for is nested deeper; null for what is.
Json ParseMessage(const std::string& line) {
    constexpr int deepest = 64;
    const auto shallow = [](int depth, Json::parse_event_t, const Json&) {
        return depth <= deepest;
    };
    Json message = Json::parse(line, shallow, false);
    return message.is_discarded() ? Json() : message;
}

bool IsId(const Json& id) {
    return id.is_string() || id.is_number_integer();
}

// An object's member, or null.
const Json& Member(const Json& object, const char* name) {
    static const Json none;
    const auto member = object.is_object() ? object.find(name) : object.end();
    return object.is_object() && member != object.end() ? *member : none;
}

std::string TextMember(const Json& object, const char* name) {
    const Json& member = Member(object, name);
    return member.is_string() ? member.get<std::string>() : "";
}

}  // namespace

Server::Server(AutoCli::Dispatcher& dispatcher, const Tools& tools, const Limits& limits, int input,
               int output)
    : _dispatcher(dispatcher),
      _tools(tools),
      _limits(limits),
      _inputDescriptor(input),
      _outputDescriptor(output),
      _input(longestMessage) {}

int Server::Run() {
    HoldSignals();
    bool isConnected = true;
    while (isConnected && !IsDone() && receivedSignal == 0) {
        StartCalls();
        isConnected = WaitAndTransfer();
        while (_input.HasLine()) {
            const std::string line = _input.TakeLine();
            HandleLine(line, _input.WasCut());
        }
        std::ranges::for_each(_running, [this](ToolCall& call) { Attend(call); });
        std::erase_if(_running, [](const ToolCall& call) {
            return call.isAnswered && Clock::now() >= call.end;
        });
    }
    EndAll();
    if (receivedSignal != 0) {
        return 128 + receivedSignal;
    }
    return isConnected ? EXIT_SUCCESS : EXIT_FAILURE;
}

bool Server::IsDone() const {
    return _inputEnded && _waiting.empty() && _running.empty() && _output.Size() == 0;
}

// Waits for the next event and moves what is there between the descriptors and the buffers. False
// when the client is gone.
bool Server::WaitAndTransfer() {
    const bool reads = !_inputEnded && _output.Size() < largestBacklog;
    std::vector<pollfd> events = {
        {reads ? _inputDescriptor : -1, POLLIN, 0},
        {_outputDescriptor, static_cast<short>(_output.Size() > 0 ? POLLOUT : 0), 0}};
    for (const ToolCall& running : _running) {
        if (!running.isAnswered) {
            for (const int descriptor :
                 {running.call->ResultDescriptor(), running.call->LogDescriptor(),
                  running.call->ProcessDescriptor()}) {
                events.push_back({descriptor, POLLIN, 0});
            }
        }
    }
    const auto wait = TimeToNextEvent();
    sigset_t none;
    sigemptyset(&none);
    if (ppoll(events.data(), events.size(), wait ? &*wait : nullptr, &none) < 0) {
        return errno == EINTR;
    }
    if (events[0].revents != 0) {
        _inputEnded = !_input.Read(_inputDescriptor);
    }
    if ((events[1].revents & POLLOUT) == 0) {
        return (events[1].revents & (POLLERR | POLLHUP)) == 0;
    }
    if (_output.Write(_outputDescriptor)) {
        return true;
    }
    if (errno != EPIPE) {  // that a client has gone is no news to anybody
        std::cerr << "kelvash-mcp: Unable to write to standard output: " << std::strerror(errno)
                  << std::endl;
    }
    return false;
}

std::optional<timespec> Server::TimeToNextEvent() const {
    std::optional<Clock::time_point> next;
    for (const ToolCall& call : _running) {
        const auto event = call.isAnswered ? call.end : std::min(call.end, call.nextProgress);
        next = std::min(next.value_or(event), event);
    }
    if (!next) {
        return std::nullopt;
    }
    const auto wait = std::max(Clock::duration::zero(), *next - Clock::now());
    const auto seconds = std::chrono::floor<std::chrono::seconds>(wait);
    return timespec{seconds.count(), (wait - seconds).count()};
}

void Server::HandleLine(const std::string& line, bool wasCut) {
    if (wasCut) {
        Refuse({}, invalidRequest,
               "The message has more than " + std::to_string(longestMessage) + " bytes");
        return;
    }
    if (line.find_first_not_of(" \t\r") == std::string::npos) {
        return;
    }
    const Json message = ParseMessage(line);
    if (message.is_null()) {
        Refuse({}, parseError, "The message is no JSON");
    } else if (message.is_array() && !message.empty()) {
        const auto batch = std::make_shared<Batch>();
        batch->open = 1;  // stays open while there may be more requests in it
        for (const Json& member : message) {
            HandleMessage(member, batch);
        }
        Close(*batch);
    } else {
        HandleMessage(message, nullptr);
    }
}

void Server::HandleMessage(const Json& message, const std::shared_ptr<Batch>& batch) {
    const Json& method = Member(message, "method");
    const Json& id = Member(message, "id");
    const Json& parameters = Member(message, "params");
    if (!method.is_string() && IsId(id)) {
        return;  // an answer, and this server never asks
    }
    const bool isNotification = message.is_object() && !message.contains("id");
    const Request request = {IsId(id) ? id : Json(), isNotification ? nullptr : batch};
    if (request.batch) {
        ++batch->open;
    }
    if (TextMember(message, "jsonrpc") != "2.0" || !method.is_string() ||
        !(isNotification || IsId(id))) {
        Refuse(request, invalidRequest, "The message is no request of JSON-RPC 2.0");
    } else if (isNotification) {
        HandleNotification(method.get<std::string>(), parameters);
    } else if (!parameters.is_null() && !parameters.is_object()) {
        Refuse(request, invalidParameters, "The member 'params' is no object");
    } else {
        HandleRequest(request, method.get<std::string>(), parameters);
    }
}

void Server::HandleNotification(const std::string& method, const Json& parameters) {
    if (method == "notifications/cancelled") {
        Cancel(Member(parameters, "requestId"));
    }
}

void Server::HandleRequest(const Request& request, const std::string& method,
                           const Json& parameters) {
    if (method == "initialize") {
        Initialize(request, parameters);
    } else if (method == "ping") {
        Answer(request, "{}");
    } else if (method == "tools/list") {
        ListTools(request, parameters);
    } else if (method == "tools/call") {
        Take(request, parameters);
    } else if (method == "logging/setLevel") {
        SetLevel(request, parameters);
    } else {
        Refuse(request, methodNotFound, "Unknown method: " + method);
    }
}

void Server::Initialize(const Request& request, const Json& parameters) {
    const std::string wanted = TextMember(parameters, "protocolVersion");
    const bool isKnown = std::ranges::find(revisions, wanted) != revisions.end();
    Answer(request,
           TextOf({{"protocolVersion", isKnown ? wanted : revisions.back()},
                   {"capabilities",
                    {{"tools", {{"listChanged", false}}}, {"logging", Json::object()}}},
                   {"serverInfo",
                    {{"name", "kelvash-mcp"},
                     {"title", "Administrative commands of this machine"},
                     {"version", Zelmar::GetVersion()}}},
                   {"instructions",
                    "Each tool is an administrative command of this machine. The server checks"
                    " arguments and results against what the command declares, and reports all"
                    " that is wrong with a call at once."}}));
}

void Server::SetLevel(const Request& request, const Json& parameters) {
    const auto* level = std::ranges::find(logLevels, TextMember(parameters, "level"));
    if (level == logLevels.end()) {
        Refuse(request, invalidParameters, "The member 'level' is none of the levels");
        return;
    }
    _logLevel = static_cast<size_t>(level - logLevels.begin());
    Answer(request, "{}");
}

// A cursor is the name of the last tool of the page before.
void Server::ListTools(const Request& request, const Json& parameters) {
    const Json& cursor = Member(parameters, "cursor");
    if (!cursor.is_null() && !cursor.is_string()) {
        Refuse(request, invalidParameters, "The member 'cursor' is no string");
        return;
    }
    Json page = {{"tools", _tools.Describe(TextMember(parameters, "cursor"), toolsOnAPage)}};
    const std::string last =
        TextMember(page["tools"].empty() ? Json() : page["tools"].back(), "name");
    if (!last.empty() && _tools.HasMoreBehind(last)) {
        page["nextCursor"] = last;
    }
    Answer(request, TextOf(page));
}

void Server::Take(const Request& request, const Json& parameters) {
    const std::string name = TextMember(parameters, "name");
    const Json& arguments = Member(parameters, "arguments");
    const Json& token = Member(Member(parameters, "_meta"), "progressToken");
    const auto command = _tools.Find(name);
    if (!command) {
        Refuse(request, invalidParameters, "Unknown tool: " + name);
    } else if (!arguments.is_null() && !arguments.is_object()) {
        Refuse(request, invalidParameters, "The member 'arguments' is no object");
    } else if (_waiting.size() >= mostWaiting) {
        Refuse(request, internalError, "Too many calls wait for their turn");
    } else {
        ToolCall& call = _waiting.emplace_back();
        call.request = request;
        call.tool = name;
        call.command = command;
        call.arguments = arguments;
        call.progressToken = IsId(token) ? token : Json();
    }
}

void Server::StartCalls() {
    while (!_waiting.empty() && _running.size() < _limits.parallel) {
        _running.push_back(std::move(_waiting.front()));
        _waiting.pop_front();
        ToolCall& call = _running.back();
        try {
            call.call = std::make_unique<Call>([this, &call] {
                return CallTool(_dispatcher, *call.command, call.arguments, _limits.result);
            });
            call.start = Clock::now();
            call.end = call.start + _limits.time;
            call.nextProgress =
                call.progressToken.is_null() ? call.end : call.start + progressInterval;
        } catch (const std::system_error& error) {
            Refuse(call.request, internalError, error.what());
            _running.pop_back();
        }
    }
}

void Server::Attend(ToolCall& call) {
    if (call.isAnswered) {
        return;
    }
    const bool hasEnded = call.call->HasEnded();  // asked first, so that nothing is left unread
    call.call->Read();
    Log(call);
    if (hasEnded) {
        const std::string& text = call.call->Text();
        Answer(call.request,
               text.empty() ? FailedCall("The command died: " + call.call->CauseOfDeath()) : text);
        call.isAnswered = true;
        call.end = Clock::now();
    } else if (Clock::now() >= call.end) {
        Answer(call.request, FailedCall("The command was ended: it ran longer than " +
                                        std::to_string(_limits.time.count()) +
                                        " s, the limit of this server (--timeout)."));
        End(call);
    } else if (Clock::now() >= call.nextProgress) {
        const auto seconds =
            std::chrono::round<std::chrono::seconds>(Clock::now() - call.start).count();
        Notify("notifications/progress",
               {{"progressToken", call.progressToken},
                {"progress", seconds},
                {"message", "Running for " + std::to_string(seconds) + " s"}});
        call.nextProgress += progressInterval;
    }
}

void Server::Log(ToolCall& call) {
    while (call.call->HasLine()) {
        const std::string line =
            WithoutSecrets(call.call->TakeLine(), *call.command, call.arguments);
        if (_logLevel <= levelOfScripts && ++call.logLines <= mostLogLines) {
            const bool isLast = call.logLines == mostLogLines;
            Notify("notifications/message",
                   {{"level", logLevels[levelOfScripts]},
                    {"logger", call.tool},
                    {"data", isLast ? "(more lines follow, and are left out)" : line}});
        }
    }
}

void Server::Cancel(const Json& id) {
    const auto isMeant = [&id](const ToolCall& call) {
        return !call.isAnswered && call.request.id == id;
    };
    for (ToolCall& call : _running) {
        if (isMeant(call)) {
            End(call);
            Drop(call.request);
        }
    }
    std::erase_if(_waiting, [&](const ToolCall& call) {
        const bool isCancelled = isMeant(call);
        if (isCancelled) {
            Drop(call.request);
        }
        return isCancelled;
    });
}

// Its processes have a moment to tidy up; then they are killed.
void Server::End(ToolCall& call) {
    call.call->End();
    call.isAnswered = true;
    call.end = Clock::now() + grace;
}

void Server::EndAll() {
    for (ToolCall& call : _running) {
        call.call->End();
    }
    if (!_running.empty()) {
        poll(nullptr, 0, static_cast<int>(std::chrono::milliseconds(grace).count()));
    }
    _running.clear();
}

void Server::Answer(const Request& request, const std::string& result) {
    Send(request,
         R"({"jsonrpc":"2.0","id":)" + TextOf(request.id) + R"(,"result":)" + result + "}");
}

void Server::Refuse(const Request& request, int code, const std::string& reason) {
    Send(request, TextOf({{"jsonrpc", "2.0"},
                          {"id", request.id},
                          {"error", {{"code", code}, {"message", reason}}}}));
}

void Server::Send(const Request& request, const std::string& answer) {
    if (!request.batch) {
        _output.Add(answer);
        return;
    }
    request.batch->answers += (request.batch->answers.empty() ? "[" : ",") + answer;
    Drop(request);
}

void Server::Drop(const Request& request) {
    if (request.batch) {
        Close(*request.batch);
    }
}

void Server::Close(Batch& batch) {
    if (--batch.open == 0 && !batch.answers.empty()) {
        _output.Add(batch.answers + "]");
    }
}

void Server::Notify(const char* method, const Json& parameters) {
    _output.Add(TextOf({{"jsonrpc", "2.0"}, {"method", method}, {"params", parameters}}));
}
