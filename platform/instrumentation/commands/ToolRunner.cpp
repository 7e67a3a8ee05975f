#include "ToolRunner.h"

#include "Descriptor.h"
#include "ToolProcess.h"

#include <algorithm>
#include <array>
#include <cerrno>
#include <climits>
#include <csignal>
#include <fcntl.h>
#include <optional>
#include <poll.h>
#include <sys/wait.h>

namespace qelo::store {

namespace {

constexpr std::size_t kMostMessage = 2000;
constexpr int kGraceSeconds = 15;

struct Pipe {
    Descriptor reader;
    Descriptor writer;

    bool open() {
        std::array<int, 2> ends{};
        if (::pipe2(ends.data(), O_CLOEXEC) != 0) {
            return false;
        }
        reader = Descriptor(ends[0]);
        writer = Descriptor(ends[1]);
        return true;
    }
};

// The input is put into the pipe as a whole before anybody reads: it fits (PIPE_BUF), so the
// write neither waits nor meets a reader that has gone.
bool fillInput(Pipe& pipe, std::string_view input) {
    if (input.size() > PIPE_BUF || !pipe.open()) {
        return false;
    }
    const ssize_t written =
        input.empty() ? 0 : ::write(pipe.writer.get(), input.data(), input.size());
    pipe.writer.reset();
    return written == static_cast<ssize_t>(input.size());
}

// Blocks every signal while it lives, so that no handler of this process runs in the child.
class SignalsBlocked {
public:
    SignalsBlocked() {
        sigset_t all;
        ::sigfillset(&all);
        ::pthread_sigmask(SIG_SETMASK, &all, &before_);
    }
    ~SignalsBlocked() { ::pthread_sigmask(SIG_SETMASK, &before_, nullptr); }
    SignalsBlocked(const SignalsBlocked&) = delete;
    SignalsBlocked& operator=(const SignalsBlocked&) = delete;

private:
    sigset_t before_{};
};

std::vector<char*> argumentVector(const ToolCall& call) {
    std::vector<char*> vector{const_cast<char*>(call.program.c_str())};
    for (const std::string& argument : call.arguments) {
        vector.push_back(const_cast<char*>(argument.c_str()));
    }
    vector.push_back(nullptr);
    return vector;
}

pid_t forkSupervisor(const ToolCall& call, const Pipe& input, const Pipe& error,
                     const Pipe& report) {
    static char path[] = "PATH=/usr/sbin:/usr/bin:/sbin:/bin";
    static char language[] = "LC_ALL=C";
    static char* const environment[] = {path, language, nullptr};
    const std::vector<char*> arguments = argumentVector(call);
    const ToolProcess process{call.program.c_str(), arguments.data(),   environment,
                              input.reader.get(),   error.writer.get(), report.writer.get(),
                              call.limit.count()};
    const SignalsBlocked blocked;
    const pid_t child = ::fork();
    if (child == 0) {
        superviseTool(process);
    }
    return child;
}

// Reads what is there; false at the end of the stream.
bool takeMessage(int error, std::string& message) {
    std::array<char, 512> buffer{};
    const ssize_t count = TEMP_FAILURE_RETRY(::read(error, buffer.data(), buffer.size()));
    if (count <= 0) {
        return false;
    }
    const std::size_t room = kMostMessage - std::min(message.size(), kMostMessage);
    message.append(buffer.data(), std::min(room, static_cast<std::size_t>(count)));
    return true;
}

std::optional<ToolReport> readReport(int report) {
    ToolReport record{};
    if (TEMP_FAILURE_RETRY(::read(report, &record, sizeof record)) != sizeof record) {
        return {};
    }
    return record;
}

// Collects the tool's message until its report comes. The report, not the end of the message
// stream, is the end: a process that the tool left behind may hold the stream open.
// `child` is killed when it keeps silent beyond all limits. It is not when its report stream
// ends without a report, since then it is gone and its number may be another process's.
std::optional<ToolReport> follow(pid_t child, const Pipe& error, const Pipe& report,
                                 std::chrono::seconds limit, std::string& message) {
    const auto end = std::chrono::steady_clock::now() + limit + std::chrono::seconds(kGraceSeconds);
    std::array<pollfd, 2> watched{
        {{report.reader.get(), POLLIN, 0}, {error.reader.get(), POLLIN, 0}}};
    while (std::chrono::steady_clock::now() < end) {
        if (::poll(watched.data(), watched.size(), 1000) < 0) {
            continue;
        }
        if (watched[1].revents != 0 && !takeMessage(error.reader.get(), message)) {
            watched[1].fd = -1;
            watched[1].revents = 0;
        }
        if (watched[0].revents != 0 && watched[1].revents == 0) {
            return readReport(report.reader.get());
        }
    }
    ::kill(child, SIGKILL);
    return {};
}

ToolResult::End endOf(ToolReport::Kind kind) {
    switch (kind) {
    case ToolReport::kExited:
        return ToolResult::End::Exited;
    case ToolReport::kTimedOut:
        return ToolResult::End::TimedOut;
    case ToolReport::kNotStarted:
        return ToolResult::End::NotStarted;
    case ToolReport::kKilled:
        break;
    }
    return ToolResult::End::Killed;
}

void reap(pid_t child) {
    int status = 0;
    while (::waitpid(child, &status, 0) < 0 && errno == EINTR) {
    }
}

class SystemToolRunner : public ToolRunner {
public:
    ToolResult run(const ToolCall& call) override {
        ToolResult result;
        Pipe input;
        Pipe error;
        Pipe report;
        if (!fillInput(input, call.input.view()) || !error.open() || !report.open()) {
            return result;
        }
        const pid_t child = forkSupervisor(call, input, error, report);
        if (child < 0) {
            return result;
        }
        input.reader.reset();
        error.writer.reset();
        report.writer.reset();
        const std::optional<ToolReport> ended =
            follow(child, error, report, call.limit, result.message);
        reap(child);
        result.end = ended ? endOf(ended->kind) : ToolResult::End::Killed;
        result.code = ended ? ended->code : 0;
        return result;
    }
};

} // namespace

ToolRunner& systemTools() {
    static SystemToolRunner tools;
    return tools;
}

} // namespace qelo::store
