// The lines that association requests leave in the log and in the trace.
#include "AssociationFixture.h"

#include <algorithm>

namespace qelo::test {
namespace {

class AssociationTrace : public AssociationFixture {
protected:
    const std::vector<std::function<Outcome()>> operations_ = {
        [&] { return enumNames(); },
        [&] { return enumInstances(); },
        [&] {
            return getInstance({{case_.farRole, "x"}});
        },
        // From the far end, so that each reads the store.
        [&] { return associators(farPath("zeta"), along()); },
        [&] { return associatorNames(farPath("zeta"), along()); },
        [&] { return references(farPath("zeta")); },
        [&] { return referenceNames(farPath("zeta")); },
    };
    const std::vector<std::string> names_ = {"EnumInstanceNames", "EnumInstances",   "GetInstance",
                                             "Associators",       "AssociatorNames", "References",
                                             "ReferenceNames"};
};

TEST_P(AssociationTrace, Every_operation_is_enclosed_in_its_markers) {
    serveTwoAndThree();
    for (std::size_t i = 0; i < operations_.size(); ++i) {
        platform_.forget();
        expectOk(operations_[i]());
        expectLines(names_[i], true);
        EXPECT_EQ(points().front(), pointText(case_.provider.component, "markProviderEntry",
                                              "Trace", 4000, std::string(78, '=')));
    }
}

TEST_P(AssociationTrace, A_failure_line_names_the_providers_unit_at_level_6000) {
    broker_.failSlot("enumerateInstanceNames", 0, broken_);
    enumNames();
    std::vector<std::string> failures;
    for (const LogLine& line : platform_.lines(Sink::Log)) {
        if (line.level == 6000) {
            EXPECT_EQ(line.component, case_.provider.component);
            EXPECT_EQ(line.file, case_.provider.file);
            failures.push_back(normalised(line.message));
        }
    }
    EXPECT_THAT(failures,
                testing::ElementsAre("MESSAGE [File: " + std::string(case_.provider.file) +
                                     ", Line: #]: " + enumerationFailed));
}

TEST_P(AssociationTrace, Something_thrown_is_traced_and_ends_every_operation) {
    serveTwoAndThree();
    for (std::size_t i = 0; i < operations_.size(); ++i) {
        SCOPED_TRACE(names_[i]);
        platform_.reset();
        serveNear({"/a"});
        platform_.failOperation("getPathToNode", 1, StoreFault::ThrowsForeign);
        const Outcome outcome = operations_[i]();
        EXPECT_EQ(outcome.rc, CMPI_RC_ERR_FAILED);
        EXPECT_TRUE(outcome.hasMessage);
        EXPECT_EQ(broker_.doneCount(), 0);
        expectNothingReturned();
        expectLines(names_[i], false, {outcome.message});
    }
}

TEST_P(AssociationTrace, Levels_are_3000_4000_and_6000_only) {
    serveTwoAndThree();
    for (const auto& operation : operations_) {
        operation();
    }
    broker_.failSlot("newObjectPath", 0, broken_);
    for (const auto& operation : operations_) {
        operation();
    }
    for (const LogLine& line : platform_.lines()) {
        EXPECT_TRUE(line.level == 3000 || line.level == 4000 || line.level == 6000) << line.level;
    }
    EXPECT_FALSE(points().empty()); // which compares log and trace
}

QELO_FOR_BOTH_ASSOCIATIONS(AssociationTrace);

} // namespace
} // namespace qelo::test
