#include "SweptProviders.h"

#include "support/platform/ProviderLibrary.h"
#include "support/platform/SampleNodes.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <set>

namespace qelo::test {

namespace {

using namespace Tesk::NodeLexicon;

constexpr const char* kNameSpace = "root/cimv2";

bool isKnownStatus(CMPIrc rc) {
    static const std::set<int> others = {18, 27, 29, 50, 51, 60, 61, 62, 100, 200};
    return (rc >= CMPI_RC_OK && rc <= CMPI_RC_ERR_METHOD_NOT_FOUND) || others.count(rc) != 0;
}

StoreNode groupNode(const std::string& name, const std::vector<std::string>& members) {
    return {UserGroup,
            std::string(administrationPath) + "/" + name,
            {{Name, name}, {GroupMembers, members}}};
}

template <class Text> std::vector<std::string> textsOf(const std::vector<Text>& results) {
    std::vector<std::string> texts;
    for (const Text& result : results) {
        texts.push_back(result.toString());
    }
    return texts;
}

std::vector<std::string> deliveredBy(const RecordingBroker& broker) {
    std::vector<std::string> texts = textsOf(broker.returnedPaths());
    const std::vector<std::string> instances = textsOf(broker.returnedInstances());
    texts.insert(texts.end(), instances.begin(), instances.end());
    for (const Value& value : broker.returnedData()) {
        texts.push_back(value.describe());
    }
    return texts;
}

} // namespace

SweptProviders::SweptProviders() {
    registerAll(broker_.get());
    serveFar("ZANTH_ComputerSystem");
    serveFar("ZANTH_AccountManagementService");
    prepareStore();
}

SweptProviders::~SweptProviders() { registerAll(nullptr); }

void SweptProviders::registerAll(const CMPIBroker* broker) {
    const ProviderLibrary& library = ProviderLibrary::instance();
    for (const char* provider : sweptProviders) {
        interfaces_[provider].instances = library.instanceMI(provider, broker);
    }
    for (const char* provider : {"SimAccountProvider", "SimGroupProvider"}) {
        interfaces_[provider].methods = library.methodMI(provider, broker);
    }
    for (const char* provider :
         {"SimAccountHostedServiceProvider", "SimElementCapabilitiesProvider"}) {
        interfaces_[provider].associations = library.associationMI(provider, broker);
    }
}

void SweptProviders::serveFar(const char* className) {
    Answer<CMPIObjectPath> paths;
    Answer<CMPIInstance> instances;
    for (const char* name : {"zeta", "alpha"}) {
        const CMPIObjectPath* path = broker_.makePath(
            kNameSpace, className, {{"CreationClassName", className}, {"Name", name}}, "far");
        paths.elements.push_back(path);
        instances.elements.push_back(
            broker_.makeInstance(broker_.inspect(path), {{"Name", name}, {"Status", "OK"}}));
    }
    broker_.answerInstanceNames(className, paths);
    broker_.answerInstances(className, instances);
}

void SweptProviders::prepareStore() {
    platform_.reset();
    platform_.addNode(administrationNode());
    platform_.addNode(fullAccountNode("an account with quite a long name"));
    platform_.addNode(accountNode("bob"));
    platform_.addNode(groupNode("a group with quite a long name", {"root", "bob"}));
    platform_.addNode(groupNode("adm", {}));
    platform_.addNode({AccountServiceRoot, "/b", {}});
    platform_.addNode({AccountServiceRoot, "/a", {}});
    // The store holds more than was read before, so that each operation reads it anew.
    for (const NodeType type : {UserAccount, UserGroup}) {
        platform_.setEntryCount(type, 9);
    }
    // Where paths are compared, the second is the one that is looked for.
    platform_.setPathAnswers({false, true});
}

SweptRun SweptProviders::run(const SweptOperation& operation) {
    SweptRun run;
    try {
        run.outcome = broker_.run(operation.call);
    } catch (...) {
        run.threw = true;
    }
    run.done = broker_.callCount("returnDone");
    run.delivered = deliveredBy(broker_);
    return run;
}

void judgeFaultyRun(SweptProviders& providers, const SweptOperation& operation,
                    const SweptRun& good, const SweptRun& run) {
    RecordingBroker& broker = providers.broker();
    EXPECT_FALSE(run.threw);
    EXPECT_TRUE(isKnownStatus(run.outcome.rc)) << run.outcome.rc;
    EXPECT_LE(run.done, 1U);
    const std::size_t most = operation.most != 0 ? operation.most : good.delivered.size();
    EXPECT_LE(run.delivered.size(), most);
    if (operation.distinct) {
        EXPECT_EQ(std::set<std::string>(run.delivered.begin(), run.delivered.end()).size(),
                  run.delivered.size());
    }
    EXPECT_THAT(broker.violations(), testing::IsEmpty());
    EXPECT_EQ(broker.liveClones(), 0U);
    EXPECT_EQ(providers.platform().openCursors(), 0U);
    broker.clearViolations();
}

void expectGoodRun(SweptProviders& providers, const SweptRun& good, const SweptRun& run) {
    EXPECT_FALSE(run.threw);
    EXPECT_EQ(run.outcome.rc, good.outcome.rc);
    EXPECT_EQ(run.outcome.message, good.outcome.message);
    EXPECT_EQ(run.done, good.done);
    EXPECT_EQ(run.delivered, good.delivered);
    EXPECT_THAT(providers.broker().violations(), testing::IsEmpty());
    EXPECT_EQ(providers.platform().openCursors(), 0U);
}

} // namespace qelo::test
