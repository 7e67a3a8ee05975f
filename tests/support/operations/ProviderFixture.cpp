#include "ProviderFixture.h"

namespace qelo::test {

ProviderFixture::ProviderFixture(const ProviderUnderTest& provider)
    : provider_(provider), classPath_(broker_.makePath(requestNameSpace, provider.className)) {
    registerBroker(broker_.get());
    platform_.reset();
    broker_.observeCalls([this](const std::string& call) { platform_.note("broker: " + call); });
}

ProviderFixture::~ProviderFixture() {
    EXPECT_EQ(platform_.openCursors(), 0U);
    EXPECT_THAT(broker_.violations(), testing::IsEmpty());
    EXPECT_EQ(broker_.liveClones(), 0U);
    registerBroker(nullptr);
}

void ProviderFixture::registerBroker(const CMPIBroker* broker) {
    const ProviderLibrary& library = ProviderLibrary::instance();
    instances_ = library.instanceMI(provider_.provider, broker);
    if (provider_.methods) {
        methods_ = library.methodMI(provider_.provider, broker);
    }
    if (provider_.associations) {
        associations_ = library.associationMI(provider_.provider, broker);
    }
}

const char** propertyList(const PropertyNames& properties, std::vector<const char*>& list) {
    if (!properties) {
        return nullptr;
    }
    list = *properties;
    list.push_back(nullptr);
    return list.data();
}

Outcome ProviderFixture::enumNames() {
    return broker_.run([&](const CMPIContext* context, const CMPIResult* result) {
        return instances_->ft->enumerateInstanceNames(instances_, context, result, classPath_);
    });
}

Outcome ProviderFixture::enumInstances(const PropertyNames& properties) {
    std::vector<const char*> list;
    const char** names = propertyList(properties, list);
    return broker_.run([&](const CMPIContext* context, const CMPIResult* result) {
        return instances_->ft->enumerateInstances(instances_, context, result, classPath_, names);
    });
}

Outcome ProviderFixture::getInstance(const std::vector<NamedValue>& keys,
                                     const PropertyNames& properties) {
    const CMPIObjectPath* path = broker_.makePath(requestNameSpace, provider_.className, keys);
    std::vector<const char*> list;
    const char** names = propertyList(properties, list);
    return broker_.run([&](const CMPIContext* context, const CMPIResult* result) {
        return instances_->ft->getInstance(instances_, context, result, path, names);
    });
}

Outcome ProviderFixture::invoke(const char* method, const CMPIArgs* in,
                                const std::string& className) {
    const CMPIObjectPath* path = broker_.makePath(
        requestNameSpace, className.empty() ? provider_.className : className.c_str());
    CMPIArgs* out = broker_.makeArgs();
    const Outcome outcome = broker_.run([&](const CMPIContext* context, const CMPIResult* result) {
        return methods_->ft->invokeMethod(methods_, context, result, path, method, in, out);
    });
    EXPECT_THAT(broker_.inspect(out), testing::IsEmpty()) << "nothing is ever put out";
    return outcome;
}

Outcome ProviderFixture::associators(const CMPIObjectPath* source,
                                     const AssociationFilters& filters,
                                     const PropertyNames& properties) {
    std::vector<const char*> list;
    const char** names = propertyList(properties, list);
    return broker_.run([&](const CMPIContext* context, const CMPIResult* result) {
        return associations_->ft->associators(associations_, context, result, source,
                                              filters.assocClass, filters.resultClass, filters.role,
                                              filters.resultRole, names);
    });
}

Outcome ProviderFixture::associatorNames(const CMPIObjectPath* source,
                                         const AssociationFilters& filters) {
    return broker_.run([&](const CMPIContext* context, const CMPIResult* result) {
        return associations_->ft->associatorNames(associations_, context, result, source,
                                                  filters.assocClass, filters.resultClass,
                                                  filters.role, filters.resultRole);
    });
}

Outcome ProviderFixture::references(const CMPIObjectPath* source, const char* resultClass,
                                    const PropertyNames& properties) {
    std::vector<const char*> list;
    const char** names = propertyList(properties, list);
    return broker_.run([&](const CMPIContext* context, const CMPIResult* result) {
        return associations_->ft->references(associations_, context, result, source, resultClass,
                                             nullptr, names);
    });
}

Outcome ProviderFixture::referenceNames(const CMPIObjectPath* source, const char* resultClass) {
    return broker_.run([&](const CMPIContext* context, const CMPIResult* result) {
        return associations_->ft->referenceNames(associations_, context, result, source,
                                                 resultClass, nullptr);
    });
}

std::vector<std::string> ProviderFixture::returned(const std::string& name) const {
    std::vector<std::string> texts;
    for (const Path& path : broker_.returnedPaths()) {
        texts.push_back(path.keyText(name));
    }
    for (const Instance& instance : broker_.returnedInstances()) {
        texts.push_back(instance.propertyText(name));
    }
    return texts;
}

Instance ProviderFixture::onlyInstance() const {
    const std::vector<Instance> all = broker_.returnedInstances();
    EXPECT_EQ(all.size(), 1U);
    return all.empty() ? Instance() : all.front();
}

Path ProviderFixture::onlyPath() const {
    const std::vector<Path> all = broker_.returnedPaths();
    EXPECT_EQ(all.size(), 1U);
    return all.empty() ? Path() : all.front();
}

namespace {

// The points of those lines that `chosen` takes.
template <class Chosen> std::vector<std::string> pointsWhere(Chosen chosen) {
    std::vector<LogLine> lines;
    for (const LogLine& line : RecordingPlatform::instance().lines()) {
        if (chosen(line)) {
            lines.push_back(line);
        }
    }
    return tracePoints(lines);
}

} // namespace

std::vector<std::string> ProviderFixture::pointsOf(Unit unit) const {
    return pointsWhere([&](const LogLine& line) {
        return line.component == unit.component && (line.file == unit.file || line.file == "Trace");
    });
}

std::vector<std::string> ProviderFixture::pointsIn(const std::string& function) const {
    return pointsWhere([&](const LogLine& line) { return line.function == function; });
}

std::vector<std::string> ProviderFixture::messages(int level) const {
    std::vector<std::string> texts;
    for (const LogLine& line : platform_.lines(Sink::Log)) {
        const bool message = line.message.compare(0, 8, "MESSAGE ") == 0;
        if (message && line.level == level) {
            texts.push_back(line.message.substr(line.message.find("]: ") + 3));
        }
    }
    return texts;
}

bool ProviderFixture::exitMarked() const { return !pointsIn("markProviderExit").empty(); }

void ProviderFixture::expectNothingReturned() const {
    EXPECT_THAT(broker_.returnedInstances(), testing::IsEmpty());
    EXPECT_THAT(broker_.returnedPaths(), testing::IsEmpty());
    EXPECT_THAT(broker_.returnedData(), testing::IsEmpty());
}

void expectOk(const Outcome& outcome) {
    EXPECT_EQ(outcome.rc, CMPI_RC_OK);
    EXPECT_FALSE(outcome.hasMessage) << outcome.message;
}

void expectFailed(const Outcome& outcome, const std::string& message) {
    EXPECT_EQ(outcome.rc, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(outcome.hasMessage, !message.empty());
    EXPECT_EQ(outcome.message, message);
}

} // namespace qelo::test
