// Finding and loading provider libraries, making their interfaces, and shutting them down.
#include "DispatcherFixture.h"

#include <broker/SharedLibrary.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>

namespace qelo::broker::testing {
namespace {

using ::testing::Contains;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;
using ::testing::Not;

class ScratchDirectory {
public:
    ScratchDirectory() {
        std::string pattern = (std::filesystem::temp_directory_path() / "broker-XXXXXX").string();
        path_ = mkdtemp(pattern.data());
    }
    ~ScratchDirectory() { std::filesystem::remove_all(path_); }
    void write(const std::string& name, const std::string& text) const {
        std::ofstream(path_ + "/" + name) << text;
    }
    const std::string& path() const { return path_; }

private:
    std::string path_;
};

std::string errorText(const std::string& name, const std::vector<std::string>& directories) {
    try {
        return "found " + findLibrary(name, directories);
    } catch (const LibraryError& error) {
        return error.what();
    }
}

TEST(LibraryNameTest, The_first_directory_that_has_the_library_counts) {
    const ScratchDirectory first;
    const ScratchDirectory second;
    second.write("libx.so.1", "");
    EXPECT_EQ(findLibrary("x", {first.path(), second.path()}), second.path() + "/libx.so.1");
    second.write("libx.so", "");
    EXPECT_EQ(findLibrary("x", {first.path(), second.path()}), second.path() + "/libx.so");
    first.write("libx.so.1", "");
    EXPECT_EQ(findLibrary("x", {first.path(), second.path()}), first.path() + "/libx.so.1");
}

TEST(LibraryNameTest, An_absolute_path_is_taken_as_it_is) {
    EXPECT_EQ(findLibrary("/opt/lib/libx.so.7", {}), "/opt/lib/libx.so.7");
}

TEST(LibraryNameTest, A_name_cannot_leave_the_directories) {
    for (const char* name : {"../x", "sub/x", "..", "x/../../y", "", "x\ny"}) {
        EXPECT_THAT(errorText(name, {"/tmp"}),
                    HasSubstr("is neither a library name nor an absolute path"))
            << name;
    }
}

TEST(LibraryNameTest, A_missing_library_names_the_places_that_were_searched) {
    EXPECT_EQ(errorText("x", {"/nonexistent/a", "/nonexistent/b"}),
              "there is no libx.so or libx.so.1 in /nonexistent/a, /nonexistent/b");
    EXPECT_THAT(errorText("x", {}), HasSubstr("no directory at all"));
}

class LoaderTest : public DispatcherTest {
protected:
    client::CimError enumerationError(const char* className) {
        return errorOf([&] { names(className); });
    }
};

TEST_F(LoaderTest, A_library_that_does_not_exist_is_an_error_of_the_request) {
    add("TEST_X", "X", "doesnotexist");
    const auto error = enumerationError("TEST_X");
    EXPECT_EQ(error.code(), 1U);
    EXPECT_THAT(error.what(), HasSubstr("provider X: there is no libdoesnotexist.so"));
}

TEST_F(LoaderTest, A_file_that_is_no_library_is_an_error_with_the_loaders_text) {
    const ScratchDirectory scratch;
    scratch.write("libtext.so", "not a library");
    add("TEST_X", "X", (scratch.path() + "/libtext.so").c_str());
    EXPECT_THAT(enumerationError("TEST_X").what(), HasSubstr("libtext.so: "));
}

TEST_F(LoaderTest, A_library_with_unresolved_symbols_is_refused) {
    add("TEST_X", "X", "testunresolved");
    EXPECT_THAT(enumerationError("TEST_X").what(), HasSubstr("aFunctionThatNobodyDefines"));
}

TEST_F(LoaderTest, A_missing_factory_is_named) {
    add("TEST_X", "X", "testempty");
    const auto error = enumerationError("TEST_X");
    EXPECT_EQ(error.code(), 1U);
    EXPECT_THAT(error.what(), HasSubstr("libtestempty.so has no function X_Create_InstanceMI"));
}

TEST_F(LoaderTest, A_relative_path_is_refused) {
    add("TEST_X", "X", "../providers/testplain");
    EXPECT_THAT(enumerationError("TEST_X").what(), HasSubstr("is neither a library name"));
}

TEST_F(LoaderTest, A_refusing_factory_gives_its_reason) {
    add("TEST_X", "Refusing", "testwidgets");
    const auto error = enumerationError("TEST_X");
    EXPECT_EQ(error.code(), 2U);
    EXPECT_STREQ(error.what(), "not on this machine");
}

TEST_F(LoaderTest, A_factory_that_gives_nothing_and_no_reason_fails) {
    add("TEST_X", "Silent", "testwidgets");
    EXPECT_THAT(enumerationError("TEST_X").what(), HasSubstr("gave nothing and no reason"));
}

TEST_F(LoaderTest, A_factory_that_throws_fails) {
    add("TEST_X", "Throwing", "testwidgets");
    EXPECT_THAT(enumerationError("TEST_X").what(), HasSubstr("threw: no paint"));
}

TEST_F(LoaderTest, An_interface_without_a_table_is_refused) {
    add("TEST_X", "Tableless", "testwidgets");
    EXPECT_THAT(enumerationError("TEST_X").what(), HasSubstr("without a valid table"));
}

TEST_F(LoaderTest, A_factory_that_asks_for_its_own_class_gets_an_error_not_a_deadlock) {
    add("TEST_Eager", "Eager", "testwidgets");
    EXPECT_THAT(enumerationError("TEST_Eager").what(), HasSubstr("while it is being loaded"));
}

TEST_F(LoaderTest, A_factory_is_asked_again_after_it_failed) {
    dispatcher->add({"TEST_X", {nameSpace}, "Slow", "testwidgets", {ProviderType::Method}});
    const auto code = [&] {
        return errorOf([&] { connection->invokeMethod(classPath("TEST_X"), "M", {}); }).code();
    };
    EXPECT_EQ(code(), 1U);
    EXPECT_EQ(code(), 7U); // it exists now, but its slot is empty
}

TEST_F(LoaderTest, The_generic_factory_makes_what_has_no_factory_of_its_own) {
    add("TEST_X", "Anything", "testplain");
    EXPECT_EQ(names("TEST_X").size(), 1U);
    add("TEST_Y", "Unwanted", "testplain");
    const auto error = errorOf([&] { connection->getInstance(classPath("TEST_Y"), {}); });
    EXPECT_EQ(error.code(), 6U);
    EXPECT_STREQ(error.what(), "no such interface");
}

TEST_F(LoaderTest, A_provider_is_loaded_when_it_is_first_needed_and_only_once) {
    EXPECT_THAT(log(), IsEmpty());
    names("TEST_Widget");
    names("TEST_Widget");
    EXPECT_THAT(log(), Contains("create: init root/test").Times(1));
}

TEST_F(LoaderTest, Everything_can_be_loaded_at_once_to_see_what_fails) {
    EXPECT_THAT(dispatcher->loadAll(), IsEmpty());
    add("TEST_X", "Missing", "testempty");
    add("TEST_Y", "Refusing", "testwidgets");
    EXPECT_THAT(dispatcher->loadAll(),
                ElementsAre(HasSubstr("TEST_X: provider Missing"), "TEST_Y: not on this machine"));
}

TEST_F(LoaderTest, Clean_up_runs_once_at_the_end_whatever_it_throws) {
    EXPECT_THAT(dispatcher->loadAll(), IsEmpty());
    dispatcher->shutdown();
    EXPECT_THAT(log(), Contains("cleanup: Widget terminating").Times(1));
    EXPECT_THAT(log(), Contains(": Level threw: cannot clean up"));
    connection.reset();
    dispatcher.reset();
    EXPECT_THAT(log(), Contains("cleanup: Widget terminating").Times(1));
}

TEST_F(LoaderTest, A_clean_up_that_asks_for_its_own_class_gets_an_error) {
    names("TEST_Widget");
    dispatcher->shutdown();
    EXPECT_THAT(log(), Contains("last words: provider Widget: it is being shut down"));
}

TEST_F(LoaderTest, All_interfaces_of_a_provider_are_made_before_the_first_is_used) {
    names("TEST_Widget");
    EXPECT_THAT(log(), ElementsAre("create: init root/test", "create: method interface"));
}

TEST_F(LoaderTest, A_provider_that_was_never_used_is_not_cleaned_up) {
    dispatcher->shutdown();
    EXPECT_THAT(log(), Not(Contains(HasSubstr("cleanup"))));
}

TEST_F(LoaderTest, After_a_shutdown_providers_are_loaded_again) {
    EXPECT_EQ(names("TEST_Plain").size(), 1U);
    dispatcher->shutdown();
    EXPECT_EQ(names("TEST_Plain").size(), 1U);
}

// ---- Registrations

std::string refusal(Dispatcher& dispatcher, const ProviderRegistration& registration) {
    try {
        dispatcher.add(registration);
        return "accepted";
    } catch (const std::invalid_argument& error) {
        return error.what();
    }
}

TEST_F(LoaderTest, Incomplete_registrations_are_refused) {
    const ProviderRegistration whole = {
        "TEST_X", {nameSpace}, "X", "testempty", {ProviderType::Instance}};
    ProviderRegistration part = whole;
    part.className.clear();
    EXPECT_THAT(refusal(*dispatcher, part), HasSubstr("no class"));
    part = whole;
    part.nameSpaces.clear();
    EXPECT_THAT(refusal(*dispatcher, part), HasSubstr("no namespace"));
    part = whole;
    part.provider.clear();
    EXPECT_THAT(refusal(*dispatcher, part), HasSubstr("no provider"));
    part = whole;
    part.library.clear();
    EXPECT_THAT(refusal(*dispatcher, part), HasSubstr("no library"));
    part = whole;
    part.types = {};
    EXPECT_THAT(refusal(*dispatcher, part), HasSubstr("no provider type"));
    EXPECT_EQ(refusal(*dispatcher, whole), "accepted");
}

TEST_F(LoaderTest, A_class_has_one_provider_of_a_type) {
    EXPECT_THAT(
        refusal(*dispatcher,
                {"test_widget", {"Root/Test/"}, "Other", "testempty", {ProviderType::Instance}}),
        HasSubstr("already has a provider of type Instance: Widget"));
    EXPECT_EQ(
        refusal(*dispatcher,
                {"TEST_Widget", {"root/third"}, "Other", "testempty", {ProviderType::Instance}}),
        "accepted");
    EXPECT_EQ(dispatcher->registrations().size(), 6U);
}

} // namespace
} // namespace qelo::broker::testing
