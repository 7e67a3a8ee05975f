#include "NodeFile.h"
#include "FakeFiles.h"
#include "StoreListing.h"
#include "TestLog.h"
#include "Text.h"

#include <gmock/gmock.h>

#include <cerrno>

namespace qelo::nodes::tests {

namespace {

using namespace Tesk::NodeLexicon;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

const std::string example = R"({"nodes": [
    {"type": 17, "path": "/UserAdministration/1", "properties": {}},
    {"type": 46, "path": "/UserAdministration/1/UserAccount/alice",
     "properties": {"108": "alice", "123": 1, "137": [1, 2], "165": ["a", "b"], "44": []}},
    {"type": 46, "path": "/UserAdministration/1/UserAccount/bob",
     "properties": {"108": "bob", "123": 4294967295}},
    {"type": 46, "path": "/Elsewhere/UserAccount/carol", "properties": {"108": "carol"}},
    {"type": 40, "path": "/AccountServiceRoot/7"}]})";

std::string withProperty(const std::string& member) {
    return R"({"nodes":[{"type":17,"path":"/u"},{"type":46,"path":"/u/a","properties":{)" + member +
           "}}]}";
}

class NodeFileStore : public testing::Test {
protected:
    NodeFileStore() {
        clearLog();
        files.put("/n.json", example);
    }
    FakeFiles files;
    std::shared_ptr<NodeStore> store = makeStore("file:/n.json", files);
};

struct Refused {
    std::string text;
    std::string error;
};

std::vector<Refused> refusedValues() {
    const std::string kind = "a value cannot be ";
    return {{R"("123":-1)", kind + "a negative number"},
            {R"("123":-0)", kind + "a negative number"},
            {R"("123":4294967296)", kind + "a number above 4294967295"},
            {R"("123":18446744073709551615)", kind + "a number above 4294967295"},
            {R"("123":18446744073709551616)", kind + "a number with a fraction"},
            {R"("123":1.0)", kind + "a number with a fraction"},
            {R"("123":1e3)", kind + "a number with a fraction"},
            {R"("123":null)", kind + "null"},
            {R"("123":true)", kind + "true or false"},
            {R"("123":{})", kind + "an object"},
            {R"("137":[1,-2])", kind + "a negative number"},
            {R"("137":[1,null])", kind + "null"},
            {R"("137":[[1]])", kind + "a list"},
            {R"("137":[{}])", kind + "an object"},
            {R"("137":[1,"a"])", "not of both"},
            {R"("137":["a",1])", "not of both"},
            {R"("137":[1.5])", kind + "a number with a fraction"}};
}

std::vector<Refused> refusedDocuments() {
    return {{R"([])", "document: an object is needed, not a list"},
            {R"(1)", "an object is needed, not a number"},
            {R"("x")", "an object is needed, not a text"},
            {R"(null)", "an object is needed, not null"},
            {R"({})", "\"nodes\" is missing"},
            {R"({"nodes":{}})", "\"nodes\" has to be a list"},
            {R"({"nodes":null})", "\"nodes\" has to be a list"},
            {R"({"nodes":[],"nodes":[]})", "\"nodes\" is given twice"},
            {R"({"nodes":[],"more":1})", "unknown member \"more\""},
            {R"({"nodes":[1]})", "node 0: has to be an object"},
            {R"({"nodes":[[]]})", "node 0: has to be an object"},
            {R"({"nodes":[{}]})", "node 0: \"type\" is missing"},
            {R"({"nodes":[{"type":1}]})", "node 0: \"path\" is missing"},
            {R"({"nodes":[{"type":"1","path":"/a"}]})", "node 0: \"type\" has to be"},
            {R"({"nodes":[{"type":-1,"path":"/a"}]})", "node 0: \"type\" has to be"},
            {R"({"nodes":[{"type":1.5,"path":"/a"}]})", "node 0: \"type\" has to be"},
            {R"({"nodes":[{"type":2147483648,"path":"/a"}]})", "node 0: \"type\" has to be"},
            {R"({"nodes":[{"type":1,"path":1}]})", "node 0: \"path\" has to be a text"},
            {R"({"nodes":[{"type":1,"path":null}]})", "node 0: \"path\" has to be a text"},
            {R"({"nodes":[{"path":"/a","type":1,"properties":[]}]})",
             "node 0 \"/a\": \"properties\" has to be an object"},
            {R"({"nodes":[{"path":"/a","path":"/b","type":1}]})",
             "node 0 \"/a\": \"path\" is given twice"},
            {R"({"nodes":[{"type":1,"type":1,"path":"/a"}]})", "\"type\" is given twice"},
            {R"({"nodes":[{"type":1,"path":"/a","properties":{},"properties":{}}]})",
             "\"properties\" is given twice"},
            {R"({"nodes":[{"type":1,"path":"/a","propertes":{}}]})",
             "node 0 \"/a\": unknown member \"propertes\""},
            {R"({"nodes":[{"type":1,"path":"/a"},{"type":1,"path":"/b","x":1}]})",
             "node 1 \"/b\": unknown member"}};
}

} // namespace

