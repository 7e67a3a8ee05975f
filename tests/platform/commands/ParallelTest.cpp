// Many commands at once, among themselves and beside the system's tools.
#include "CommandTest.h"

#include <set>
#include <sys/wait.h>
#include <thread>
#include <unistd.h>

namespace qelo::test {

namespace {

constexpr int kMany = 40;

class Parallel : public CommandTest {
protected:
    // Creates one account in a thread.
    std::thread createInThread(int number, store::CommandOutcome& outcome) const {
        return std::thread([this, number, &outcome] {
            outcome = run("CreateUser", {text("Name", "user" + std::to_string(number)),
                                         text("UserPassword", "pw" + std::to_string(number))});
        });
    }

    // Creates one account in a process of its own.
    pid_t createInProcess(int number) const {
        const pid_t child = ::fork();
        if (child == 0) {
            ::_exit(run("CreateUser", {text("Name", "user" + std::to_string(number))}).accepted
                        ? 0
                        : 1);
        }
        return child;
    }

    // Does by hand what an administrator does, who tries again when the files are locked.
    bool createByHand(int number) const {
        store::ToolCall call;
        call.program = "/usr/sbin/useradd";
        call.arguments = {"--prefix", root().native(), "--no-log-init", "--",
                          "hand" + std::to_string(number)};
        for (int i = 0; i < 1000; ++i) {
            const store::ToolResult result = store::systemTools().run(call);
            if (result.done()) {
                return true;
            }
            if (result.message.find("cannot lock") == std::string::npos) {
                ADD_FAILURE() << result.message;
                return false;
            }
            std::this_thread::sleep_for(std::chrono::milliseconds(20));
        }
        return false;
    }

    void expectAccounts(const std::string& prefix, int count) const {
        std::set<std::string> numbers;
        for (int i = 0; i < count; ++i) {
            const std::vector<std::string> fields = passwd(prefix + std::to_string(i));
            ASSERT_EQ(7u, fields.size()) << prefix << i;
            numbers.insert(fields[2]);
            EXPECT_EQ(9u, shadow(prefix + std::to_string(i)).size());
        }
        EXPECT_EQ(static_cast<std::size_t>(count), numbers.size());
    }
};

} // namespace

TEST_F(Parallel, Forty_threads_create_forty_accounts) {
    std::vector<store::CommandOutcome> outcomes(kMany);
    std::vector<std::thread> threads;
    for (int i = 0; i < kMany; ++i) {
        threads.push_back(createInThread(i, outcomes.at(static_cast<std::size_t>(i))));
    }
    for (std::thread& thread : threads) {
        thread.join();
    }
    for (const store::CommandOutcome& outcome : outcomes) {
        EXPECT_TRUE(outcome.accepted) << outcome.status;
    }
    expectAccounts("user", kMany);
}

TEST_F(Parallel, Forty_processes_create_forty_accounts) {
    std::vector<pid_t> children;
    for (int i = 0; i < kMany; ++i) {
        children.push_back(createInProcess(i));
    }
    for (const pid_t child : children) {
        int status = -1;
        EXPECT_EQ(child, ::waitpid(child, &status, 0));
        EXPECT_EQ(0, status);
    }
    expectAccounts("user", kMany);
}

TEST_F(Parallel, Threads_processes_and_tools_run_by_hand_all_get_their_accounts) {
    constexpr int each = 12;
    std::vector<pid_t> children;
    for (int i = each; i < 2 * each; ++i) {
        children.push_back(createInProcess(i));
    }
    std::vector<store::CommandOutcome> outcomes(each);
    std::vector<std::thread> threads;
    for (int i = 0; i < each; ++i) {
        threads.push_back(createInThread(i, outcomes.at(static_cast<std::size_t>(i))));
        threads.emplace_back([this, i] { EXPECT_TRUE(createByHand(i)); });
    }
    for (std::thread& thread : threads) {
        thread.join();
    }
    for (const pid_t child : children) {
        int status = -1;
        EXPECT_EQ(child, ::waitpid(child, &status, 0));
        EXPECT_EQ(0, status);
    }
    for (const store::CommandOutcome& outcome : outcomes) {
        EXPECT_TRUE(outcome.accepted) << outcome.status;
    }
    expectAccounts("user", 2 * each);
    expectAccounts("hand", each);
}

TEST_F(Parallel, Different_commands_do_not_lose_each_others_changes) {
    accept("CreateGroup", {text("Name", "devs")});
    constexpr int count = 10;
    for (int i = 0; i < count; ++i) {
        accept("CreateUser", {text("Name", "user" + std::to_string(i))});
    }
    std::vector<std::thread> threads;
    for (int i = 0; i < count; ++i) {
        threads.emplace_back([this, i] {
            const std::string name = text("Name", "user" + std::to_string(i));
            accept("AddMember", {text("Name", "devs"), text("Member", "user" + std::to_string(i))});
            accept("ModifyUser", {name, number("daysMustChangePasswordAfter", i)});
            accept("SetPassword", {name, text("UserPassword", "pw")});
            accept("DisableUser", {name});
        });
    }
    for (std::thread& thread : threads) {
        thread.join();
    }
    for (int i = 0; i < count; ++i) {
        const std::vector<std::string> fields = shadow("user" + std::to_string(i));
        EXPECT_EQ("!$", fields.at(1).substr(0, 2));
        EXPECT_EQ(std::to_string(i), fields.at(4));
        EXPECT_THAT(group("devs").at(3), testing::HasSubstr("user" + std::to_string(i)));
    }
}

} // namespace qelo::test
