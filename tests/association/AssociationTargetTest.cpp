// The class and the path at the other end of an association.
#include "AssociationFixture.h"

#include <association/SimAccountHostedServiceObjFactory.h>
#include <association/SimElementCapabilitiesObjFactory.h>

namespace qelo::test {
namespace {

using Tesk::SimpleIdentityManagementProvider::SimAccountHostedServiceObjFactory;
using Tesk::SimpleIdentityManagementProvider::SimElementCapabilitiesObjFactory;
using testing::IsEmpty;

class AssociationTarget : public testing::TestWithParam<const AssociationCase*> {
protected:
    AssociationTarget() { platform_.reset(); }
    ~AssociationTarget() override { EXPECT_THAT(broker_.violations(), IsEmpty()); }

    bool hosted() const { return &case_ == &hostedService(); }

    std::string name(const char* source, const char* left, const char* right = "Right") {
        const CMPIObjectPath* ref = broker_.makePath(requestNameSpace, source);
        const char* target = hosted()
                                 ? SimAccountHostedServiceObjFactory().get_assoc_targetClass_Name(
                                       broker_.get(), ref, left, right, &status_)
                                 : SimElementCapabilitiesObjFactory().get_assoc_targetClass_Name(
                                       broker_.get(), ref, left, right, &status_);
        return target == nullptr ? "null" : target;
    }

    CMPIObjectPath* path(const CMPIObjectPath* ref, const char* left, CMPIStatus* status) {
        return hosted() ? SimAccountHostedServiceObjFactory().get_assoc_targetClass_ObjectPath(
                              broker_.get(), ref, left, "Right", status)
                        : SimElementCapabilitiesObjFactory().get_assoc_targetClass_ObjectPath(
                              broker_.get(), ref, left, "Right", status);
    }

    std::vector<std::string> points() const { return tracePoints(platform_.lines()); }

    std::string detail(const std::string& text) const {
        return pointText(
            case_.factory.component, "get_assoc_targetClass_Name", case_.factory.file, 4000,
            "MESSAGE [File: " + std::string(case_.factory.file) + ", Line: #]: " + text);
    }

    const AssociationCase& case_ = *GetParam();
    RecordingPlatform& platform_ = RecordingPlatform::instance();
    RecordingBroker broker_;
    CMPIStatus status_{CMPI_RC_OK, nullptr};
};

TEST_P(AssociationTarget, Each_class_leads_to_the_other) {
    EXPECT_EQ(name(case_.nearClass, case_.className), case_.farClass);
    EXPECT_EQ(name(case_.farClass, case_.className), case_.nearClass);
}

TEST_P(AssociationTarget, The_source_class_is_compared_exactly) {
    for (const char* source : {"zanth_computersystem", "ZANTH_accountManagementService",
                               "zanth_accountmanagementcapabilities", "CIM_ComputerSystem", ""}) {
        EXPECT_EQ(name(source, case_.className), "") << source;
    }
}

TEST_P(AssociationTarget, The_association_itself_has_no_other_end) {
    EXPECT_EQ(name(case_.className, case_.className), "");
}

TEST_P(AssociationTarget, Another_association_class_is_a_mismatch) {
    for (const char* left : {"ZANTH_Other", "", "CIM_HostedService", "ZANTH_AccountHosted"}) {
        EXPECT_EQ(name(case_.nearClass, left), "") << left;
    }
}

TEST_P(AssociationTarget, No_association_class_is_a_mismatch) {
    EXPECT_EQ(name(case_.nearClass, nullptr), "");
    EXPECT_EQ(name(case_.farClass, nullptr), "");
}

TEST_P(AssociationTarget, The_right_class_changes_nothing) {
    for (const char* right : {static_cast<const char*>(nullptr), "", "ZANTH_Other"}) {
        EXPECT_EQ(name(case_.nearClass, case_.className, right), case_.farClass);
    }
}

TEST_P(AssociationTarget, The_class_found_is_told_at_level_4000_between_entry_and_exit) {
    const std::string function = "get_assoc_targetClass_Name";
    const struct {
        const char* source;
        const char* text;
    } rows[] = {
        {case_.nearClass, case_.farClass}, {case_.farClass, case_.nearClass}, {"X", "empty"}};
    for (const auto& row : rows) {
        platform_.forget();
        name(row.source, case_.className);
        const std::string params =
            " _broker=@ ref=@ _RefLeftClass=" + std::string(case_.className) +
            " _RefRightClass=Right rc=@";
        const auto lines = ExpectedTrace()
                               .entering(case_.factory, function, params)
                               .exiting(case_.factory, function, params)
                               .points();
        EXPECT_THAT(points(),
                    testing::ElementsAre(
                        lines[0], detail("Target Class is " + std::string(row.text)), lines[1]));
    }
}

TEST_P(AssociationTarget, The_path_has_that_class_the_sources_namespace_and_this_host) {
    platform_.setSystemName("box7");
    const CMPIObjectPath* ref = broker_.makePath("root/other", case_.nearClass, {{"Name", "x"}});
    EXPECT_EQ(broker_.inspect(path(ref, case_.className, &status_)).toString(),
              "//box7/root/other:" + std::string(case_.farClass));
    EXPECT_EQ(status_.rc, CMPI_RC_OK);
}

TEST_P(AssociationTarget, A_mismatch_gives_a_path_without_a_class) {
    const CMPIObjectPath* ref = broker_.makePath(requestNameSpace, "ZANTH_Account");
    EXPECT_EQ(broker_.inspect(path(ref, case_.className, &status_)).className, "");
    EXPECT_EQ(broker_.inspect(path(ref, nullptr, nullptr)).className, "");
}

TEST_P(AssociationTarget, A_path_that_cannot_be_made_is_null_and_says_why) {
    const CMPIObjectPath* ref = broker_.makePath(requestNameSpace, case_.nearClass);
    broker_.failSlot("newObjectPath", 0, Fault::error(CMPI_RC_ERR_ACCESS_DENIED));
    EXPECT_EQ(path(ref, case_.className, &status_), nullptr);
    EXPECT_EQ(status_.rc, CMPI_RC_ERR_ACCESS_DENIED);
    EXPECT_EQ(path(ref, case_.className, nullptr), nullptr);
}

TEST_P(AssociationTarget, The_path_traces_its_parameters_and_the_class_as_a_variable) {
    const std::string function = "get_assoc_targetClass_ObjectPath";
    const std::string params = " _broker=@ ref=@ _RefLeftClass=" + std::string(case_.className) +
                               " _RefRightClass=Right rc=@";
    path(broker_.makePath(requestNameSpace, case_.nearClass), case_.className, &status_);
    std::vector<std::string> own;
    for (const std::string& point : points()) {
        if (point.find(" " + function + " ") != std::string::npos) {
            own.push_back(point);
        }
    }
    expectSamePoints(own, ExpectedTrace()
                              .entering(case_.factory, function, params)
                              .variable(case_.factory, function, "targetName", case_.farClass)
                              .exiting(case_.factory, function, params));
}

QELO_FOR_BOTH_ASSOCIATIONS(AssociationTarget);

} // namespace
} // namespace qelo::test
