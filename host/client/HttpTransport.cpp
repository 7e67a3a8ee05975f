#include "HttpTransport.h"

#include "AnswerHead.h"
#include "Connection.h"
#include "Unreachable.h"

#include <curl/curl.h>

#include <array>
#include <chrono>
#include <exception>
#include <new>
#include <stdexcept>
#include <utility>

namespace qelo::client {
namespace {

constexpr unsigned int kFailed = 1;

struct Free {
    void operator()(CURL* handle) const { curl_easy_cleanup(handle); }
    void operator()(curl_slist* list) const { curl_slist_free_all(list); }
    void operator()(char* text) const { curl_free(text); }
};
using Handle = std::unique_ptr<CURL, Free>;
using Fields = std::unique_ptr<curl_slist, Free>;

// The library's own preparation, once, before anybody uses it.
void prepareLibrary() {
    static const CURLcode result = curl_global_init(CURL_GLOBAL_DEFAULT);
    if (result != CURLE_OK) {
        throw std::runtime_error(curl_easy_strerror(result));
    }
}

template <class Value> void set(const Handle& handle, CURLoption option, Value value) {
    const CURLcode result = curl_easy_setopt(handle.get(), option, value);
    if (result == CURLE_OUT_OF_MEMORY) {
        throw std::bad_alloc();
    }
    if (result != CURLE_OK) {
        throw std::runtime_error(curl_easy_strerror(result));
    }
}

std::string percentEncoded(const Handle& handle, const std::string& text) {
    const std::unique_ptr<char, Free> encoded(
        curl_easy_escape(handle.get(), text.data(), static_cast<int>(text.size())));
    if (!encoded) {
        throw std::bad_alloc();
    }
    return encoded.get();
}

void addField(Fields& fields, const std::string& line) {
    curl_slist* longer = curl_slist_append(fields.get(), line.c_str());
    if (longer == nullptr) {
        throw std::bad_alloc();
    }
    [[maybe_unused]] auto* same = fields.release();
    fields.reset(longer);
}

bool isUnreachable(CURLcode code) {
    switch (code) {
    case CURLE_COULDNT_RESOLVE_HOST:
    case CURLE_COULDNT_CONNECT:
    case CURLE_SSL_CONNECT_ERROR:
    case CURLE_PEER_FAILED_VERIFICATION:
    case CURLE_SSL_CACERT_BADFILE:
    case CURLE_SSL_CERTPROBLEM:
    case CURLE_SSL_CIPHER:
    case CURLE_SSL_ISSUER_ERROR:
        return true;
    default:
        return false;
    }
}

using Clock = std::chrono::steady_clock;

// Whether the request is on its way: there is a connection, and TLS is agreed upon.
bool isConnected(CURL* handle) {
    double seconds = 0;
    return curl_easy_getinfo(handle, CURLINFO_PRETRANSFER_TIME, &seconds) == CURLE_OK &&
           seconds > 0;
}

// What goes on during one request.
struct Exchange {
    CURL* handle;
    const std::string& server;
    const std::function<void(std::string_view)>& take;
    std::chrono::seconds idleTimeout;
    AnswerHead head;
    std::exception_ptr failure;
    bool answered = false; // a byte of the answer's head arrived
    bool idle = false;     // given up because nothing moved
    curl_off_t moved = 0;  // bytes of both bodies
    Clock::time_point lastMove = Clock::now();
};

// Called by the C library: nothing may be thrown through its frames.
std::size_t takeHead(char* text, std::size_t, std::size_t size, void* user) {
    auto& exchange = *static_cast<Exchange*>(user);
    try {
        exchange.answered = true;
        exchange.lastMove = Clock::now();
        exchange.head.addLine(std::string_view(text, size));
        return size;
    } catch (...) {
        exchange.failure = std::current_exception();
        return 0;
    }
}

std::size_t takeBody(char* text, std::size_t, std::size_t size, void* user) {
    auto& exchange = *static_cast<Exchange*>(user);
    try {
        exchange.head.requireSuccess(exchange.server);
        exchange.take(std::string_view(text, size));
        exchange.lastMove = Clock::now(); // however long that took
        return size;
    } catch (...) {
        exchange.failure = std::current_exception();
        return CURL_WRITEFUNC_ERROR;
    }
}

// Called about once a second. The library's own limit on speed takes the average of several
// seconds and is late by as many.
int watch(void* user, curl_off_t, curl_off_t received, curl_off_t, curl_off_t sent) {
    auto& exchange = *static_cast<Exchange*>(user);
    const Clock::time_point now = Clock::now();
    if (received + sent != exchange.moved || !isConnected(exchange.handle)) {
        exchange.moved = received + sent;
        exchange.lastMove = now;
    }
    exchange.idle = now - exchange.lastMove >= exchange.idleTimeout;
    return exchange.idle ? 1 : 0;
}

} // namespace

class HttpTransport::Impl {
public:
    explicit Impl(HttpOptions options) : options_(std::move(options)) {
        prepareLibrary();
        server_ = options_.server.text();
        handle_.reset(curl_easy_init());
        if (!handle_) {
            throw std::bad_alloc();
        }
        setTarget();
        setLimits();
        setTrust();
        setUser();
    }

