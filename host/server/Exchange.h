// One request and its answer, between the threads that serve connections and those that
// check passwords and run operations. A connection that waits for one of the latter is
// suspended, so only one thread at a time works on an exchange.
#pragma once

#include "Refusal.h"
#include "RequestHeaders.h"
#include "ResponseStream.h"
#include "ServerState.h"

#include <cimxml/Request.h>
#include <microhttpd.h>
#include <secrecy/Forget.h>

#include <memory>
#include <string>

namespace qelo::server {

class Exchange : public std::enable_shared_from_this<Exchange> {
public:
    Exchange(ServerState& server, MHD_Connection* connection);
    ~Exchange();
    Exchange(const Exchange&) = delete;
    Exchange& operator=(const Exchange&) = delete;

    // The header is there.
    MHD_Result begin(const std::string& method, const std::string& path);
    // A piece of the body, or (size 0) its end. Also called when a suspended connection goes
    // on.
    MHD_Result proceed(const char* data, std::size_t* size);
    // The connection has nothing more to do with this exchange.
    void abandon();

private:
    enum class Phase { Header, Login, Body, Refused, Running, Answered };

    HeaderLookup headerLookup() const;
    HttpRefusal checkHeader(const std::string& method, const std::string& path) const;
    void login();
    void checkPassword(const std::string& user, const std::string& password);
    void resume();
    MHD_Result refuse(HttpRefusal refusal);
    MHD_Result continueAfterLogin();
    MHD_Result takeBody(const char* data, std::size_t size);
    void startOperation();
    void runOperation();
    secrecy::Forgotten<const cimxml::Request> parsedBody() const;
    void answer(const AnswerSink& sink);
    MHD_Result sendAnswer();
    MHD_Result sendRefusal();
    MHD_Result send(unsigned int status, MHD_Response* response);
    void addAnswerHeaders(MHD_Response* response) const;
    MHD_Response* wholeAnswer();
    MHD_Response* streamedAnswer();
    static ssize_t readAnswer(void* exchange, std::uint64_t position, char* buffer,
                              std::size_t size);
    static void dropAnswer(void* exchange);
    int socket() const;
    bool clientHasGone() const;
    HttpRefusal checkSingleHeaders() const;
    void dropBody();

    ServerState& server_;
    MHD_Connection* const connection_;
    Phase phase_ = Phase::Header;
    HttpRefusal refusal_;
    bool bodyIsSmall_ = false; // worth reading to its end before it is refused
    std::string user_;
    std::string body_;
    std::size_t discarded_ = 0;
    std::size_t answered_ = 0; // bytes that the operation has written
    std::size_t sinceAllowance_ = 0;
    bool paused_ = false; // in the middle of an answer, for want of more of it
    std::shared_ptr<ResponseStream> stream_;
};

} // namespace qelo::server
