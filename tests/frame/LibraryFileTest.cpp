// What the provider library's file offers to the loader, and which libraries it is loaded with.
#include "ElfFile.h"
#include "ProviderList.h"

#include "support/platform/ProviderLibrary.h"
#include "support/platform/RecordingPlatform.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <dlfcn.h>

#include <algorithm>
#include <fstream>
#include <set>
#include <string>

namespace qelo::test {
namespace {

using testing::ElementsAreArray;
using testing::HasSubstr;

const std::vector<std::string> platformSonames = {
    "libqeloinstrumentationenvelope.so.1",
    "libqeloCvLogger.so.1",
    "libqeloteskcommon.so.1",
    "libqelotesklocale.so.1",
    "libqeloproviderutilities.so.1",
};

std::vector<std::string> expectedFunctions() {
    std::vector<std::string> names;
    for (const ProviderKind& kind : providerKinds()) {
        const std::string prefix = std::string(kind.provider) + "_Create_";
        names.push_back(prefix + "InstanceMI");
        if (kind.methods) {
            names.push_back(prefix + "MethodMI");
        }
        if (kind.associations) {
            names.push_back(prefix + "AssociationMI");
        }
    }
    std::sort(names.begin(), names.end());
    return names;
}

// The files mapped into this process whose name begins with a soname.
std::set<std::string> mappedFiles(const std::string& soname) {
    std::ifstream maps("/proc/self/maps");
    std::set<std::string> files;
    for (std::string line; std::getline(maps, line);) {
        const std::size_t path = line.find('/');
        if (path != std::string::npos && line.find("/" + soname, path) != std::string::npos) {
            files.insert(line.substr(path));
        }
    }
    return files;
}

TEST(LibraryFile, Exports_exactly_the_eleven_factory_functions) {
    ASSERT_EQ(expectedFunctions().size(), 11U);
    EXPECT_THAT(readElfFile(ProviderLibrary::path()).definedSymbols,
                ElementsAreArray(expectedFunctions()));
}

TEST(LibraryFile, Carries_the_soname_that_object_managers_register) {
    EXPECT_EQ(readElfFile(ProviderLibrary::path()).soname,
              "libqelosimpleidentitymanagementprofileprovider.so.1");
}

TEST(LibraryFile, Needs_the_five_platform_libraries_by_their_sonames) {
    const std::vector<std::string> needed = readElfFile(ProviderLibrary::path()).needed;
    for (const std::string& soname : platformSonames) {
        EXPECT_EQ(std::count(needed.begin(), needed.end(), soname), 1) << soname;
    }
}

TEST(LibraryFile, Needs_no_other_library_of_this_project) {
    for (const std::string& name : readElfFile(ProviderLibrary::path()).needed) {
        const bool ours = name.rfind("libqelo", 0) == 0;
        const bool platform = std::find(platformSonames.begin(), platformSonames.end(), name) !=
                              platformSonames.end();
        EXPECT_TRUE(!ours || platform) << name;
    }
}

TEST(LibraryFile, Every_factory_function_can_be_resolved_by_name) {
    for (const std::string& name : expectedFunctions()) {
        EXPECT_NO_THROW(ProviderLibrary::instance().function(name)) << name;
    }
}

TEST(LibraryFile, These_tests_run_on_the_recording_platform_and_no_other) {
    ProviderLibrary::instance();
    for (const std::string& soname : platformSonames) {
        const std::set<std::string> files = mappedFiles(soname);
        ASSERT_EQ(files.size(), 1U) << soname;
        EXPECT_THAT(*files.begin(), HasSubstr("/recording/" + soname));
    }
}

TEST(LibraryFile, Loading_alone_calls_nothing_of_the_platform) {
    RecordingPlatform::instance().reset();
    ProviderLibrary::instance();
    EXPECT_EQ(RecordingPlatform::instance().lineCount(), 0U);
    EXPECT_EQ(RecordingPlatform::instance().storeCallCount(), 0U);
}

} // namespace
} // namespace qelo::test
