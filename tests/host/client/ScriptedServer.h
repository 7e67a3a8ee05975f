// A HTTP server on a loopback port that answers what it was told to, byte for byte, and
// remembers what it was asked.
#pragma once

#include <functional>
#include <mutex>
#include <string>
#include <thread>
#include <vector>

namespace qelo::client {

struct SeenRequest {
    std::string head; // with the empty line behind it
    std::string body;
    int connection = 0; // 1 for the first one

    // The value of a field, or "(none)".
    std::string field(const std::string& name) const;
};

// What to send, and whether the connection stays open afterwards.
struct ScriptedAnswer {
    std::string bytes;
    bool close = false;
    int delayMilliseconds = 0; // before the bytes
};

class ScriptedServer {
public:
    using Script = std::function<ScriptedAnswer(const SeenRequest&)>;

    explicit ScriptedServer(Script script);
    ~ScriptedServer();
    ScriptedServer(const ScriptedServer&) = delete;
    ScriptedServer& operator=(const ScriptedServer&) = delete;

    int port() const { return port_; }
    std::vector<SeenRequest> requests() const;

private:
    void run();
    void serve(int socket, int number);

    Script script_;
    int listener_ = -1;
    int port_ = 0;
    int stop_[2] = {-1, -1}; // a pipe; closed to end everything
    mutable std::mutex mutex_;
    std::vector<SeenRequest> requests_;
    std::thread thread_;
};

// A whole answer with status 200 and that body.
ScriptedAnswer xmlAnswer(const std::string& body);

// A port on which nobody listens.
int deadPort();

} // namespace qelo::client
