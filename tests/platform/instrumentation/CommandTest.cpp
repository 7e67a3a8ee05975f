// How a cursor hands on commands, with a source that only records them.
#include "FakeFiles.h"
#include "NodeCursor.h"
#include "TestLog.h"

#include <NodeLexicon.h>

#include <gmock/gmock.h>

#include <functional>
#include <stdexcept>

namespace qelo::nodes::tests {

namespace {

using namespace Tesk::NodeLexicon;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

// Each command "NAME" adds an account of that name; "refused" is refused, "broken" throws.
class RecordingSource : public Source {
public:
    std::shared_ptr<const Snapshot> take() override {
        auto snapshot = std::make_shared<Snapshot>();
        snapshot->add(UserAdministration, Node("/u", {}));
        for (const std::string& name : commands) {
            snapshot->add(UserAccount, Node("/u/" + name, {}));
        }
        if (afterTake) {
            afterTake();
        }
        return snapshot;
    }

    bool execute(const std::string& command, std::string& status) override {
        if (command == "broken secret") {
            throw std::runtime_error("no tool");
        }
        status = "half a status";
        if (command == "refused") {
            return false;
        }
        commands.push_back(command);
        status = "done " + command;
        return true;
    }

    std::vector<std::string> commands;
    std::function<void()> afterTake; // what happens before a snapshot just taken is kept
};

class Commands : public testing::Test {
protected:
    Commands() {
        clearLog();
        auto recording = std::make_unique<RecordingSource>();
        source = recording.get();
        store = std::make_shared<NodeStore>(std::move(recording), files);
        cursor = std::make_unique<NodeCursor>(store);
        cursor->select(UserAdministration);
    }

    bool send(const std::string& command) { return cursor->write(AdminCommand, command); }
    std::string status() {
        std::string text = "none";
        cursor->read(AdminCommand, text);
        return text;
    }

    FakeFiles files;
    RecordingSource* source = nullptr;
    std::shared_ptr<NodeStore> store;
    std::unique_ptr<NodeCursor> cursor;
};

} // namespace

TEST_F(Commands, An_accepted_command_leaves_its_status_on_the_same_cursor) {
    EXPECT_TRUE(send("alice"));
    EXPECT_EQ(status(), "done alice");
    EXPECT_TRUE(send("bob"));
    EXPECT_EQ(status(), "done bob");
    NodeCursor other(store);
    other.select(UserAdministration);
    std::string text;
    EXPECT_FALSE(other.read(AdminCommand, text));
}

TEST_F(Commands, The_next_selection_shows_the_change) {
    EXPECT_FALSE(NodeCursor(store).select(UserAccount));
    EXPECT_TRUE(send("alice"));
    EXPECT_TRUE(NodeCursor(store).select(UserAccount));
}

TEST_F(Commands, A_snapshot_under_way_during_a_command_is_not_kept) {
    store->refresh();
    send("alice");
    source->afterTake = [this] {
        source->afterTake = nullptr;
        send("bob");
    };
    NodeCursor early(store);
    early.select(UserAccount);
    EXPECT_EQ(early.size(), 1U);
    NodeCursor late(store);
    late.select(UserAccount);
    EXPECT_EQ(late.size(), 2U);
}

TEST_F(Commands, A_refused_command_stores_nothing) {
    EXPECT_FALSE(send("refused"));
    EXPECT_EQ(status(), "none");
    EXPECT_THAT(source->commands, IsEmpty());
}

TEST_F(Commands, A_refused_command_leaves_an_earlier_status) {
    send("alice");
    EXPECT_FALSE(send("refused"));
    EXPECT_EQ(status(), "done alice");
}

TEST_F(Commands, A_status_does_not_outlive_its_selection) {
    send("alice");
    cursor->select(UserAdministration);
    EXPECT_EQ(status(), "none");
}

TEST_F(Commands, A_command_that_fails_with_an_exception_is_refused_and_not_told) {
    EXPECT_FALSE(send("broken secret"));
    EXPECT_EQ(status(), "none");
    ASSERT_THAT(loggedTexts(), ElementsAre(HasSubstr("a command failed: no tool")));
    EXPECT_EQ(loggedTexts()[0].find("secret"), std::string::npos);
}

TEST_F(Commands, Go_only_to_the_administration_node) {
    send("alice");
    cursor->select(UserAccount);
    EXPECT_FALSE(send("bob"));
    cursor->clear();
    EXPECT_FALSE(send("bob"));
    NodeCursor fresh(store);
    EXPECT_FALSE(fresh.write(AdminCommand, std::string("bob")));
    EXPECT_THAT(source->commands, ElementsAre("alice"));
}

TEST_F(Commands, Other_properties_cannot_be_written) {
    for (int id = 0; id < 400; ++id) {
        if (id != AdminCommand) {
            EXPECT_FALSE(cursor->write(id, std::string("x")));
        }
        if (id != RefreshRequest) {
            EXPECT_FALSE(cursor->write(id, 0U));
        }
    }
}

} // namespace qelo::nodes::tests
