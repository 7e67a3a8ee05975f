#include <ProviderException.h>

#include <gtest/gtest.h>

#include <string>
#include <type_traits>

namespace qelo::test {
namespace {

using Tesk::ProviderException;

TEST(ProviderException, Is_received_as_a_std_exception_with_its_message) {
    try {
        throw ProviderException("Failed while setting Name");
    } catch (const std::exception& caught) {
        EXPECT_STREQ(caught.what(), "Failed while setting Name");
        return;
    }
    FAIL() << "nothing was caught";
}

TEST(ProviderException, Keeps_a_copy_of_the_text) {
    std::string text = "first";
    const ProviderException exception(text.c_str());
    text = "other";
    EXPECT_STREQ(exception.what(), "first");
}

TEST(ProviderException, A_copy_has_the_same_message_in_memory_of_its_own) {
    const ProviderException original("text");
    const ProviderException copy(original); // NOLINT: the copy is what is tested
    EXPECT_STREQ(copy.what(), "text");
    EXPECT_NE(copy.what(), original.what());
}

TEST(ProviderException, Derives_from_std_exception_and_has_a_virtual_destructor) {
    EXPECT_TRUE((std::is_base_of_v<std::exception, ProviderException>));
    EXPECT_TRUE(std::has_virtual_destructor_v<ProviderException>);
    EXPECT_EQ(sizeof(ProviderException), sizeof(std::exception) + sizeof(std::string));
}

} // namespace
} // namespace qelo::test
