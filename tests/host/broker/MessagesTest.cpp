// Message texts, their arguments and their translations.
#include "BrokerFixture.h"

#include <map>

namespace qelo::broker::testing {
namespace {

class MapCatalog : public MessageCatalog {
public:
    explicit MapCatalog(std::map<std::string, std::string> texts) : texts_(std::move(texts)) {}
    std::optional<std::string> text(const std::string& id) const override {
        const auto found = texts_.find(id);
        return found == texts_.end() ? std::nullopt : std::make_optional(found->second);
    }

private:
    std::map<std::string, std::string> texts_;
};

class MessagesTest : public BrokerTest {
protected:
    const CMPIBrokerEncFT& eft() { return *mb()->eft; }
};

TEST_F(MessagesTest, Arguments_of_every_type_take_their_places) {
    const CMPIString* made =
        eft().getMessage(mb(), "ID", "$0 $1 $2 $3 $4 $5 $6 $7", &st, 8, CMPI_sint32, -1L,
                         CMPI_uint32, 2UL, CMPI_sint64, -3LL, CMPI_uint64, 4ULL, CMPI_real64, 1.5,
                         CMPI_boolean, 1, CMPI_chars, "text", CMPI_string, string("string"));
    EXPECT_EQ(rc(), CMPI_RC_OK);
    EXPECT_EQ(text(made), "-1 2 -3 4 1.5 true text string");
}

TEST_F(MessagesTest, Places_can_come_in_any_order_and_repeat) {
    EXPECT_EQ(
        text(eft().getMessage(mb(), "ID", "$1$0$1 $2 $", &st, 2, CMPI_chars, "a", CMPI_chars, "b")),
        "bab $2 $");
}

TEST_F(MessagesTest, Null_texts_are_empty) {
    EXPECT_EQ(text(eft().getMessage(mb(), nullptr, "<$0$1>", &st, 2, CMPI_chars, nullptr,
                                    CMPI_string, nullptr)),
              "<>");
    EXPECT_EQ(text(eft().getMessage(mb(), "ID", nullptr, &st, 0)), "");
    EXPECT_EQ(rc(), CMPI_RC_OK);
}

TEST_F(MessagesTest, An_unknown_argument_type_leaves_the_text_unexpanded) {
    EXPECT_EQ(text(eft().getMessage(mb(), "ID", "x $0", &st, 1, CMPI_uint8, 1)), "x $0");
    EXPECT_EQ(rc(), CMPI_RC_ERR_TYPE_MISMATCH);
}

TEST_F(MessagesTest, More_than_ten_arguments_are_refused) {
    EXPECT_EQ(text(eft().getMessage(mb(), "ID", "x $0", &st, 11)), "x $0");
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_PARAMETER);
}

TEST_F(MessagesTest, A_bad_broker_still_gets_the_text) {
    EXPECT_EQ(text(eft().getMessage(nullptr, "ID", "x $0", &st, 0)), "x $0");
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_HANDLE);
}

TEST_F(MessagesTest, Without_translations_no_file_opens) {
    int something = 0;
    CMPIMsgFileHandle handle = &something;
    EXPECT_EQ(eft().openMessageFile(mb(), "file", &handle).rc, CMPI_RC_ERR_NOT_FOUND);
    EXPECT_EQ(handle, nullptr);
    EXPECT_EQ(text(eft().getMessage2(mb(), "ID", nullptr, "$0!", &st, 1, CMPI_chars, "hi")), "hi!");
    EXPECT_EQ(rc(), CMPI_RC_OK);
    EXPECT_EQ(eft().closeMessageFile(mb(), nullptr).rc, CMPI_RC_OK);
    EXPECT_EQ(eft().closeMessageFile(mb(), &something).rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(eft().openMessageFile(mb(), nullptr, &handle).rc, CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_EQ(eft().openMessageFile(mb(), "file", nullptr).rc, CMPI_RC_ERR_INVALID_PARAMETER);
}

TEST_F(MessagesTest, A_translation_takes_the_place_of_the_default_text) {
    hooks.openCatalog = [](const std::string& file) -> std::shared_ptr<const MessageCatalog> {
        if (file != "ours") {
            return nullptr;
        }
        return std::make_shared<MapCatalog>(
            std::map<std::string, std::string>{{"ID", "$0 übersetzt"}});
    };
    CMPIMsgFileHandle handle = nullptr;
    EXPECT_EQ(eft().openMessageFile(mb(), "theirs", &handle).rc, CMPI_RC_ERR_NOT_FOUND);
    EXPECT_EQ(eft().openMessageFile(mb(), "ours", &handle).rc, CMPI_RC_OK);
    ASSERT_NE(handle, nullptr);
    EXPECT_EQ(text(eft().getMessage2(mb(), "ID", handle, "$0", &st, 1, CMPI_chars, "hi")),
              "hi übersetzt");
    EXPECT_EQ(text(eft().getMessage2(mb(), "Other", handle, "<$0>", &st, 1, CMPI_chars, "hi")),
              "<hi>");
    CMPIMsgFileHandle second = nullptr;
    EXPECT_EQ(eft().openMessageFile(mb(), "ours", &second).rc, CMPI_RC_OK);
    EXPECT_NE(second, handle);
    EXPECT_EQ(eft().closeMessageFile(mb(), handle).rc, CMPI_RC_OK);
    EXPECT_EQ(eft().closeMessageFile(mb(), handle).rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(text(eft().getMessage2(mb(), "ID", handle, "default", &st, 0)), "default");
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(eft().closeMessageFile(mb(), second).rc, CMPI_RC_OK);
}

} // namespace
} // namespace qelo::broker::testing