TEST_F(NodeFileStore, Serves_nodes_by_type_in_the_order_of_the_document) {
    EXPECT_THAT(namesOf(store, UserAccount), ElementsAre("alice", "bob", "carol"));
    EXPECT_THAT(namesOf(store, UserGroup), IsEmpty());
    NodeCursor cursor(store);
    EXPECT_TRUE(cursor.select(AccountServiceRoot));
    EXPECT_EQ(cursor.path(), "/AccountServiceRoot/7");
    EXPECT_THAT(loggedTexts(), IsEmpty());
}

TEST_F(NodeFileStore, Serves_each_type_of_value) {
    const NodeCursor alice = cursorOn(store, UserAccount, "alice");
    unsigned int number = 0;
    std::vector<unsigned int> numbers;
    std::vector<std::string> texts;
    EXPECT_TRUE(alice.read(AccountState, number));
    EXPECT_TRUE(alice.read(PasswordRules, numbers));
    EXPECT_TRUE(alice.read(GroupMembers, texts));
    EXPECT_EQ(number, 1U);
    EXPECT_THAT(numbers, ElementsAre(1U, 2U));
    EXPECT_THAT(texts, ElementsAre("a", "b"));
    EXPECT_EQ(accountNumber(store, "bob", AccountState), 4294967295U);
}

TEST_F(NodeFileStore, An_empty_list_counts_as_both_kinds) {
    const NodeCursor alice = cursorOn(store, UserAccount, "alice");
    std::vector<unsigned int> numbers = {1};
    std::vector<std::string> texts = {"x"};
    EXPECT_TRUE(alice.read(DaysExpireAfter, numbers));
    EXPECT_TRUE(alice.read(DaysExpireAfter, texts));
    EXPECT_THAT(numbers, IsEmpty());
    EXPECT_THAT(texts, IsEmpty());
    std::string text;
    unsigned int number = 0;
    EXPECT_FALSE(alice.read(DaysExpireAfter, text));
    EXPECT_FALSE(alice.read(DaysExpireAfter, number));
}

TEST_F(NodeFileStore, A_value_of_another_type_is_not_read_and_the_variable_stays) {
    const NodeCursor alice = cursorOn(store, UserAccount, "alice");
    std::string text = "kept";
    unsigned int number = 99;
    std::vector<unsigned int> numbers = {9};
    std::vector<std::string> texts = {"kept"};
    EXPECT_FALSE(alice.read(AccountState, text));
    EXPECT_FALSE(alice.read(Name, number));
    EXPECT_FALSE(alice.read(GroupMembers, numbers));
    EXPECT_FALSE(alice.read(PasswordRules, texts));
    EXPECT_FALSE(alice.read(FullName, text));
    EXPECT_EQ(text, "kept");
    EXPECT_EQ(number, 99U);
    EXPECT_THAT(numbers, ElementsAre(9U));
    EXPECT_THAT(texts, ElementsAre("kept"));
}

TEST_F(NodeFileStore, A_filter_keeps_the_nodes_under_a_path) {
    NodeCursor cursor(store);
    cursor.select(UserAccount);
    EXPECT_TRUE(cursor.keepUnder("/UserAdministration/1"));
    EXPECT_EQ(cursor.size(), 2U);
    cursor.advance();
    EXPECT_TRUE(cursor.valid());
    cursor.advance();
    EXPECT_FALSE(cursor.valid());
    cursor.select(UserAccount);
    EXPECT_TRUE(cursor.keepUnder("/Elsewhere"));
    EXPECT_EQ(cursor.path(), "/Elsewhere/UserAccount/carol");
    EXPECT_FALSE(cursor.keepUnder("/UserAdministration/1"));
    EXPECT_EQ(cursor.size(), 0U);
}

