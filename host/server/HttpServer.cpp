#include "HttpServer.h"

#include "Exchange.h"
#include "ServerState.h"

#include <gnutls/gnutls.h>
#include <microhttpd.h>
#include <secrecy/Forget.h>

#include <algorithm>
#include <arpa/inet.h>
#include <cstring>
#include <malloc.h>
#include <mutex>
#include <netinet/in.h>
#include <stdexcept>
#include <sys/resource.h>
#include <thread>
#include <utility>
#include <vector>

namespace qelo::server {
namespace {

// Room for a connection's header and for the piece of an answer that is being sent.
constexpr std::size_t kConnectionMemory = 64UL * 1024;
constexpr unsigned int kConnectionThreads = 2;
constexpr auto kWatchPeriod = std::chrono::seconds(1);
// Connections end, and free what they had, a while after their last request.
constexpr unsigned int kTrims = 5;
constexpr auto kGrace = std::chrono::seconds(5);

struct SocketAddress {
    sockaddr_storage storage = {};
    bool ipv6 = false;
};

SocketAddress socketAddress(const std::string& address, std::uint16_t port) {
    SocketAddress result;
    sockaddr_in v4 = {};
    sockaddr_in6 v6 = {};
    if (inet_pton(AF_INET, address.c_str(), &v4.sin_addr) == 1) {
        v4.sin_family = AF_INET;
        v4.sin_port = htons(port);
        std::memcpy(&result.storage, &v4, sizeof v4);
        return result;
    }
    if (inet_pton(AF_INET6, address.c_str(), &v6.sin6_addr) == 1) {
        v6.sin6_family = AF_INET6;
        v6.sin6_port = htons(port);
        std::memcpy(&result.storage, &v6, sizeof v6);
        result.ipv6 = true;
        return result;
    }
    throw std::runtime_error("\"" + address + "\" is no numeric IPv4 or IPv6 address");
}

// Connections, files of the providers and the files that answers wait in.
void raiseDescriptorLimit(unsigned int connections) {
    const rlim_t wanted = static_cast<rlim_t>(connections) * 2 + 256;
    rlimit limit = {};
    if (getrlimit(RLIMIT_NOFILE, &limit) == 0 && limit.rlim_cur < wanted) {
        limit.rlim_cur = std::min(wanted, limit.rlim_max);
        setrlimit(RLIMIT_NOFILE, &limit); // with fewer, connections wait
    }
}

} // namespace

void ExchangeList::add(const std::shared_ptr<Exchange>& exchange) {
    const std::lock_guard<std::mutex> lock(mutex_);
    exchanges_.insert(exchange);
    ++added_;
}

void ExchangeList::remove(const std::shared_ptr<Exchange>& exchange) {
    const std::lock_guard<std::mutex> lock(mutex_);
    exchanges_.erase(exchange);
}

std::set<std::shared_ptr<Exchange>> ExchangeList::all() const {
    const std::lock_guard<std::mutex> lock(mutex_);
    return exchanges_;
}

std::optional<std::size_t> ExchangeList::countWhenIdle() const {
    const std::lock_guard<std::mutex> lock(mutex_);
    return exchanges_.empty() ? std::optional(added_) : std::nullopt;
}

bool isLoopback(const std::string& address) {
    const SocketAddress parsed = socketAddress(address, 0);
    if (parsed.ipv6) {
        sockaddr_in6 v6 = {};
        std::memcpy(&v6, &parsed.storage, sizeof v6);
        return IN6_IS_ADDR_LOOPBACK(&v6.sin6_addr);
    }
    sockaddr_in v4 = {};
    std::memcpy(&v4, &parsed.storage, sizeof v4);
    return (ntohl(v4.sin_addr.s_addr) >> 24U) == 127;
}

class HttpServer::Impl {
public:
    Impl(ServerOptions options, std::shared_ptr<const Operations> operations);
    ~Impl();

    std::uint16_t port() const;

private:
    static MHD_Result handle(void* self, MHD_Connection* connection, const char* url,
                             const char* method, const char* version, const char* data,
                             std::size_t* size, void** exchange);
    static void completed(void* self, MHD_Connection* connection, void** exchange,
                          MHD_RequestTerminationCode reason);
    static void connected(void* self, MHD_Connection* connection, void** context,
                          MHD_ConnectionNotificationCode code);
    MHD_Daemon* start();
    void watch();
    void waitForExchanges() const;

