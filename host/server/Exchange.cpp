#include "Exchange.h"

#include <secrecy/Forget.h>

#include <cstdlib>
#include <cstring>
#include <malloc.h>
#include <new>
#include <poll.h>
#include <strings.h>
#include <utility>

namespace qelo::server {
namespace {

constexpr unsigned int kOk = 200;
constexpr unsigned int kBadRequest = 400;
constexpr unsigned int kUnauthorized = 401;
constexpr unsigned int kTooLarge = 413;
constexpr unsigned int kHeaderTooLarge = 431;
constexpr unsigned int kInternalError = 500;
constexpr unsigned int kUnavailable = 503;

constexpr char kXml[] = "application/xml; charset=\"utf-8\"";
constexpr char kRealm[] = "Basic realm=\"qelosim\"";

// A refused body up to this is read to its end, so that the client gets to see the answer
// and may go on; for a larger one the connection is closed.
constexpr std::size_t kReadInSpite = 64UL * 1024;

// Providers make an answer of this size out of memory that is worth giving back.
constexpr std::size_t kLargeAnswer = 8UL * 1024 * 1024;

constexpr std::size_t kAnswerBlock = 32UL * 1024;
// The time that a client has for each piece of an answer.
constexpr auto kPieceTime = std::chrono::seconds(30);

// What libmicrohttpd gives is freed by free(), passwords wiped before.
struct FreeSecret {
    void operator()(char* text) const {
        if (text != nullptr) {
            explicit_bzero(text, std::strlen(text));
            std::free(text);
        }
    }
};
using Secret = std::unique_ptr<char, FreeSecret>;

// A copy that is wiped when it goes.
class SecretText {
public:
    explicit SecretText(const char* text) : text_(text) {}
    ~SecretText() { explicit_bzero(text_.data(), text_.size()); }
    SecretText(const SecretText&) = delete;
    SecretText& operator=(const SecretText&) = delete;
    const std::string& text() const { return text_; }

private:
    std::string text_;
};

// Whether a request gives values that are stored: those of methods and of instances. All others
// are spared the wiping, since their answers may be large.
bool mayHoldPassword(const cimxml::Request& request) {
    const auto begins = [&request](const char* beginning) {
        return strncasecmp(request.method.c_str(), beginning, std::strlen(beginning)) == 0;
    };
    const bool reads =
        begins("Get") || begins("Enumerate") || begins("Associator") || begins("Reference");
    return request.extrinsic || !reads;
}

void addHeader(MHD_Response* response, const char* name, const std::string& value) {
    MHD_add_response_header(response, name, value.c_str());
}

MHD_Response* copied(const std::string& text) {
    // The library copies: it does not write to the text in spite of its type.
    return MHD_create_response_from_buffer(text.size(), const_cast<char*>(text.data()),
                                           MHD_RESPMEM_MUST_COPY);
}

} // namespace

Exchange::Exchange(ServerState& server, MHD_Connection* connection)
    : server_(server), connection_(connection) {}

Exchange::~Exchange() { dropBody(); }

HeaderLookup Exchange::headerLookup() const {
    return [this](const char* name) -> std::optional<std::string> {
        const char* const value = MHD_lookup_connection_value(connection_, MHD_HEADER_KIND, name);
        return value == nullptr ? std::nullopt : std::make_optional(std::string(value));
    };
}

HttpRefusal Exchange::checkHeader(const std::string& method, const std::string& path) const {
    const auto* const size =
        MHD_get_connection_info(connection_, MHD_CONNECTION_INFO_REQUEST_HEADER_SIZE);
    if (size != nullptr && size->header_size > server_.options.limits.header) {
        return {kHeaderTooLarge, "the header is too large", ""};
    }
    if (server_.stopping) {
        return {kUnavailable, "the server is shutting down", ""};
    }
    const HttpRefusal repeated = checkSingleHeaders();
    return repeated ? repeated
                    : checkRequestHeader(method, path, headerLookup(), server_.options.limits.body);
}

// What stands between here and the client may go by another of two values than we do.
HttpRefusal Exchange::checkSingleHeaders() const {
    struct Count {
        const char* name;
        int found;
    };
    for (const char* const name : {"CIMOperation", "CIMMethod", "CIMObject", "CIMProtocolVersion",
                                   "Content-Type", "Content-Length", "Authorization"}) {
        Count count = {name, 0};
        const auto look = [](void* data, MHD_ValueKind, const char* key,
                             const char*) -> MHD_Result {
            auto& counted = *static_cast<Count*>(data);
            counted.found += cim::sameName(key, counted.name) ? 1 : 0;
            return MHD_YES;
        };
        MHD_get_connection_values(connection_, MHD_HEADER_KIND, look, &count);
        if (count.found > 1) {
            return {kBadRequest, std::string(name) + " is given twice", ""};
        }
    }
    const auto header = headerLookup();
    if (header("Content-Length") && header("Transfer-Encoding")) {
        return {kBadRequest, "both Content-Length and Transfer-Encoding are given", ""};
    }
    return {};
}

MHD_Result Exchange::begin(const std::string& method, const std::string& path) {
    const auto length = headerLookup()("Content-Length");
    bodyIsSmall_ =
        length && length->size() <= 5 && std::strtoul(length->c_str(), nullptr, 10) <= kReadInSpite;
    const HttpRefusal problem = checkHeader(method, path);
    // Whoever has not logged in learns nothing beyond that.
    if (problem && (!server_.options.passwords || problem.status == kHeaderTooLarge)) {
        return refuse(problem);
    }
    refusal_ = problem;
    if (server_.options.passwords) {
        secrecy::forget([this] { login(); });
    } else {
        phase_ = Phase::Body;
    }
    return phase_ == Phase::Login ? MHD_YES : continueAfterLogin();
}

// Leaves the phase Login when the answer takes another thread, Header otherwise.
void Exchange::login() {
    char* givenPassword = nullptr;
    const Secret user(MHD_basic_auth_get_username_password(connection_, &givenPassword));
    const Secret password(givenPassword);
    if (!user || !password || *user == '\0') {
        refusal_ = {kUnauthorized, "user and password are required", ""};
        return;
    }
    user_ = user.get();
    const auto secret = std::make_shared<SecretText>(password.get());
    if (server_.logins.knows(user_, secret->text())) {
        return;
    }
    phase_ = Phase::Login;
    MHD_suspend_connection(connection_);
    const auto self = shared_from_this();
    if (!server_.loginPool.submit([self, secret] {
            secrecy::forget([&] { self->checkPassword(self->user_, secret->text()); });
        })) {
        refusal_ = {kUnavailable, "too many requests", ""};
        resume();
    }
}

// In a thread of the login pool.
void Exchange::checkPassword(const std::string& user, const std::string& password) {
    try {
        if (server_.options.passwords->check(user, password)) {
            server_.logins.remember(user, password);
            resume();
            return;
        }
        server_.log("login of \"" + user + "\" failed");
    } catch (const std::exception& error) {
        server_.log("the password of \"" + user + "\" cannot be checked: " + error.what());
    }
    refusal_ = {kUnauthorized, "unknown user or wrong password", ""};
    // Slows down guessing without keeping a thread busy.
    const auto self = shared_from_this();
    server_.timers.after(server_.options.limits.failedLogin, [self] { self->resume(); });
}

void Exchange::resume() { MHD_resume_connection(connection_); }

MHD_Result Exchange::continueAfterLogin() {
    phase_ = Phase::Body;
    return refusal_ ? refuse(refusal_) : MHD_YES;
}

MHD_Result Exchange::refuse(HttpRefusal refusal) {
    refusal_ = std::move(refusal);
    phase_ = Phase::Refused;
    return bodyIsSmall_ ? MHD_YES : sendRefusal();
}

MHD_Result Exchange::proceed(const char* data, std::size_t* size) {
    if (phase_ == Phase::Login) {
        // The header is looked at again after the wait; the body has not begun.
        return continueAfterLogin();
    }
    if (*size > 0) {
        const std::size_t got = std::exchange(*size, 0);
        return takeBody(data, got);
    }
    switch (phase_) {
    case Phase::Body:
        startOperation();
        return MHD_YES;
    case Phase::Refused:
        return sendRefusal();
    case Phase::Running:
        return sendAnswer();
    default:
        return MHD_YES;
    }
}

// The header may not tell how long the body is. Nothing can be answered in the middle of one,
// so a bit more than the limit is read before the connection is closed.
MHD_Result Exchange::takeBody(const char* data, std::size_t size) {
    const ServerLimits& limits = server_.options.limits;
    if (phase_ != Phase::Body) {
        discarded_ += size;
        return discarded_ > limits.body ? MHD_NO : MHD_YES;
    }
    if (body_.size() + size > limits.body) {
        refusal_ = {kTooLarge, "the body is too large", ""};
    } else if (!server_.bodies.take(size)) {
        refusal_ = {kUnavailable, "too many requests", ""};
    } else {
        // Each time it grows it leaves a smaller copy of itself.
        secrecy::forget([&] { body_.append(data, size); });
        return MHD_YES;
    }
    phase_ = Phase::Refused;
    dropBody();
    return MHD_YES;
}

void Exchange::dropBody() {
    server_.bodies.giveBack(body_.size());
    explicit_bzero(body_.data(), body_.size()); // it may hold a password
    body_.clear();
    body_.shrink_to_fit();
}

void Exchange::startOperation() {
    phase_ = Phase::Running;
    server_.watch.allowForEver(socket());
    const std::weak_ptr<Exchange> weak = weak_from_this();
    stream_ = std::make_shared<ResponseStream>(server_.spill, ResponseStream::Limits(), [weak] {
        if (const auto self = weak.lock()) {
            self->resume();
        }
    });
    MHD_suspend_connection(connection_);
    const auto self = shared_from_this();
    if (server_.stopping || !server_.workers.submit([self] { self->runOperation(); })) {
        refusal_ = {kUnavailable, "too many requests", ""};
        stream_->finish();
    }
}

// A connection that waits is not looked at by the library. A client that has only finished
// sending may still want its answer.
bool Exchange::clientHasGone() const {
    pollfd item = {socket(), 0, 0};
    return poll(&item, 1, 0) == 1 && (item.revents & (POLLHUP | POLLERR)) != 0;
}

// In a worker thread.
void Exchange::runOperation() {
    if (clientHasGone()) {
        dropBody();
        stream_->fail();
        return;
    }
    const AnswerSink sink = {[this](std::string_view piece) {
                                 answered_ += piece.size();
                                 stream_->write(piece);
                             },
                             [this] { return stream_->restart(); }};
    try {
        answer(sink);
        dropBody();
        stream_->finish();
        if (answered_ > kLargeAnswer) {
            malloc_trim(0);
        }
        return;
    } catch (const ResponseAbandoned&) {
        // The client knows.
    } catch (const std::exception& error) {
        server_.log(std::string("an answer was cut short: ") + error.what());
        if (stream_->restart()) {
            refusal_ = {kInternalError, "internal error", ""};
        }
    } catch (...) {
        server_.log("an answer was cut short: unknown error");
        if (stream_->restart()) {
            refusal_ = {kInternalError, "internal error", ""};
        }
    }
    dropBody();
    stream_->fail();
}

secrecy::Forgotten<const cimxml::Request> Exchange::parsedBody() const {
    secrecy::Forgotten<const cimxml::Request> request;
    secrecy::forget([&] { request.reset(new cimxml::Request(cimxml::parseRequest(body_))); });
    return request;
}

void Exchange::answer(const AnswerSink& sink) {
    try {
        const auto request = parsedBody();
        refusal_ = checkHeaderMatch(*request, headerLookup());
        if (refusal_) {
            return;
        }
        broker::OperationContext context;
        context.principal = user_;
        const auto header = headerLookup();
        context.acceptLanguage = header("Accept-Language").value_or("");
        context.contentLanguage = header("Content-Language").value_or("");
        const auto run = [&] { server_.operations->run(*request, context, sink); };
        if (mayHoldPassword(*request)) {
            secrecy::forget(run);
        } else {
            run();
        }
    } catch (const cimxml::RequestError& error) {
        refusal_ = {error.httpStatus(), error.what(), error.cimError()};
    }
}

MHD_Result Exchange::sendAnswer() {
    if (refusal_) {
        return sendRefusal();
    }
    server_.watch.allow(socket(), kPieceTime);
    sinceAllowance_ = 0;
    MHD_Response* const response = stream_->isWhole() ? wholeAnswer() : streamedAnswer();
    if (response == nullptr) {
        return MHD_NO;
    }
    addAnswerHeaders(response);
    return send(kOk, response);
}

MHD_Response* Exchange::wholeAnswer() { return copied(stream_->takeAll()); }

MHD_Response* Exchange::streamedAnswer() {
    auto holder = std::make_unique<std::shared_ptr<Exchange>>(shared_from_this());
    MHD_Response* const response = MHD_create_response_from_callback(
        MHD_SIZE_UNKNOWN, kAnswerBlock, readAnswer, holder.get(), dropAnswer);
    if (response != nullptr) {
        (void)holder.release(); // dropAnswer() has it now
    }
    return response;
}

ssize_t Exchange::readAnswer(void* exchange, std::uint64_t, char* buffer, std::size_t size) {
    Exchange& self = **static_cast<std::shared_ptr<Exchange>*>(exchange);
    // Waiting for the provider is not the client's fault.
    const auto pause = [&self] {
        self.paused_ = true;
        self.server_.watch.allowForEver(self.socket());
        MHD_suspend_connection(self.connection_);
    };
    if (std::exchange(self.paused_, false)) {
        self.sinceAllowance_ = 0;
        self.server_.watch.allow(self.socket(), kPieceTime);
    }
    const ssize_t got = self.stream_->read(buffer, size, pause, [&self] { self.resume(); });
    if (got > 0) {
        // A client that goes on taking may go on.
        self.sinceAllowance_ += static_cast<std::size_t>(got);
        const std::size_t piece =
            self.server_.options.limits.answerRate * static_cast<std::size_t>(kPieceTime.count());
        if (self.sinceAllowance_ >= piece) {
            self.sinceAllowance_ = 0;
            self.server_.watch.allow(self.socket(), kPieceTime);
        }
        return got;
    }
    if (got == ResponseStream::endOfStream) {
        return MHD_CONTENT_READER_END_OF_STREAM;
    }
    return got == 0 ? 0 : MHD_CONTENT_READER_END_WITH_ERROR;
}

void Exchange::dropAnswer(void* exchange) {
    delete static_cast<std::shared_ptr<Exchange>*>(exchange);
}

void Exchange::addAnswerHeaders(MHD_Response* response) const {
    addHeader(response, "Content-Type", kXml);
    addHeader(response, "CIMOperation", "MethodResponse");
    addHeader(response, "Cache-Control", "no-cache");
}

MHD_Result Exchange::sendRefusal() {
    MHD_Response* const response = copied(refusal_.text + "\n");
    if (response == nullptr) {
        return MHD_NO;
    }
    addHeader(response, "Content-Type", "text/plain; charset=\"utf-8\"");
    if (refusal_.status == kUnauthorized) {
        addHeader(response, "WWW-Authenticate", kRealm);
    }
    if (refusal_.status == MHD_HTTP_METHOD_NOT_ALLOWED) {
        addHeader(response, "Allow", "POST");
    }
    if (refusal_.status == kUnavailable) {
        addHeader(response, "Retry-After", "5");
    }
    if (!refusal_.cimError.empty()) {
        addHeader(response, "CIMError", refusal_.cimError);
    }
    return send(refusal_.status, response);
}

MHD_Result Exchange::send(unsigned int status, MHD_Response* response) {
    phase_ = Phase::Answered;
    const MHD_Result result = MHD_queue_response(connection_, status, response);
    MHD_destroy_response(response);
    return result;
}

int Exchange::socket() const {
    const auto* const info =
        MHD_get_connection_info(connection_, MHD_CONNECTION_INFO_CONNECTION_FD);
    return info == nullptr ? -1 : info->connect_fd;
}

void Exchange::abandon() {
    if (stream_) {
        stream_->cancel();
    }
}

} // namespace qelo::server
