#include "SweptLibrary.h"

#include "WatchedResult.h"

#include "support/platform/ProviderLibrary.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <set>

namespace qelo::test {

namespace {

constexpr const char* kNameSpace = "root/cimv2";

bool isKnownStatus(CMPIrc rc) {
    static const std::set<int> others = {18, 27, 29, 50, 51, 60, 61, 62, 100, 200};
    return (rc >= CMPI_RC_OK && rc <= CMPI_RC_ERR_METHOD_NOT_FOUND) || others.count(rc) != 0;
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

SweptLibrary::SweptLibrary() {
    registerAll(broker_.get());
    serveFar("ZANTH_ComputerSystem");
    serveFar("ZANTH_AccountManagementService");
}

SweptLibrary::~SweptLibrary() { registerAll(nullptr); }

void SweptLibrary::registerAll(const CMPIBroker* broker) {
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

void SweptLibrary::serveFar(const char* className) {
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

SweptRun SweptLibrary::run(const SweptOperation& operation) {
    SweptRun run;
    const auto watched = [&](const CMPIContext* context, const CMPIResult* result) {
        const WatchedResult watching(result);
        const CMPIStatus status = operation.call(context, watching.get());
        run.oneTwice = watching.gotOneTwice();
        return status;
    };
    try {
        run.outcome = broker_.run(watched);
    } catch (...) {
        run.threw = true;
    }
    if (!operation.distinct) {
        run.madeTwice = madeTwice(broker_.calls());
    }
    run.done = broker_.callCount("returnDone");
    run.delivered = deliveredBy(broker_);
    return run;
}

void judgeFaultyRun(SweptLibrary& library, const SweptOperation& operation, const SweptRun& good,
                    const SweptRun& run) {
    RecordingBroker& broker = library.broker();
    EXPECT_FALSE(run.threw);
    EXPECT_TRUE(isKnownStatus(run.outcome.rc)) << run.outcome.rc;
    EXPECT_LE(run.done, 1U);
    const std::size_t most = operation.most != 0 ? operation.most : good.delivered.size();
    EXPECT_LE(run.delivered.size(), most);
    EXPECT_FALSE(run.oneTwice);
    if (operation.distinct && !operation.alike) {
        EXPECT_EQ(std::set<std::string>(run.delivered.begin(), run.delivered.end()).size(),
                  run.delivered.size());
    } else if (!operation.alike) {
        EXPECT_THAT(run.madeTwice, testing::IsEmpty());
    }
    EXPECT_THAT(broker.violations(), testing::IsEmpty());
    EXPECT_EQ(broker.liveClones(), 0U);
    broker.clearViolations();
}

void expectGoodRun(SweptLibrary& library, const SweptRun& good, const SweptRun& run) {
    EXPECT_FALSE(run.threw);
    EXPECT_EQ(run.outcome.rc, good.outcome.rc);
    EXPECT_EQ(run.outcome.message, good.outcome.message);
    EXPECT_EQ(run.done, good.done);
    EXPECT_EQ(run.delivered, good.delivered);
    EXPECT_FALSE(run.oneTwice);
    EXPECT_THAT(run.madeTwice, testing::IsEmpty());
    EXPECT_THAT(library.broker().violations(), testing::IsEmpty());
}

} // namespace qelo::test
