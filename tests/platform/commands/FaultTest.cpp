// Every step of every command made to fail: the database is then as before, or as it should
// be after the command, and never anything between.
#include "CommandExecutor.h"
#include "CommandTest.h"
#include "FaultyFiles.h"
#include "ScratchRoot.h"

#include <functional>
#include <memory>
#include <regex>
#include <sys/wait.h>
#include <unistd.h>

namespace qelo::test {

namespace {

namespace fs = std::filesystem;

using testing::IsEmpty;
using Fault = RecordingTools::Fault;
using State = std::map<std::string, std::string>;

struct Scenario {
    std::string name;
    std::vector<std::string> before;
    std::string command;
};

void PrintTo(const Scenario& scenario, std::ostream* stream) { *stream << scenario.name; }

// An ordinary user can only make home directories that are his own.
long ownUser() { return isSuperuser() ? 4000 : static_cast<long>(::getuid()); }
long ownGroup() { return isSuperuser() ? 4000 : static_cast<long>(::getgid()); }

std::vector<Scenario> scenarios() {
    const std::string group =
        command("CreateGroup", {text("Name", "own"), number("GroupId", ownGroup())});
    const std::string user =
        command("CreateUser", {text("Name", "alice"), text("UserPassword", "pw")});
    const std::string other = command("CreateUser", {text("Name", "zoe")});
    const std::string withHome =
        command("CreateUser",
                {text("Name", "alice"), number("UserID", ownUser()), number("GroupId", ownGroup()),
                 text("HomeDirectory", "/a/b/alice"), number("CreateHome", 1),
                 text("UserPassword", "pw"), text("FullName", "Alice")});
    const std::string member =
        command("AddMember", {text("Name", "users"), text("Member", "alice")});
    const std::string name = text("Name", "alice");
    // Other numbers mean other owners of the files, which only the superuser can give.
    const std::vector<std::string> all{name,
                                       text("FullName", "Al"),
                                       number("UserID", isSuperuser() ? 4321 : ownUser()),
                                       number("GroupId", isSuperuser() ? 100 : ownGroup()),
                                       text("ScriptPath", "/bin/ksh"),
                                       text("UserPassword", "new"),
                                       number("daysMustKeepPassword", 1),
                                       dateTime("PasswordExpiration", "20300102030405.000000+000")};
    return {
        {"CreateUser", {other}, user},
        {"CreateUserWithHome", {group, other}, withHome},
        {"ModifyUser", {group, withHome, other}, command("ModifyUser", all)},
        {"ModifyUserWithNewHome",
         {group, withHome},
         command("ModifyUser", {name, text("HomeDirectory", "/c/alice"), number("CreateHome", 1)})},
        {"DeleteUser", {user, other, member}, command("DeleteUser", {name})},
        {"DeleteUserWithHome",
         {group, withHome, other, member},
         command("DeleteUser", {name, number("RemoveHome", 1)})},
        {"SetPassword", {user, other}, command("SetPassword", {name, text("UserPassword", "new")})},
        {"EnableUser", {user, command("DisableUser", {name})}, command("EnableUser", {name})},
        {"DisableUser", {user}, command("DisableUser", {name})},
        {"CreateGroup", {group}, command("CreateGroup", {text("Name", "devs")})},
        {"DeleteGroup", {group}, command("DeleteGroup", {text("Name", "own")})},
        {"AddMember", {user, other}, member},
        {"RemoveMember",
         {user, other, member,
          command("AddMember", {text("Name", "users"), text("Member", "zoe")})},
         command("RemoveMember", {text("Name", "users"), text("Member", "alice")})}};
}

// A root as it is before a scenario's command.
class World {
public:
    explicit World(const Scenario& scenario) : root_(scratch_.path() / "root") {
        EXPECT_TRUE(store::initRoot(root_).accepted);
        // So that useradd makes a mail file, which has to go with a failure.
        fs::create_directories(root_ / "var/mail");
        const fs::path defaults = root_ / "etc/default/useradd";
        write(defaults, contentOf(defaults) + "CREATE_MAIL_SPOOL=yes\n");
        for (const std::string& line : scenario.before) {
            const store::CommandOutcome outcome = store::executeAdminCommand(root_, line);
            EXPECT_TRUE(outcome.accepted) << line << ": " << outcome.status;
        }
    }

    const fs::path& root() const { return root_; }

    // Hashes are random, so only their presence counts.
    State state() const {
        static const std::regex hash("\\$y\\$[^:\n]*");
        State state = stateOf(root_);
        std::string& shadow = state["etc/shadow"];
        shadow = std::regex_replace(shadow, hash, "HASH");
        return state;
    }

private:
    ScratchDirectory scratch_;
    fs::path root_;
};

// Without a home directory that has been set aside, and what is in it.
State withoutRests(State state) {
    for (auto entry = state.begin(); entry != state.end();) {
        const bool rest = entry->first.find(".qelosim-old-") != std::string::npos;
        entry = rest ? state.erase(entry) : std::next(entry);
    }
    return state;
}

// One tool is killed when it has written all files but one.
class InterruptedTools : public RecordingTools {
public:
    InterruptedTools(fs::path file, std::size_t call) : file_(std::move(file)), call_(call) {
        failAt(call, Fault::TimesOut);
    }

    store::ToolResult run(const store::ToolCall& call) override {
        const bool interrupted = calls().size() == call_;
        const std::string content = contentOf(file_);
        const store::ToolResult result = RecordingTools::run(call);
        if (interrupted) {
            write(file_, content);
        }
        return result;
    }

private:
    fs::path file_;
    std::size_t call_;
};

class Faults : public testing::TestWithParam<Scenario> {
protected:
    Faults() {
        World done(GetParam());
        EXPECT_TRUE(store::executeAdminCommand(done.root(), GetParam().command).accepted);
        after_ = done.state();
        renew();
    }

