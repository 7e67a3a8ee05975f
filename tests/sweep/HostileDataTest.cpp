// Damaged account databases, read by the real store and served by the real provider library.
#include "DamagedDatabases.h"
#include "SweepCount.h"

#include "support/broker/RecordingBroker.h"
#include "support/platform/ProviderLibrary.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <sys/stat.h>
#include <unistd.h>

namespace qelo::test {
namespace {

namespace fs = std::filesystem;

using Place = DamagedDatabase::Place;

constexpr const char* kNameSpace = "root/cimv2";

struct ServedClass {
    const char* provider;
    const char* className;
};

constexpr ServedClass kClasses[] = {
    {"SimAccountProvider", "ZANTH_Account"},
    {"SimGroupProvider", "ZANTH_Group"},
    {"SimIdentityProvider", "ZANTH_SimIdentity"},
    {"SimAccountManagementServiceProvider", "ZANTH_AccountManagementService"},
    {"SimAccountManagementCapabilitiesProvider", "ZANTH_AccountManagementCapabilities"},
    {"SimAccountHostedServiceProvider", "ZANTH_AccountHostedService"},
    {"SimElementCapabilitiesProvider", "ZANTH_SimElementCapabilities"}};

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

class HostileData : public testing::Test {
protected:
    void SetUp() override {
        std::string pattern = (fs::temp_directory_path() / "qelo-hostile-XXXXXX").native();
        ASSERT_NE(::mkdtemp(pattern.data()), nullptr);
        root_ = pattern;
        std::ofstream(root_ / "logging.conf") << "log = none\nlog.level = off\n";
        ::setenv("QELO_LOG_CONFIG", (root_ / "logging.conf").c_str(), 1);
        ::setenv("QELO_NODE_STORE", ("accounts:" + root_.native()).c_str(), 1);
        for (const ServedClass& served : kClasses) {
            classPaths_[served.provider] = broker_.makePath(kNameSpace, served.className);
        }
        Answer<CMPIObjectPath> far;
        far.elements.push_back(
            broker_.makePath(kNameSpace, "ZANTH_ComputerSystem", {{"Name", "here"}}));
        broker_.answerInstanceNames("ZANTH_ComputerSystem", far);
        broker_.answerInstanceNames("ZANTH_AccountManagementService", far);
    }

    void TearDown() override {
        std::error_code ignored;
        fs::remove_all(root_, ignored);
    }

    void put(const DamagedDatabase& database) {
        const fs::path etc = root_ / "etc";
        fs::remove_all(etc);
        fs::create_directories(etc);
        for (const auto& [name, content] : database.files) {
            std::ofstream(etc / name, std::ios::binary) << content;
        }
        const fs::path place = etc / database.placeOf;
        switch (database.place) {
        case Place::File:
            break;
        case Place::Directory:
            fs::create_directory(place);
            break;
        case Place::Pipe:
            ASSERT_EQ(::mkfifo(place.c_str(), 0600), 0);
            break;
        case Place::LoopingLink:
            fs::create_symlink(place.filename(), place);
            break;
        case Place::Unreadable:
            std::ofstream(place) << "\n";
            fs::permissions(place, fs::perms::none);
            break;
        }
    }

    Outcome enumerate(const ServedClass& served, bool names) {
        CMPIInstanceMI* const mi =
            ProviderLibrary::instance().instanceMI(served.provider, broker_.get());
        const CMPIObjectPath* const path = classPaths_.at(served.provider);
        const Outcome outcome =
            broker_.run([&](const CMPIContext* context, const CMPIResult* result) {
                return names ? mi->ft->enumerateInstanceNames(mi, context, result, path)
                             : mi->ft->enumerateInstances(mi, context, result, path, nullptr);
            });
        EXPECT_TRUE(outcome.rc == CMPI_RC_OK || outcome.rc == CMPI_RC_ERR_FAILED) << outcome.rc;
        EXPECT_LE(broker_.doneCount(), 1);
        EXPECT_THAT(broker_.violations(), testing::IsEmpty());
        broker_.clearViolations();
        return outcome;
    }

    // The Name of everything returned; every text is UTF-8.
    std::vector<std::string> returnedNames() {
        std::vector<std::string> names;
        for (const Path& path : broker_.returnedPaths()) {
            names.push_back(path.keyText("Name"));
            EXPECT_TRUE(isUtf8(path.toString()));
        }
        for (const Instance& instance : broker_.returnedInstances()) {
            names.push_back(instance.propertyText("Name"));
            for (const NamedValue& property : instance.properties) {
                EXPECT_TRUE(isUtf8(property.value.text) || isInCodePage(property.name))
                    << property.name;
            }
        }
        return names;
    }

    static void expectServed(bool there, const char* name, const std::vector<std::string>& names) {
        if (there) {
            EXPECT_EQ(std::count(names.begin(), names.end(), name), 1) << name;
        }
    }

    // Enumerates every class both ways.
    void serve(const DamagedDatabase& database) {
        SCOPED_TRACE(database.name);
        put(database);
        for (const ServedClass& served : kClasses) {
            SCOPED_TRACE(served.className);
            enumerate(served, true);
            const std::vector<std::string> names = returnedNames();
            enumerate(served, false);
            EXPECT_EQ(returnedNames().size(), names.size());
            if (served.className == std::string("ZANTH_Account")) {
                expectServed(database.firstAccount, "first", names);
                expectServed(database.lastAccount, "last", names);
            } else if (served.className == std::string("ZANTH_Group")) {
                expectServed(database.firstGroup, "first", names);
                expectServed(database.lastGroup, "last", names);
            }
        }
    }

    fs::path root_;
    RecordingBroker broker_;
    std::map<std::string, const CMPIObjectPath*> classPaths_;
};

TEST_F(HostileData, Of_every_kind_keeps_the_undamaged_lines) {
    const std::vector<DamagedDatabase> all = damagedDatabases();
    EXPECT_GE(all.size(), 300U);
    for (const DamagedDatabase& database : all) {
        serve(database);
    }
    countFaults("damaged databases", std::size(kClasses) * 2, all.size());
}

TEST_F(HostileData, At_random_keeps_the_undamaged_lines) {
    const std::uint32_t count = isLongSweep() ? 20000 : 1000;
    for (std::uint32_t seed = 1; seed <= count; ++seed) {
        serve(randomlyDamaged(seed));
    }
    countFaults("randomly damaged databases", std::size(kClasses) * 2, count);
}

} // namespace
} // namespace qelo::test
