// Classes on the whole way, and what a broken schema does.
#include "Qelosim.h"

#include <gmock/gmock.h>

#include <algorithm>

namespace qelo::endtoend {
namespace {

using ::testing::HasSubstr;
using ::testing::StartsWith;

class SchemaTest : public AccountDatabase {
protected:
    // A folder of its own with the given classes and registrations.
    Finished runWith(const std::string& mof, const std::string& registrations,
                     std::vector<std::string> arguments) const {
        scratch.write("schema/test.mof", mof);
        scratch.write("schema/test.reg", registrations);
        arguments.insert(arguments.end(), {"--schema-dir", scratch.path() + "/schema"});
        return run(std::move(arguments));
    }
};

TEST_F(SchemaTest, All_served_classes_are_declared) {
    const auto names = json({"ecn", "--deep"});
    EXPECT_EQ(names.size(), 28U);
    const auto account = json({"gc", "zanth_account"});
    EXPECT_EQ(account["class"], "ZANTH_Account");
    EXPECT_EQ(account["superclass"], "CIM_Account");
    EXPECT_EQ(json({"ecn", "CIM_Account"}), nlohmann::json::array({"ZANTH_Account"}));
}

TEST_F(SchemaTest, Superclasses_serve_the_instances_of_their_subclasses) {
    EXPECT_EQ(json({"ein", "CIM_Account"}), json({"ein", "ZANTH_Account"}));
    EXPECT_EQ(json({"ei", "CIM_Collection"}).size(), 4U);
    EXPECT_GT(json({"ein", "CIM_ManagedElement"}).size(), 10U);
    EXPECT_EQ(json({"ei", "CIM_Dependency"}).size(), 1U);
}

TEST_F(SchemaTest, Classes_without_instances_are_empty_and_unknown_ones_an_error) {
    EXPECT_EQ(run({"gc", "None"}).status, 6);
    EXPECT_EQ(run({"ecn", "None"}).status, 5);
    EXPECT_EQ(run({"ei", "None"}).status, 5);
    EXPECT_EQ(run({"gc", "ZANTH_Account", "--namespace", "root/none"}).status, 3);
    const Finished empty = runWith("class Lonely { [Key] string Name; };", "", {"ei", "Lonely"});
    EXPECT_EQ(empty.status, 0) << empty.err;
    EXPECT_EQ(empty.out, "");
}

TEST_F(SchemaTest, Static_instances_are_served_beside_the_providers) {
    const Finished finished = runWith("class Note { [Key] uint16 Id; string Text; };"
                                      "instance of Note { Id = 1; Text = \"hello\"; };",
                                      "", {"gi", "Note.Id=1"});
    EXPECT_EQ(finished.status, 0) << finished.err;
    EXPECT_THAT(finished.out, HasSubstr("Text = \"hello\""));
}

TEST_F(SchemaTest, Classes_are_known_in_every_namespace_that_a_provider_serves) {
    const std::string registration = "[Note]\nprovider: P\nlocation: none\ntype: instance\n"
                                     "namespace: root/other root/third\n";
    for (const char* nameSpace : {"root/cimv2", "root/other", "ROOT/third"}) {
        const Finished finished = runWith("class Note { [Key] string Id; };", registration,
                                          {"gc", "Note", "--namespace", nameSpace});
        EXPECT_EQ(finished.status, 0) << nameSpace << finished.err;
    }
    EXPECT_EQ(runWith("", registration, {"ecn", "--namespace", "root/fourth"}).status, 3);
}

TEST_F(SchemaTest, A_key_of_another_type_is_refused) {
    EXPECT_EQ(run({"gi", "ZANTH_Account.Name=5"}).status, 4);
    EXPECT_EQ(run({"gi", "ZANTH_Account.UserID=\"0\""}).status, 4);
}

TEST_F(SchemaTest, A_broken_schema_is_one_line_and_status_66) {
    const Finished mof = runWith("class X {\n", "", {"ecn"});
    EXPECT_EQ(mof.status, 66);
    EXPECT_THAT(mof.err, StartsWith("qelosim: "));
    EXPECT_THAT(mof.err, HasSubstr("test.mof:2:1: a type is expected"));
    const Finished reg = runWith("class X {};", "[X]\nprovider: P\n", {"accounts"});
    EXPECT_EQ(reg.status, 66);
    EXPECT_THAT(reg.err, HasSubstr("test.reg:1: class X has no location"));
    const Finished twice = runWith("class X {};",
                                   "[X]\nprovider: P\nlocation: l\ntype: instance\n"
                                   "namespace: a\n[X]\nprovider: Q\nlocation: l\n"
                                   "type: instance\nnamespace: a\n",
                                   {"ecn"});
    EXPECT_EQ(twice.status, 66);
    EXPECT_THAT(twice.err, HasSubstr("test.reg: class X in a already has a provider"));
    const Finished none = run({"ecn", "--schema-dir", scratch.path() + "/nowhere"});
    EXPECT_EQ(none.status, 66);
    for (const Finished* finished : {&mof, &reg, &twice, &none}) {
        EXPECT_EQ(std::count(finished->err.begin(), finished->err.end(), '\n'), 1) << finished->err;
        EXPECT_EQ(finished->out, "");
    }
}

} // namespace
} // namespace qelo::endtoend