    ServerState state_;
    MHD_Daemon* daemon_;
    std::mutex watchMutex_;
    std::condition_variable watchEnds_;
    bool watching_ = true;
    std::thread watcher_;
};

HttpServer::Impl::Impl(ServerOptions options, std::shared_ptr<const Operations> operations)
    : state_(std::move(options), std::move(operations)), daemon_(start()),
      watcher_([this] { watch(); }) {}

// Nothing may be suspended when the daemon stops, so those who resume connections go first.
HttpServer::Impl::~Impl() {
    state_.stopping = true;
    MHD_quiesce_daemon(daemon_); // the listening socket is closed with the daemon
    waitForExchanges();
    for (const auto& exchange : state_.exchanges.all()) {
        exchange->abandon();
    }
    state_.loginPool.stop();
    state_.timers.stop();
    state_.workers.stop();
    MHD_stop_daemon(daemon_);
    {
        const std::lock_guard<std::mutex> lock(watchMutex_);
        watching_ = false;
    }
    watchEnds_.notify_one();
    watcher_.join();
}

void HttpServer::Impl::waitForExchanges() const {
    const auto end = std::chrono::steady_clock::now() + kGrace;
    while (!state_.exchanges.all().empty() && std::chrono::steady_clock::now() < end) {
        std::this_thread::sleep_for(std::chrono::milliseconds(10));
    }
}

MHD_Daemon* HttpServer::Impl::start() {
    const ServerOptions& options = state_.options;
    const ServerLimits& limits = options.limits;
    raiseDescriptorLimit(limits.connections);
    SocketAddress address = socketAddress(options.address, options.port);
    unsigned int flags = MHD_USE_EPOLL_INTERNAL_THREAD | MHD_ALLOW_SUSPEND_RESUME | MHD_USE_ITC;
    if (address.ipv6) {
        flags |= MHD_USE_IPv6;
    }
    std::vector<MHD_OptionItem> items = {
        {MHD_OPTION_SOCK_ADDR, 0, &address.storage},
        {MHD_OPTION_CONNECTION_MEMORY_LIMIT, kConnectionMemory, nullptr},
        {MHD_OPTION_CONNECTION_LIMIT, static_cast<std::intptr_t>(limits.connections), nullptr},
        {MHD_OPTION_CONNECTION_TIMEOUT, static_cast<std::intptr_t>(limits.idle.count()), nullptr},
        {MHD_OPTION_THREAD_POOL_SIZE, kConnectionThreads, nullptr},
        {MHD_OPTION_STRICT_FOR_CLIENT, 1, nullptr},
        {MHD_OPTION_NOTIFY_COMPLETED, reinterpret_cast<std::intptr_t>(&completed), this},
        {MHD_OPTION_NOTIFY_CONNECTION, reinterpret_cast<std::intptr_t>(&connected), this},
    };
    if (!options.certificate.empty()) {
        // Requests stay in what has been decrypted, which is freed as it is otherwise.
        gnutls_free = secrecy::releaseWiped;
        flags |= MHD_USE_TLS;
        items.push_back(
            {MHD_OPTION_HTTPS_MEM_CERT, 0, const_cast<char*>(options.certificate.c_str())});
        items.push_back({MHD_OPTION_HTTPS_MEM_KEY, 0, const_cast<char*>(options.key.c_str())});
    }
    items.push_back({MHD_OPTION_END, 0, nullptr});
    MHD_Daemon* const daemon =
        MHD_start_daemon(flags, options.port, nullptr, nullptr, &handle, this, MHD_OPTION_ARRAY,
                         items.data(), MHD_OPTION_END);
    if (daemon == nullptr) {
        throw std::runtime_error(
            "cannot listen on " + options.address + " port " + std::to_string(options.port) +
            (options.certificate.empty() ? "" : ", or certificate and key do not fit"));
    }
    return daemon;
}

std::uint16_t HttpServer::Impl::port() const {
    const auto* const info = MHD_get_daemon_info(daemon_, MHD_DAEMON_INFO_BIND_PORT);
    return info == nullptr ? 0 : info->port;
}

MHD_Result HttpServer::Impl::handle(void* self, MHD_Connection* connection, const char* url,
                                    const char* method, const char*, const char* data,
                                    std::size_t* size, void** exchange) {
    auto& server = *static_cast<Impl*>(self);
    try {
        if (*exchange == nullptr) {
            auto made = std::make_unique<std::shared_ptr<Exchange>>(
                std::make_shared<Exchange>(server.state_, connection));
            server.state_.exchanges.add(*made);
            *exchange = made.get();
            return (*made.release())->begin(method, url);
        }
        return (*static_cast<std::shared_ptr<Exchange>*>(*exchange))->proceed(data, size);
    } catch (const std::exception& error) {
        server.state_.log(std::string("a request was dropped: ") + error.what());
        return MHD_NO;
    }
}

void HttpServer::Impl::completed(void* self, MHD_Connection* connection, void** exchange,
                                 MHD_RequestTerminationCode) {
    auto& server = *static_cast<Impl*>(self);
    auto* const holder = static_cast<std::shared_ptr<Exchange>*>(*exchange);
    *exchange = nullptr;
    if (holder != nullptr) {
        (*holder)->abandon();
        server.state_.exchanges.remove(*holder);
        delete holder;
    }
    // The next request on this connection.
    const auto* const info = MHD_get_connection_info(connection, MHD_CONNECTION_INFO_CONNECTION_FD);
    if (info != nullptr) {
        const ServerLimits& limits = server.state_.options.limits;
        server.state_.watch.allow(info->connect_fd, limits.idle + limits.request);
    }
}

void HttpServer::Impl::connected(void* self, MHD_Connection* connection, void**,
                                 MHD_ConnectionNotificationCode code) {
    auto& server = *static_cast<Impl*>(self);
    const auto* const info = MHD_get_connection_info(connection, MHD_CONNECTION_INFO_CONNECTION_FD);
    if (info == nullptr) {
        return;
    }
    if (code == MHD_CONNECTION_NOTIFY_STARTED) {
        server.state_.watch.add(info->connect_fd, server.state_.options.limits.request);
    } else {
        server.state_.watch.remove(info->connect_fd);
    }
}

void HttpServer::Impl::watch() {
    std::size_t served = 0;
    unsigned int trims = 0; // still to come
    std::unique_lock<std::mutex> lock(watchMutex_);
    while (!watchEnds_.wait_for(lock, kWatchPeriod, [this] { return !watching_; })) {
        state_.watch.endLate();
        // Requests that were at work together leave holes behind, which add up over days.
        const auto count = state_.exchanges.countWhenIdle();
        if (count && *count != served) {
            served = *count;
            trims = kTrims;
        }
        if (count && trims > 0) {
            --trims;
            malloc_trim(0);
        }
    }
}

HttpServer::HttpServer(ServerOptions options, std::shared_ptr<const Operations> operations)
    : impl_(std::make_unique<Impl>(std::move(options), std::move(operations))) {}

HttpServer::~HttpServer() = default;

std::uint16_t HttpServer::port() const { return impl_->port(); }

} // namespace qelo::server
