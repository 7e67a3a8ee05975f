// Failures of the near factory that it cannot show today, brought about by a factory that can.
#include "AssociationFixture.h"

#include <association/AssociationTraversal.h>
#include <association/SimAccountHostedServiceObjFactory.h>

namespace qelo::test {
namespace {

using namespace Tesk::SimpleIdentityManagementProvider;
using testing::ElementsAre;
using testing::IsEmpty;

const std::string component = "Corvane.Seam";
const Tesk::UnitTrace unitTrace(component, "Seam");

// Answers what the test has asked for.
struct ScriptedFactory {
    static int instancesResult;
    static std::vector<CMPIObjectPath*> paths;

    ScriptedFactory(bool, bool) {}
    unsigned short getNumberOfInstances() { return 0; }
    int allPaths(const CMPIBroker*, const CMPIObjectPath*, std::vector<CMPIObjectPath*>& collected,
                 CMPIStatus*) {
        collected = paths;
        return 0;
    }
    int allInstances(const CMPIBroker*, const CMPIObjectPath*, const char**, bool,
                     std::vector<CMPIInstance*>&, CMPIStatus*) {
        return instancesResult;
    }
};
int ScriptedFactory::instancesResult = 0;
std::vector<CMPIObjectPath*> ScriptedFactory::paths;

struct ScriptedAssociation {
    using Factory = ScriptedFactory;
    using Utility = SimAccountHostedServiceObjFactory;
    static const AssociationShape& shape() { return hostedServiceShape; }
};

class AssociationSeam : public testing::Test {
protected:
    AssociationSeam() {
        RecordingPlatform::instance().reset();
        Answer<CMPIObjectPath> answer;
        answer.elements = {broker_.makePath(requestNameSpace, "ZANTH_ComputerSystem")};
        broker_.answerInstanceNames("ZANTH_ComputerSystem", answer);
        ScriptedFactory::instancesResult = 0;
        ScriptedFactory::paths = {broker_.makePath(requestNameSpace, "ZANTH_Near"),
                                  broker_.makePath(requestNameSpace, "ZANTH_Near")};
    }
    ~AssociationSeam() override { EXPECT_THAT(broker_.violations(), IsEmpty()); }

    AssociationRequest request(const CMPIContext* context, const CMPIResult* result,
                               const char* sourceClass) {
        return {broker_.get(), context, result, broker_.makePath(requestNameSpace, sourceClass),
                nullptr};
    }

    std::vector<std::string> failures() const {
        std::vector<std::string> texts;
        for (const LogLine& line : RecordingPlatform::instance().lines(Sink::Log)) {
            if (line.level == 6000) {
                texts.push_back(line.message.substr(line.message.find("]: ") + 3));
            }
        }
        return texts;
    }

    RecordingBroker broker_;
};

TEST_F(AssociationSeam, Near_instances_that_cannot_be_had_fail_Associators) {
    ScriptedFactory::instancesResult = 1;
    broker_.run([&](const CMPIContext* context, const CMPIResult* result) {
        return Tesk::SimpleIdentityManagementProvider::associators<ScriptedAssociation>(
            MarkerLines(unitTrace), request(context, result, "ZANTH_ComputerSystem"),
            "ZANTH_AccountHostedService", nullptr);
    });
    EXPECT_THAT(failures(),
                ElementsAre("***Can't get ObjectPaths.                  Exiting Associators***"));
    EXPECT_EQ(broker_.doneCount(), 0);
    EXPECT_THAT(broker_.returnedInstances(), IsEmpty());
}

TEST_F(AssociationSeam, A_null_near_path_stops_the_enumeration_of_names) {
    for (CMPIObjectPath* none : {static_cast<CMPIObjectPath*>(nullptr), broker_.nullHandlePath()}) {
        RecordingPlatform::instance().forget();
        ScriptedFactory::paths[1] = none;
        broker_.run([&](const CMPIContext* context, const CMPIResult* result) {
            return enumAssociationNames<ScriptedAssociation>(
                MarkerLines(unitTrace), request(context, result, "ZANTH_AccountHostedService"));
        });
        EXPECT_THAT(failures(), ElementsAre("CMPIObjectPath is NULL"));
        EXPECT_EQ(broker_.returnedPaths().size(), 1U);
        EXPECT_EQ(broker_.doneCount(), 0);
    }
}

TEST_F(AssociationSeam, A_null_near_path_stops_the_builder) {
    for (CMPIObjectPath* none : {static_cast<CMPIObjectPath*>(nullptr), broker_.nullHandlePath()}) {
        RecordingPlatform::instance().forget();
        ScriptedFactory::paths[1] = none;
        std::vector<CMPIInstance*> instances;
        broker_.run([&](const CMPIContext* context, const CMPIResult* result) {
            CMPIStatus status = {CMPI_RC_OK, nullptr};
            EXPECT_FALSE(buildInstances<ScriptedAssociation>(
                MarkerLines(unitTrace), request(context, result, "ZANTH_AccountHostedService"),
                instances, &status));
            return status;
        });
        EXPECT_THAT(failures(), ElementsAre("CMPIObjectPath is NULL"));
        EXPECT_EQ(instances.size(), 1U) << "what was built before it";
    }
}

} // namespace
} // namespace qelo::test