TEST_F(NodeFileStore, A_filter_on_part_of_a_step_keeps_nothing) {
    NodeCursor cursor(store);
    cursor.select(UserAccount);
    EXPECT_FALSE(cursor.keepUnder("/UserAdministration/1/UserAccount/ali"));
    EXPECT_FALSE(cursor.valid());
}

TEST_F(NodeFileStore, Entry_count_is_the_stated_one_or_what_the_file_holds_now) {
    NodeCursor cursor(store);
    cursor.select(UserAccount);
    unsigned int count = 0;
    EXPECT_TRUE(cursor.read(EntryCount, count));
    EXPECT_EQ(count, 3U);
    files.put("/n.json", withProperty(R"("51":77)"));
    EXPECT_TRUE(cursor.read(EntryCount, count));
    EXPECT_EQ(count, 1U);
    cursor.select(UserAccount);
    EXPECT_TRUE(cursor.read(EntryCount, count));
    EXPECT_EQ(count, 77U);
    EXPECT_EQ(cursor.size(), 1U);
}

TEST_F(NodeFileStore, Cannot_be_written) {
    NodeCursor cursor(store);
    cursor.select(UserAdministration);
    std::string status = "kept";
    EXPECT_FALSE(cursor.write(AdminCommand, std::string("CreateUser")));
    EXPECT_FALSE(cursor.read(AdminCommand, status));
    EXPECT_EQ(status, "kept");
#ifdef QELO_WITH_COMMANDS
    EXPECT_THAT(loggedTexts().back(), HasSubstr("a node file takes no commands"));
#endif
    EXPECT_FALSE(cursor.write(EntryCount, 5U));
}

TEST_F(NodeFileStore, A_refresh_request_reads_the_file_again) {
    namesOf(store, UserAccount);
    files.changeUnseen("/n.json", withProperty(R"("108":"dora")"));
    NodeCursor cursor(store);
    cursor.select(UserAdministration);
    EXPECT_TRUE(cursor.write(RefreshRequest, 0U));
    EXPECT_THAT(namesOf(store, UserAccount), ElementsAre("dora"));
}

TEST_F(NodeFileStore, A_refused_file_is_an_error_of_every_selection_and_logged_once) {
    files.put("/n.json", withProperty(R"("123":-1)"));
    for (int request = 0; request < 3; ++request) {
        for (const int type : {UserAdministration, AccountServiceRoot, UserAccount, UserGroup}) {
            EXPECT_THAT(errorOf([&] { namesOf(store, type); }),
                        HasSubstr("/n.json refused: node 1 \"/u/a\", property 123"));
        }
    }
    EXPECT_THAT(loggedTexts(), ElementsAre(HasSubstr("node 1 \"/u/a\", property 123")));
    EXPECT_EQ(files.reads["/n.json"], 1);
    files.put("/n.json", example);
    EXPECT_EQ(namesOf(store, UserAccount).size(), 3U);
}

TEST_F(NodeFileStore, A_file_that_cannot_be_read_is_an_error) {
    for (const int error : {EACCES, EIO, EFBIG, EINVAL}) {
        files.put("/n.json", example + std::string(static_cast<std::size_t>(error), ' '));
        files.failRead("/n.json", error);
        EXPECT_THAT(errorOf([&] { namesOf(store, UserAccount); }), HasSubstr("cannot be read"));
    }
    files.remove("/n.json");
    EXPECT_THAT(errorOf([&] { namesOf(store, UserAccount); }), HasSubstr("No such file"));
    EXPECT_EQ(loggedLines().size(), 5U);
}

TEST_F(NodeFileStore, A_file_of_a_hundred_megabytes_is_an_error) {
    const ScratchRoot root;
    const auto file = root.write("big.json", "{\"nodes\":[");
    std::filesystem::resize_file(file, 100UL * 1024 * 1024);
    const auto big = makeStore("file:" + file.string(), systemFiles());
    EXPECT_THAT(errorOf([&] { namesOf(big, UserAccount); }), HasSubstr("too large"));
}

TEST(NodeDocument, Values_of_other_types_are_refused_naming_node_and_property) {
    for (const Refused& refused : refusedValues()) {
        SCOPED_TRACE(refused.text);
        const NodeDocument document = parseNodes(withProperty(refused.text));
        EXPECT_TRUE(document.nodes.empty());
        ASSERT_TRUE(document.error);
        EXPECT_THAT(*document.error, HasSubstr("node 1 \"/u/a\", property 1"));
        EXPECT_THAT(*document.error, HasSubstr(refused.error));
    }
}

