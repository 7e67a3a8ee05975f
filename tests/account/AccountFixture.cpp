#include "AccountFixture.h"

namespace qelo::test {

AccountFixture::AccountFixture()
    : instances_(ProviderLibrary::instance().instanceMI("SimAccountProvider", broker_.get())),
      methods_(ProviderLibrary::instance().methodMI("SimAccountProvider", broker_.get())),
      classPath_(broker_.makePath(accountNameSpace, "ZANTH_Account")) {
    platform_.reset();
    broker_.observeCalls([this](const std::string& call) { platform_.note("broker: " + call); });
}

AccountFixture::~AccountFixture() {
    EXPECT_EQ(platform_.openCursors(), 0U);
    EXPECT_THAT(broker_.violations(), testing::IsEmpty());
}

void AccountFixture::serve(const std::vector<StoreNode>& accounts) {
    platform_.addNode(administrationNode());
    for (const StoreNode& account : accounts) {
        platform_.addNode(account);
    }
}

const char** AccountFixture::listOf(const PropertyNames& properties,
                                    std::vector<const char*>& list) {
    if (!properties) {
        return nullptr;
    }
    list = *properties;
    list.push_back(nullptr);
    return list.data();
}

Outcome AccountFixture::enumNames() {
    return broker_.run([&](const CMPIContext* context, const CMPIResult* result) {
        return instances_->ft->enumerateInstanceNames(instances_, context, result, classPath_);
    });
}

Outcome AccountFixture::enumInstances(const PropertyNames& properties) {
    std::vector<const char*> list;
    const char** names = listOf(properties, list);
    return broker_.run([&](const CMPIContext* context, const CMPIResult* result) {
        return instances_->ft->enumerateInstances(instances_, context, result, classPath_, names);
    });
}

Outcome AccountFixture::getInstance(const std::vector<NamedValue>& keys,
                                    const PropertyNames& properties) {
    const CMPIObjectPath* path = broker_.makePath(accountNameSpace, "ZANTH_Account", keys);
    std::vector<const char*> list;
    const char** names = listOf(properties, list);
    return broker_.run([&](const CMPIContext* context, const CMPIResult* result) {
        return instances_->ft->getInstance(instances_, context, result, path, names);
    });
}

Outcome AccountFixture::invoke(const char* method, const CMPIArgs* in,
                               const std::string& className) {
    const CMPIObjectPath* path = broker_.makePath(accountNameSpace, className);
    CMPIArgs* out = broker_.makeArgs();
    const Outcome outcome = broker_.run([&](const CMPIContext* context, const CMPIResult* result) {
        return methods_->ft->invokeMethod(methods_, context, result, path, method, in, out);
    });
    EXPECT_THAT(broker_.inspect(out), testing::IsEmpty()) << "nothing is ever put out";
    return outcome;
}

std::vector<std::string> AccountFixture::returnedNames() const {
    std::vector<std::string> names;
    for (const Path& path : broker_.returnedPaths()) {
        names.push_back(path.keyText("Name"));
    }
    for (const Instance& instance : broker_.returnedInstances()) {
        names.push_back(instance.propertyText("Name"));
    }
    return names;
}

Instance AccountFixture::onlyInstance() const {
    const std::vector<Instance> all = broker_.returnedInstances();
    EXPECT_EQ(all.size(), 1U);
    return all.empty() ? Instance() : all.front();
}

std::vector<std::string> AccountFixture::failureTexts() const {
    std::vector<std::string> texts;
    for (const LogLine& line : platform_.lines(Sink::Log)) {
        if (line.level == 6000) {
            texts.push_back(line.message.substr(line.message.find("]: ") + 3));
        }
    }
    return texts;
}

bool AccountFixture::exitMarked() const {
    for (const LogLine& line : platform_.lines()) {
        if (line.function == "markProviderExit") {
            return true;
        }
    }
    return false;
}

std::vector<NamedValue> accountKeys(const std::string& name) {
    return {{"SystemCreationClassName", "ZANTH_ComputerSystem"},
            {"SystemName", "host.example"},
            {"CreationClassName", "ZANTH_Account"},
            {"Name", name}};
}

Value propertyOf(const Instance& instance, const std::string& name) {
    const Value* value = instance.property(name);
    EXPECT_NE(value, nullptr) << name;
    return value == nullptr ? Value() : *value;
}

void expectSuccess(const Outcome& outcome) {
    EXPECT_EQ(outcome.rc, CMPI_RC_OK);
    EXPECT_FALSE(outcome.hasMessage) << outcome.message;
}

void expectFailure(const Outcome& outcome, const std::string& message) {
    EXPECT_EQ(outcome.rc, CMPI_RC_ERR_FAILED);
    EXPECT_TRUE(outcome.hasMessage);
    EXPECT_EQ(outcome.message, message);
}

} // namespace qelo::test
