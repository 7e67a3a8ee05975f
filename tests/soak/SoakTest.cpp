// A server that has worked for long takes no more of the machine than one that has worked for a
// while. QELO_SWEEP=long: 100,000 requests instead of 3,000.
#include "Requests.h"
#include "ServerFigures.h"

#include "endtoend/Qelosim.h"
#include "endtoend/Server.h"
#include "host/server/RawClient.h"

#include <atomic>
#include <cmath>
#include <cstdlib>
#include <cstring>
#include <map>
#include <mutex>
#include <optional>
#include <thread>

namespace qelo::soak {
namespace {

using endtoend::Server;
using server::RawClient;

constexpr std::size_t kClients = 8;
constexpr char kCredentials[] = "root:rootpass";

bool isLong() {
    const char* const form = std::getenv("QELO_SWEEP");
    return form != nullptr && std::strcmp(form, "long") == 0;
}

// Memory is looked at after the first part, when everything that is kept has been made once.
struct Form {
    std::size_t first;
    std::size_t all;
    double growth; // allowed, as a share
};
Form form() { return isLong() ? Form{10'000, 100'000, 0.01} : Form{1'000, 3'000, 0.03}; }

// Freed memory stays with a sanitizer for a while, and grows with the number of requests.
constexpr bool memoryIsKept() {
#if defined(__SANITIZE_ADDRESS__) || defined(__SANITIZE_THREAD__)
    return true;
#else
    return false;
#endif
}

// Counts answers by their HTTP status; 0: none.
class Tally {
public:
    void count(int status) {
        const std::lock_guard<std::mutex> lock(mutex_);
        ++counts_[status];
    }
    void countChange() { ++changes_; }
    std::size_t changes() const { return changes_; }
    std::string text() const {
        std::string result;
        for (const auto& [status, count] : counts_) {
            result += " " + (status == 0 ? "none" : std::to_string(status)) + ": " +
                      std::to_string(count);
        }
        return result;
    }

private:
    std::mutex mutex_;
    std::map<int, std::size_t> counts_;
    std::atomic<std::size_t> changes_{0};
};

// One client: half of its requests go over the connection that it has already.
class Client {
public:
    Client(std::uint16_t port, Requests requests) : port_(port), requests_(std::move(requests)) {}

    // The problem with the answer, or "".
    std::string ask(Tally& tally) {
        const Request request = requests_.next();
        if (!connection_ || fresh_) {
            connection_.emplace(port_);
        }
        fresh_ = !fresh_;
        const bool taken = connection_->send(request.text);
        if (request.ending != Ending::Answered) {
            if (request.ending == Ending::Reset) {
                connection_->resetWhenClosed();
            }
            connection_.reset();
            tally.count(0);
            return {};
        }
        const RawClient::Answer answer = connection_->receive();
        if (answer.status != 200 || answer.field("Connection") == "close") {
            connection_.reset();
        }
        tally.count(answer.status);
        const bool carriedOut = answer.status == 200 && !isError(answer);
        if (request.change && carriedOut) {
            tally.countChange();
        }
        const bool right =
            answer.complete && answer.status == request.status &&
            (request.reply == Reply::Any || (request.reply == Reply::Error) == isError(answer));
        return right || (request.status == 0 && answer.status < 500)
                   ? ""
                   : std::to_string(answer.status) + (taken ? "" : " (not taken)") +
                         " instead of " + std::to_string(request.status) + " for " +
                         request.text.substr(0, 2000);
    }

private:
    static bool isError(const RawClient::Answer& answer) {
        return answer.body.find("<ERROR CODE=") != std::string::npos;
    }

    std::uint16_t port_;
    Requests requests_;
    std::optional<RawClient> connection_;
    bool fresh_ = false;
};

class Soak : public testing::Test {
protected:
    void SetUp() override {
        ASSERT_EQ(endtoend::qelosim({"init-root", root_}).status, 0);
        for (int i = 0; i < 8; ++i) {
            accounts_.push_back("user" + std::to_string(i));
            ASSERT_EQ(endtoend::qelosim({"create-user", accounts_.back(), "--root", root_}).status,
                      0);
        }
        const std::string config = scratch_.write("logging.conf", "log = none\n");
        setenv("QELO_LOG_CONFIG", config.c_str(), 1);
        const std::string users = scratch_.write("users", endtoend::userLine("root", "rootpass"));
        server_ = std::make_unique<Server>(
            std::vector<std::string>{"--user-file", users, "--root", root_});
        ASSERT_NE(server_->url(), "") << server_->errors();
    }

    // A wrong answer ends the part.
    void request(std::size_t count) {
        std::atomic<std::size_t> left{count};
        std::atomic<bool> wrong{false};
        std::vector<std::thread> threads;
        for (std::size_t i = 0; i < kClients; ++i) {
            threads.emplace_back([&, i] {
                Client client(server_->port(), Requests(seed_ + static_cast<std::uint32_t>(i),
                                                        kCredentials, accounts_));
                while (!wrong && take(left)) {
                    const std::string problem = client.ask(tally_);
                    if (!problem.empty()) {
                        wrong = true;
                        ADD_FAILURE() << problem;
                    }
                }
            });
        }
        for (std::thread& thread : threads) {
            thread.join();
        }
        seed_ += kClients;
    }

    ServerFigures rest(std::optional<std::size_t> descriptors) const {
        return figuresAtRest(server_->process(), descriptors);
    }

    std::unique_ptr<Server> server_;
    Tally tally_;

private:
    static bool take(std::atomic<std::size_t>& left) {
        std::size_t count = left;
        while (count > 0 && !left.compare_exchange_weak(count, count - 1)) {
        }
        return count > 0;
    }

    endtoend::Scratch scratch_;
    const std::string root_ = scratch_.path("root");
    std::vector<std::string> accounts_;
    std::uint32_t seed_ = 1;
};

TEST_F(Soak, A_server_takes_no_more_of_the_machine_the_longer_it_works) {
    const ServerFigures before = figuresOf(server_->process());
    request(form().first);
    const ServerFigures first = rest(before.descriptors);
    ASSERT_FALSE(HasFailure());
    request(form().all - form().first);
    const ServerFigures last = rest(before.descriptors);

    const double growth =
        static_cast<double>(last.residentKiB) / static_cast<double>(first.residentKiB) - 1;
    std::cout << "[  SOAK    ] at the start: " << before << "\n"
              << "[  SOAK    ] after " << form().first << " requests: " << first << "\n"
              << "[  SOAK    ] after " << form().all << " requests: " << last << "\n"
              << "[  SOAK    ] answers:" << tally_.text()
              << "; changes carried out: " << tally_.changes() << "\n"
              << "[  SOAK    ] memory: " << std::showpos << growth * 100 << std::noshowpos
              << " %\n";
    EXPECT_GT(tally_.changes(), 0U);
    EXPECT_EQ(last.threads, before.threads);
    EXPECT_EQ(last.descriptors, before.descriptors);
    if (memoryIsKept()) {
        std::cout << "[  SOAK    ] a sanitizer keeps memory that is freed: not compared\n";
    } else {
        EXPECT_LT(std::abs(growth), form().growth);
    }
    EXPECT_EQ(server_->stop(), 0);
}

} // namespace
} // namespace qelo::soak
