#include "Program.h"

namespace qelo::cli {
namespace {

class AssociationCommands : public Program {
protected:
    void SetUp() override { manager.instances = {accountInstance("root", "Superuser", 0, 2)}; }
};

TEST_F(AssociationCommands, Each_command_is_its_operation) {
    EXPECT_EQ(run({"ain", "C.K=1"}), 0);
    EXPECT_EQ(manager.operation, "associatorNames");
    EXPECT_EQ(run({"ai", "C.K=1"}), 0);
    EXPECT_EQ(manager.operation, "associators");
    EXPECT_EQ(run({"rin", "C.K=1"}), 0);
    EXPECT_EQ(manager.operation, "referenceNames");
    EXPECT_EQ(run({"ri", "C.K=1"}), 0);
    EXPECT_EQ(manager.operation, "references");
    EXPECT_EQ(manager.path.className(), "C");
    EXPECT_EQ(manager.path.nameSpace(), "root/cimv2");
}

TEST_F(AssociationCommands, The_options_of_wbemcli_are_the_filters) {
    for (const char* command : {"ain", "ai"}) {
        EXPECT_EQ(
            run({command, "-ac", "Assoc", "-rc", "Result", "-r", "Role", "-rr", "Far", "C.K=1"}), 0)
            << errors.text();
        EXPECT_EQ(manager.filter.assocClass, "Assoc");
        EXPECT_EQ(manager.filter.resultClass, "Result");
        EXPECT_EQ(manager.filter.role, "Role");
        EXPECT_EQ(manager.filter.resultRole, "Far");
    }
}

TEST_F(AssociationCommands, The_options_may_stand_behind_the_path) {
    EXPECT_EQ(run({"ain", "C.K=1", "-rc", "Result"}), 0);
    EXPECT_EQ(manager.filter.resultClass, "Result");
    EXPECT_EQ(manager.filter.assocClass, "");
    EXPECT_EQ(manager.filter.role, "");
    EXPECT_EQ(manager.filter.resultRole, "");
}

TEST_F(AssociationCommands, The_long_options_do_the_same) {
    EXPECT_EQ(run({"ai", "C.K=1", "--assoc-class", "A", "--result-class=B", "--role", "C",
                   "--result-role", "D"}),
              0);
    EXPECT_EQ(manager.filter.assocClass, "A");
    EXPECT_EQ(manager.filter.resultClass, "B");
    EXPECT_EQ(manager.filter.role, "C");
    EXPECT_EQ(manager.filter.resultRole, "D");
}

TEST_F(AssociationCommands, References_know_the_result_class_and_the_role_only) {
    for (const char* command : {"rin", "ri"}) {
        EXPECT_EQ(run({command, "C.K=1", "-rc", "Result", "-r", "Role"}), 0);
        EXPECT_EQ(manager.filter.resultClass, "Result");
        EXPECT_EQ(manager.filter.role, "Role");
    }
}

TEST_F(AssociationCommands, References_take_the_class_of_the_association_by_either_name) {
    for (const char* command : {"rin", "ri"}) {
        EXPECT_EQ(run({command, "C.K=1", "-ac", "Assoc"}), 0) << errors.text();
        EXPECT_EQ(manager.filter.resultClass, "Assoc");
        EXPECT_EQ(manager.filter.assocClass, "");
        EXPECT_EQ(run({command, "C.K=1", "-rc", "Assoc", "-ac", "ASSOC"}), 0) << errors.text();
        EXPECT_EQ(manager.filter.resultClass, "ASSOC");
        EXPECT_EQ(manager.filter.assocClass, "");
    }
}

TEST_F(AssociationCommands, Two_classes_of_one_association_are_refused) {
    EXPECT_EQ(run({"ri", "C.K=1", "-rc", "A", "-ac", "B"}), ExitUsage);
    EXPECT_EQ(errors.text(), "qelosim: -ac and -rc both name the class of the associations, and "
                             "differ (see qelosim ri --help)\n");
    EXPECT_EQ(run({"rin", "C.K=1", "-ac", "a b"}), ExitUsage);
    EXPECT_EQ(manager.connections, 0);
}

TEST_F(AssociationCommands, References_have_no_result_role) {
    std::string expected;
    for (const std::string command : {"rin", "ri"}) {
        for (const char* option : {"-rr", "--result-role"}) {
            EXPECT_EQ(run({command, "C.K=1", option, "X"}), ExitUsage);
            expected +=
                "qelosim: rin and ri have no result role (see qelosim " + command + " --help)\n";
        }
    }
    EXPECT_EQ(errors.text(), expected);
    EXPECT_EQ(manager.connections, 0);
}

TEST_F(AssociationCommands, Instances_can_be_limited_to_some_properties) {
    for (const char* command : {"ai", "ri"}) {
        EXPECT_EQ(run({command, "C.K=1", "-p", "A,B"}), 0);
        EXPECT_EQ(manager.properties, std::vector<std::string>({"A", "B"}));
        EXPECT_EQ(run({command, "C.K=1"}), 0);
        EXPECT_FALSE(manager.properties);
    }
    EXPECT_EQ(run({"ain", "C.K=1", "-p", "A"}), ExitUsage);
}

TEST_F(AssociationCommands, A_filter_that_is_no_name_is_refused) {
    EXPECT_EQ(run({"ain", "C.K=1", "-rc", "a b"}), ExitUsage);
    EXPECT_EQ(run({"ain", "C.K=1", "-r", ""}), ExitUsage);
    EXPECT_EQ(run({"ain", "C.K=1", "-ac"}), ExitUsage);
    EXPECT_EQ(manager.connections, 0);
}

TEST_F(AssociationCommands, The_source_must_be_an_instance) {
    EXPECT_EQ(run({"ain", "C"}), ExitUsage);
}

TEST_F(AssociationCommands, Paths_and_instances_are_printed_as_by_ein_and_ei) {
    run({"rin", "C.K=1"});
    const std::string paths = output.text();
    EXPECT_EQ(paths, manager.instances[0].path().toText() + "\n");
    run({"ri", "C.K=1"});
    EXPECT_NE(output.text().find("  Description   = \"Superuser\"\n"), std::string::npos);
}

} // namespace
} // namespace qelo::cli