    // Runs the command and compares. A world that was changed is replaced by a fresh one.
    void runAndCompare(store::FileSystem& files, store::ToolRunner& tools,
                       const std::string& what) {
        const auto status = store::executeCommand(world_->root(), GetParam().command, files, tools);
        const State now = world_->state();
        if (!status) {
            EXPECT_EQ(before_, now) << what << ": " << status.reason();
        } else if (status->find("is left at") != std::string::npos) {
            EXPECT_EQ(after_, withoutRests(now)) << what;
        } else {
            EXPECT_EQ(after_, now) << what;
        }
        EXPECT_THAT(findFaults(world_->root()), IsEmpty()) << what;
        lastAccepted_ = static_cast<bool>(status);
        if (now != before_) {
            renew();
        }
    }

    void renew() {
        world_ = std::make_unique<World>(GetParam());
        before_ = world_->state();
    }

    std::size_t toolCalls() {
        RecordingTools tools;
        EXPECT_TRUE(
            store::executeCommand(world_->root(), GetParam().command, store::systemFiles(), tools));
        renew();
        return tools.calls().size();
    }

    void sweepFiles(int error) {
        for (long call = 0;; ++call) {
            FaultyFiles files;
            files.failAt(call, error);
            runAndCompare(files, store::systemTools(), "file call " + std::to_string(call));
            if (files.calls() <= call) {
                EXPECT_TRUE(lastAccepted_);
                EXPECT_GT(call, 30);
                return;
            }
        }
    }

    std::unique_ptr<World> world_;
    State before_;
    State after_;
    bool lastAccepted_ = false;
};

std::string nameOf(const testing::TestParamInfo<Scenario>& info) { return info.param.name; }

} // namespace

TEST_P(Faults, Of_any_tool_in_any_way_leave_the_old_or_the_new_state) {
    const std::size_t count = toolCalls();
    for (const Fault fault : {Fault::Refuses, Fault::FailsAfterwards, Fault::Lies, Fault::TimesOut,
                              Fault::CannotStart}) {
        for (std::size_t call = 0; call < count; ++call) {
            RecordingTools tools;
            tools.failAt(call, fault);
            runAndCompare(store::systemFiles(), tools,
                          "fault " + std::to_string(static_cast<int>(fault)) + " of call " +
                              std::to_string(call));
            EXPECT_FALSE(lastAccepted_);
        }
    }
}

TEST_P(Faults, Of_a_tool_between_two_files_leave_the_old_state) {
    const std::size_t count = toolCalls();
    for (const char* file : {"passwd", "shadow", "group", "gshadow", "subuid", "subgid"}) {
        for (std::size_t call = 0; call < count; ++call) {
            InterruptedTools tools(world_->root() / "etc" / file, call);
            runAndCompare(store::systemFiles(), tools, std::string("without ") + file);
            EXPECT_FALSE(lastAccepted_);
        }
    }
}

TEST_P(Faults, Of_any_file_operation_leave_the_old_or_the_new_state) { sweepFiles(EIO); }

TEST_P(Faults, Of_all_file_operations_from_any_one_on_are_reported) {
    for (long call = 0;; call += 7) {
        FaultyFiles files;
        files.failFrom(call, ENOSPC);
        const auto status =
            store::executeCommand(world_->root(), GetParam().command, files, store::systemTools());
        if (files.calls() <= call) {
            EXPECT_TRUE(status);
            return;
        }
        const State now = world_->state();
        if (!status && now != before_) {
            EXPECT_THAT(status.reason(), testing::HasSubstr("not undone")) << call;
        }
        // Even then nobody can use an account that was not completed.
        const std::vector<std::string> account = lineOf(world_->root() / "etc/passwd", "alice");
        EXPECT_EQ(account.empty(), lineOf(world_->root() / "etc/shadow", "alice").empty());
        if (now != before_) {
            renew();
        }
    }
}

TEST_P(Faults, That_kill_the_process_leave_a_database_that_is_whole) {
    class KillingTools : public store::ToolRunner {
    public:
        explicit KillingTools(bool afterwards) : afterwards_(afterwards) {}
        store::ToolResult run(const store::ToolCall& call) override {
            if (afterwards_) {
                store::systemTools().run(call);
            }
            ::_exit(0);
        }

    private:
        bool afterwards_;
    };
    for (const bool afterwards : {false, true}) {
        const pid_t child = ::fork();
        if (child == 0) {
            KillingTools tools(afterwards);
            static_cast<void>(store::executeCommand(world_->root(), GetParam().command,
                                                    store::systemFiles(), tools));
            ::_exit(0);
        }
        ASSERT_EQ(child, ::waitpid(child, nullptr, 0));
        EXPECT_THAT(findFaults(world_->root()), IsEmpty());
        const std::vector<std::string> shadow = lineOf(world_->root() / "etc/shadow", "alice");
        EXPECT_TRUE(shadow.empty() || !shadow.at(1).empty());
        // The next command finds no lock in its way.
        EXPECT_TRUE(store::executeAdminCommand(world_->root(),
                                               command("CreateUser", {text("Name", "next")}))
                        .accepted);
        renew();
    }
}

INSTANTIATE_TEST_SUITE_P(Commands, Faults, testing::ValuesIn(scenarios()), nameOf);

} // namespace qelo::test
