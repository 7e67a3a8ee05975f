#include "AssociationFixture.h"

#include <algorithm>

namespace qelo::test {

const AssociationCase& hostedService() {
    static const AssociationCase association = {
        "SimAccountHostedService",
        "ZANTH_AccountHostedService",
        "ZANTH_ComputerSystem",
        "Antecedent",
        "ZANTH_AccountManagementService",
        "Dependent",
        "Name",
        "SimAccountManagementService_node:",
        true,
        {"Corvane.SimAccountHostedServiceProvider", "SimAccountHostedServiceProvider"},
        {"Corvane.SimAccountHostedServiceObjFactory", "SimAccountHostedServiceObjFactory"},
        "Create CMPIObjectPath failed for ComputerSystemClass.",
        "Create CMPIObjectPath failed for                      ZANTH_SimAccountHostedService.",
        "Create CMPIObjectPath failed for                      ZANTH_SimAccountHostedService",
        {1, "SimAccountManagementServiceProvider", "***No instance found***"},
        {2, "SimAccountManagementServiceProvider",
         "Create CMPIObjectPath                     failed for RecordLogClass."},
        "Create CMPIObjectPath failed."};
    return association;
}

const AssociationCase& elementCapabilities() {
    static const AssociationCase association = {
        "SimElementCapabilities",
        "ZANTH_SimElementCapabilities",
        "ZANTH_AccountManagementService",
        "ManagedElement",
        "ZANTH_AccountManagementCapabilities",
        "Capabilities",
        "InstanceID",
        "SimAccountManagementCapabilities_node:",
        false,
        {"Corvane.SimElementCapabilitiesProvider", "SimElementCapabilitiesProvider"},
        {"Corvane.SimElementCapabilitiesObjFactory", "SimElementCapabilitiesObjFactory"},
        "Create CMPIObjectPath failed for accountManagementServiceClass.",
        "Create CMPIObjectPath failed for                      ZANTH_SimElementCapabilities.",
        "Create CMPIObjectPath failed for                      ZANTH_SimElementCapabilities",
        {2, "SimAccountManagementCapabilitiesProvider", "***No instance found***"},
        {2, "SimAccountManagementCapabilitiesProvider",
         "Create CMPIObjectPath failed for                     SimAccountManagementCapabilities "
         "class"},
        "Create CMPIObjectPath failed"};
    return association;
}

namespace {

// The fixture's parameter is not yet reachable as a member where the base is made.
ProviderUnderTest providerOf(const AssociationCase& association) {
    return {association.provider.file, association.className, false, true};
}

std::string pairText(const Value* far, const Value* near, const char* nearKey) {
    if (far == nullptr || near == nullptr || !far->path || !near->path) {
        return "no pair";
    }
    return far->path->keyText("Name") + "|" + near->path->keyText(nearKey);
}

} // namespace

AssociationFixture::AssociationFixture()
    : ProviderFixture(
          providerOf(*testing::WithParamInterface<const AssociationCase*>::GetParam())) {}

void AssociationFixture::serveNear(const std::vector<std::string>& paths) {
    for (const std::string& path : paths) {
        platform_.addNode({Tesk::NodeLexicon::AccountServiceRoot, path, {}});
    }
}

void AssociationFixture::serveFar(const std::vector<std::string>& names) {
    Answer<CMPIObjectPath> paths;
    Answer<CMPIInstance> instances;
    for (const std::string& name : names) {
        const CMPIObjectPath* path = farPath(name);
        paths.elements.push_back(path);
        instances.elements.push_back(
            broker_.makeInstance(broker_.inspect(path), {{"Name", name}, {"Status", "OK"}}));
    }
    broker_.answerInstanceNames(case_.farClass, paths);
    broker_.answerInstances(case_.farClass, instances);
}

void AssociationFixture::serveTwoAndThree() {
    serveFar({"zeta", "alpha"});
    serveNear({"/c", "/a", "/b"});
}

const CMPIObjectPath* AssociationFixture::farPath(const std::string& name) {
    return broker_.makePath(requestNameSpace, case_.farClass,
                            {{"CreationClassName", case_.farClass}, {"Name", name}}, "far.example");
}

const CMPIObjectPath* AssociationFixture::nearPath(const std::string& path) {
    return broker_.makePath(requestNameSpace, case_.nearClass, {{case_.nearKey, nearId(path)}});
}

std::vector<std::string> AssociationFixture::pairs(const std::vector<std::string>& far,
                                                   const std::vector<std::string>& near) const {
    std::vector<std::string> all;
    for (const std::string& name : far) {
        for (const std::string& path : near) {
            all.push_back(name + "|" + nearId(path));
        }
    }
    return all;
}

std::vector<std::string> AssociationFixture::returnedPairs() const {
    std::vector<std::string> all;
    for (const Path& path : broker_.returnedPaths()) {
        all.push_back(pairText(path.key(case_.farRole), path.key(case_.nearRole), case_.nearKey));
    }
    for (const Instance& instance : broker_.returnedInstances()) {
        all.push_back(pairText(instance.property(case_.farRole), instance.property(case_.nearRole),
                               case_.nearKey));
    }
    return all;
}

void AssociationFixture::failPathOf(const std::string& className, unsigned int k,
                                    const Fault& fault, const std::function<void()>& operation) {
    broker_.clearFaults();
    operation();
    const std::string wanted =
        "newObjectPath(" + std::string(requestNameSpace) + "," + className + ")";
    unsigned int number = 0;
    for (const std::string& call : broker_.calls()) {
        number += call.find("newObjectPath(") == 0 ? 1 : 0;
        if (call == wanted && --k == 0) {
            broker_.failSlot("newObjectPath", number, fault);
            platform_.forget();
            return;
        }
    }
    ADD_FAILURE() << "the operation asks for no such path: " << wanted;
}

void AssociationFixture::expectLines(const std::string& operation, bool ends,
                                     const std::vector<std::string>& told) const {
    const std::string function = std::string(case_.prefix) + "_" + operation;
    ExpectedTrace expected;
    expected.providerEntry(case_.provider, function);
    std::vector<std::string> recorded = pointsOf(case_.provider);
    if (ends) {
        expected.providerExit(case_.provider, function);
    }
    // A message may stand in a function of its own, so it is compared by text below.
    const std::string message = std::string("6000 ") + case_.provider.component + " ";
    recorded.erase(
        std::remove_if(recorded.begin(), recorded.end(),
                       [&](const std::string& point) { return point.find(message) == 0; }),
        recorded.end());
    expectSamePoints(recorded, expected);
    EXPECT_THAT(messages(), testing::ElementsAreArray(told));
}

void AssociationFixture::expectNormalEnd(const Outcome& outcome,
                                         const std::string& operation) const {
    expectOk(outcome);
    EXPECT_EQ(broker_.doneCount(), 1);
    expectLines(operation, true);
}

void AssociationFixture::expectFailedStep(const std::string& operation,
                                          const std::string& text) const {
    EXPECT_EQ(broker_.doneCount(), 0);
    expectLines(operation, false, {text});
}

void expectBroken(const Outcome& outcome) {
    EXPECT_EQ(outcome.rc, CMPI_RC_ERR_ACCESS_DENIED);
    EXPECT_EQ(outcome.message, "no access");
}

} // namespace qelo::test