    void post(const HttpRequest& request, const std::function<void(std::string_view)>& take) {
        Exchange exchange = {handle_.get(), server_, take, options_.idleTimeout, {}, {}};
        const Fields fields = fieldsOf(request);
        set(handle_, CURLOPT_HTTPHEADER, fields.get());
        set(handle_, CURLOPT_POSTFIELDSIZE_LARGE, static_cast<curl_off_t>(request.body.size()));
        set(handle_, CURLOPT_POSTFIELDS, request.body.data());
        set(handle_, CURLOPT_FRESH_CONNECT, request.repeatable ? 0L : 1L);
        set(handle_, CURLOPT_HEADERDATA, &exchange);
        set(handle_, CURLOPT_WRITEDATA, &exchange);
        set(handle_, CURLOPT_XFERINFODATA, &exchange);
        message_.front() = '\0';
        const CURLcode code = curl_easy_perform(handle_.get());
        if (exchange.failure) {
            std::rethrow_exception(exchange.failure);
        }
        if (code != CURLE_OK) {
            fail(code, exchange);
        }
        exchange.head.requireSuccess(server_);
        exchange.head.requireNoLateError();
    }

private:
    void setTarget() {
        set(handle_, CURLOPT_URL, (server_ + "/cimom").c_str());
        set(handle_, CURLOPT_PROTOCOLS_STR, options_.server.tls ? "https" : "http");
        set(handle_, CURLOPT_HTTP_VERSION, static_cast<long>(CURL_HTTP_VERSION_1_1));
        set(handle_, CURLOPT_FOLLOWLOCATION, 0L);
        set(handle_, CURLOPT_PROXY, ""); // whatever the environment says
        set(handle_, CURLOPT_POST, 1L);
        set(handle_, CURLOPT_HEADERFUNCTION, takeHead);
        set(handle_, CURLOPT_WRITEFUNCTION, takeBody);
        set(handle_, CURLOPT_ERRORBUFFER, message_.data());
    }

    void setLimits() {
        set(handle_, CURLOPT_NOSIGNAL, 1L);
        set(handle_, CURLOPT_CONNECTTIMEOUT, static_cast<long>(options_.connectTimeout.count()));
        set(handle_, CURLOPT_NOPROGRESS, 0L);
        set(handle_, CURLOPT_XFERINFOFUNCTION, watch);
    }

    void setTrust() {
        set(handle_, CURLOPT_SSL_VERIFYPEER, options_.insecure ? 0L : 1L);
        set(handle_, CURLOPT_SSL_VERIFYHOST, options_.insecure ? 0L : 2L);
        if (!options_.caCertificate.empty()) {
            set(handle_, CURLOPT_CAINFO, options_.caCertificate.c_str());
        }
    }

    void setUser() {
        if (options_.server.user.empty()) {
            return;
        }
        set(handle_, CURLOPT_HTTPAUTH, static_cast<long>(CURLAUTH_BASIC));
        set(handle_, CURLOPT_USERNAME, options_.server.user.c_str());
        set(handle_, CURLOPT_PASSWORD, options_.server.password.value_or("").c_str());
    }

    Fields fieldsOf(const HttpRequest& request) const {
        Fields fields;
        addField(fields, "Content-Type: application/xml; charset=\"utf-8\"");
        addField(fields, "Accept: application/xml, text/xml");
        addField(fields, "Expect:"); // the body is sent at once
        addField(fields, "CIMProtocolVersion: 1.0");
        addField(fields, "CIMOperation: MethodCall");
        addField(fields, "CIMMethod: " + percentEncoded(handle_, request.method));
        addField(fields, "CIMObject: " + percentEncoded(handle_, request.object));
        return fields;
    }

    [[noreturn]] void fail(CURLcode code, const Exchange& exchange) const {
        const std::string reason =
            message_.front() != '\0' ? message_.data() : curl_easy_strerror(code);
        if (code == CURLE_SSL_CACERT_BADFILE && !options_.caCertificate.empty()) {
            throw Unreachable("cannot use the certificates in " + options_.caCertificate);
        }
        if (isUnreachable(code) ||
            (code == CURLE_OPERATION_TIMEDOUT && !isConnected(handle_.get()))) {
            throw Unreachable("cannot reach " + server_ + ": " + reason);
        }
        exchange.head.requireNoLateError();
        if (exchange.idle) {
            throw CimError(kFailed, server_ + " sent nothing for " +
                                        std::to_string(options_.idleTimeout.count()) + " seconds");
        }
        throw CimError(kFailed, (exchange.answered ? "the answer of " + server_ + " is cut short: "
                                                   : "no answer from " + server_ + ": ") +
                                    reason);
    }

    HttpOptions options_;
    std::string server_;
    std::array<char, CURL_ERROR_SIZE> message_ = {};
    Handle handle_; // goes before the buffer that it writes to
};

HttpTransport::HttpTransport(HttpOptions options)
    : impl_(std::make_unique<Impl>(std::move(options))) {}
HttpTransport::~HttpTransport() = default;

void HttpTransport::post(const HttpRequest& request,
                         const std::function<void(std::string_view piece)>& take) {
    impl_->post(request, take);
}

} // namespace qelo::client