TEST(NodeDocument, Other_structures_are_refused_naming_the_node) {
    for (const Refused& refused : refusedDocuments()) {
        SCOPED_TRACE(refused.text);
        const NodeDocument document = parseNodes(refused.text);
        EXPECT_TRUE(document.nodes.empty());
        ASSERT_TRUE(document.error);
        EXPECT_THAT(*document.error, HasSubstr(refused.error));
    }
}

TEST(NodeDocument, A_property_given_twice_is_refused) {
    const NodeDocument document = parseNodes(withProperty(R"("108":"a","123":1,"108":"b")"));
    ASSERT_TRUE(document.error);
    EXPECT_THAT(*document.error, HasSubstr("node 1 \"/u/a\": a property is given twice"));
}

TEST(NodeDocument, Property_names_other_than_plain_decimal_numbers_are_refused) {
    for (const char* name : {"", "Name", "0108", "+108", "-1", " 108", "108 ", "1.0", "1e2", "0x6c",
                             "2147483648", "99999999999999999999", "108\\u0000"}) {
        const NodeDocument document = parseNodes(withProperty('"' + std::string(name) + "\":1"));
        ASSERT_TRUE(document.error) << name;
        EXPECT_THAT(*document.error, HasSubstr("named by a decimal number"));
    }
}

TEST(NodeDocument, Text_that_is_not_json_is_refused_with_its_position) {
    const std::string start = R"({"nodes":[{"type":1,"path":"/a"})";
    for (const std::string& text :
         {std::string(), std::string("{"), start, start + "]", start + ",]}", start + "]} x",
          start + "]}{}", std::string("{'nodes':[]}"), std::string("{\"nodes\":[{\"type\":01}]}"),
          std::string("{\"nodes\":[] // no\n}"), std::string("\0", 1), std::string("\xFF\xFE"),
          std::string("{\"nodes\":[{\"path\":\"\xFF\"}]}"),
          std::string("{\"nodes\":[{\"path\":\"\xED\xA0\x80\"}]}"),
          std::string(R"({"nodes":[{"path":"\ud800"}]})"),
          std::string("{\"nodes\":[{\"path\":\"a\nb\"}]}")}) {
        const NodeDocument document = parseNodes(text);
        ASSERT_TRUE(document.error) << text;
        EXPECT_THAT(*document.error, HasSubstr("not JSON in UTF-8 at byte "));
        EXPECT_TRUE(isValidUtf8(*document.error));
    }
}

TEST(NodeDocument, Every_beginning_of_a_document_is_refused) {
    for (std::size_t size = 0; size < example.size(); ++size) {
        EXPECT_TRUE(parseNodes(example.substr(0, size)).error) << size;
    }
    EXPECT_FALSE(parseNodes(example).error);
}

TEST(NodeDocument, Deep_nesting_is_refused) {
    constexpr std::size_t depth = 2'000'000;
    for (const std::string& opening :
         {std::string("["), std::string("{\"a\":"), std::string("{\"nodes\":[")}) {
        std::string text;
        for (std::size_t i = 0; i < depth; ++i) {
            text += opening;
        }
        EXPECT_TRUE(parseNodes(text).error);
        EXPECT_TRUE(parseNodes("{\"nodes\":[" + text).error);
        EXPECT_TRUE(parseNodes(withProperty("\"1\":" + text)).error);
    }
}

TEST(NodeDocument, An_error_text_stays_short_and_printable) {
    const std::string longName(5'000'000, 'n');
    for (const std::string& text :
         {R"({"nodes":[{")" + longName + R"(":1}]})", "{\"nodes\":[" + longName,
          R"({"nodes":[{"path":")" + longName + R"(","type":null}]})",
          std::string(R"({"nodes":[{"path":"/a\nb\u0007","type":null}]})")}) {
        const NodeDocument document = parseNodes(text);
        ASSERT_TRUE(document.error);
        EXPECT_LT(document.error->size(), 800U);
        EXPECT_EQ(printable(*document.error), *document.error);
    }
}

TEST(NodeDocument, A_property_set_of_any_size_is_read_in_order_of_number) {
    std::string members;
    for (int id = 100'000; id > 0; --id) {
        members += '"' + std::to_string(id) + "\":" + std::to_string(id) + (id > 1 ? "," : "");
    }
    const NodeDocument document = parseNodes(withProperty(members));
    ASSERT_FALSE(document.error);
    unsigned int number = 0;
    EXPECT_TRUE(document.nodes.at(1).second.read(77'777, number));
    EXPECT_EQ(number, 77'777U);
}

} // namespace qelo::nodes::tests
