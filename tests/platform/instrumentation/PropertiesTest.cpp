#include "Node.h"

#include <gmock/gmock.h>

namespace qelo::nodes::tests {

namespace {

using testing::ElementsAre;

Properties ofEveryKind() {
    Properties properties;
    properties.add(5, std::vector<std::string>{"", "two", std::string("a\0b", 3)});
    properties.add(4, std::vector<unsigned int>{0, 4294967295U});
    properties.add(3, 4294967295U);
    properties.add(2, std::string_view("text"));
    properties.add(1, std::string_view());
    properties.addEmptyList(6);
    EXPECT_TRUE(properties.seal());
    return properties;
}

} // namespace

TEST(Properties, Are_read_back_as_they_were_added) {
    const Properties properties = ofEveryKind();
    std::string text = "x";
    unsigned int number = 0;
    std::vector<unsigned int> numbers;
    std::vector<std::string> texts;
    EXPECT_TRUE(properties.read(1, text));
    EXPECT_EQ(text, "");
    EXPECT_TRUE(properties.read(2, text));
    EXPECT_EQ(text, "text");
    EXPECT_TRUE(properties.read(3, number));
    EXPECT_EQ(number, 4294967295U);
    EXPECT_TRUE(properties.read(4, numbers));
    EXPECT_THAT(numbers, ElementsAre(0U, 4294967295U));
    EXPECT_TRUE(properties.read(5, texts));
    EXPECT_THAT(texts, ElementsAre("", "two", std::string("a\0b", 3)));
}

TEST(Properties, Are_read_only_as_the_type_that_they_have) {
    const Properties properties = ofEveryKind();
    std::string text = "kept";
    unsigned int number = 9;
    std::vector<unsigned int> numbers = {9};
    std::vector<std::string> texts = {"kept"};
    for (int id = 0; id < 8; ++id) {
        EXPECT_EQ(properties.has(id), id >= 1 && id <= 6) << id;
        EXPECT_EQ(properties.read(id, text), id == 1 || id == 2) << id;
        EXPECT_EQ(properties.read(id, number), id == 3) << id;
        EXPECT_EQ(properties.read(id, numbers), id == 4 || id == 6) << id;
        EXPECT_EQ(properties.read(id, texts), id == 5 || id == 6) << id;
    }
}

TEST(Properties, A_number_added_twice_is_told) {
    Properties properties;
    properties.add(7, 1U);
    properties.add(6, 1U);
    properties.add(7, std::string_view("x"));
    EXPECT_FALSE(properties.seal());
}

TEST(Node, Its_own_properties_go_before_shared_ones) {
    Properties own;
    own.add(1, 11U);
    own.add(2, std::string_view("own"));
    own.seal();
    Properties shared;
    shared.add(1, 99U);
    shared.add(2, 99U);
    shared.add(3, 33U);
    shared.seal();
    const Node node("/n", own, std::make_shared<const Properties>(shared));
    unsigned int number = 0;
    EXPECT_TRUE(node.read(1, number));
    EXPECT_EQ(number, 11U);
    EXPECT_FALSE(node.read(2, number));
    EXPECT_TRUE(node.read(3, number));
    EXPECT_EQ(number, 33U);
    EXPECT_FALSE(node.has(4));
}

} // namespace qelo::nodes::tests
