#include "HostileStore.h"

#include "support/platform/ProviderLibrary.h"

#include <gmock/gmock.h>

#include <cstdlib>
#include <fstream>

namespace qelo::test {

namespace fs = std::filesystem;

namespace {

constexpr const char* kNameSpace = "root/cimv2";

// A byte that cannot stand there in UTF-8, roughly: every lead byte has its tail.
bool isUtf8(const std::string& text) {
    for (std::size_t i = 0; i < text.size();) {
        const auto lead = static_cast<unsigned char>(text[i]);
        const std::size_t size = lead < 0x80   ? 1
                                 : lead < 0xC2 ? 0
                                 : lead < 0xE0 ? 2
                                 : lead < 0xF0 ? 3
                                 : lead < 0xF5 ? 4
                                               : 0;
        if (size == 0 || i + size > text.size()) {
            return false;
        }
        for (std::size_t tail = 1; tail < size; ++tail) {
            if ((static_cast<unsigned char>(text[i + tail]) & 0xC0U) != 0x80U) {
                return false;
            }
        }
        i += size;
    }
    return true;
}

// Converted to the code page of the process and cut at its 254th byte, in a character or not.
bool isInCodePage(const std::string& property) {
    return property == "HomeDirectory" || property == "ScriptPath";
}

void expectUtf8(const Instance& instance) {
    for (const NamedValue& property : instance.properties) {
        EXPECT_TRUE(isUtf8(property.value.text) || isInCodePage(property.name)) << property.name;
    }
}

} // namespace

Properties Served::propertiesOf(const std::string& name) const {
    Properties found;
    for (const Instance& instance : instances) {
        if (instance.propertyText("Name") != name) {
            continue;
        }
        if (!found.empty()) {
            return {};
        }
        for (const NamedValue& property : instance.properties) {
            found[property.name] = property.value.describe();
        }
    }
    return found;
}

void HostileStore::SetUp() {
    std::string pattern = (fs::temp_directory_path() / "qelo-hostile-XXXXXX").native();
    ASSERT_NE(::mkdtemp(pattern.data()), nullptr);
    root_ = pattern;
    std::ofstream(root_ / "logging.conf") << "log = none\nlog.level = off\n";
    ::setenv("QELO_LOG_CONFIG", (root_ / "logging.conf").c_str(), 1);
    ::setenv("QELO_NODE_STORE", ("accounts:" + root_.native()).c_str(), 1);
    for (const ServedClass& served : kServedClasses) {
        classPaths_[served.provider] = broker_.makePath(kNameSpace, served.className);
    }
    Answer<CMPIObjectPath> far;
    far.elements.push_back(
        broker_.makePath(kNameSpace, "ZANTH_ComputerSystem", {{"Name", "here"}}));
    broker_.answerInstanceNames("ZANTH_ComputerSystem", far);
    broker_.answerInstanceNames("ZANTH_AccountManagementService", far);
}

void HostileStore::TearDown() {
    std::error_code ignored;
    fs::remove_all(root_, ignored);
}

CMPIrc HostileStore::run(const ServedClass& served, bool names) {
    CMPIInstanceMI* const mi =
        ProviderLibrary::instance().instanceMI(served.provider, broker_.get());
    const CMPIObjectPath* const path = classPaths_.at(served.provider);
    const Outcome outcome = broker_.run([&](const CMPIContext* context, const CMPIResult* result) {
        return names ? mi->ft->enumerateInstanceNames(mi, context, result, path)
                     : mi->ft->enumerateInstances(mi, context, result, path, nullptr);
    });
    EXPECT_TRUE(outcome.rc == CMPI_RC_OK || outcome.rc == CMPI_RC_ERR_FAILED) << outcome.rc;
    EXPECT_LE(broker_.doneCount(), 1);
    EXPECT_THAT(broker_.violations(), testing::IsEmpty());
    broker_.clearViolations();
    return outcome.rc;
}

Served HostileStore::enumerate(const ServedClass& served) {
    Served found;
    run(served, true);
    for (const Path& path : broker_.returnedPaths()) {
        found.names.push_back(path.keyText("Name"));
        EXPECT_TRUE(isUtf8(path.toString()));
    }
    found.rc = run(served, false);
    found.instances = broker_.returnedInstances();
    std::vector<std::string> names;
    for (const Instance& instance : found.instances) {
        names.push_back(instance.propertyText("Name"));
        expectUtf8(instance);
    }
    EXPECT_EQ(names, found.names);
    return found;
}

} // namespace qelo::test
