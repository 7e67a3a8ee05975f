#include <cimxml/Characters.h>
#include <cimxml/Pieces.h>

#include <gtest/gtest.h>

namespace qelo::cimxml {
namespace {

std::string text(std::string_view source) {
    std::string out = "-";
    appendText(out, source);
    return out.substr(1);
}

std::string attribute(std::string_view source) {
    std::string out;
    appendAttributeText(out, source);
    return out;
}

TEST(Characters, Markup_is_escaped) {
    EXPECT_EQ(text("a<b>&c\"'"), "a&lt;b&gt;&amp;c\"'");
    EXPECT_EQ(text("]]>"), "]]&gt;");
    EXPECT_EQ(attribute("a<b>&c\"'"), "a&lt;b&gt;&amp;c&quot;'");
}

TEST(Characters, White_space_survives_reading) {
    EXPECT_EQ(text("a\tb\nc\rd"), "a\tb\nc&#13;d");
    EXPECT_EQ(attribute("a\tb\nc\rd"), "a&#9;b&#10;c&#13;d");
}

TEST(Characters, Utf8_stays_as_it_is) {
    const std::string valid = "\xC3\xA4 \xE2\x82\xAC \xF0\x9F\x98\x80 \x7F \xEF\xBF\xBD";
    EXPECT_EQ(text(valid), valid);
    EXPECT_EQ(attribute(valid), valid);
}

TEST(Characters, What_xml_cannot_hold_is_replaced) {
    const std::string replaced = "\xEF\xBF\xBD";
    EXPECT_EQ(text(std::string("a\0b", 3)), "a" + replaced + "b");
    EXPECT_EQ(text("\x01\x1F"), replaced + replaced);
    EXPECT_EQ(text("\x80"), replaced);
    EXPECT_EQ(text("\xC3"), replaced) << "cut short";
    EXPECT_EQ(text("\xC3<"), replaced + "&lt;") << "the next byte is not eaten";
    EXPECT_EQ(text("\xED\xA0\x80"), replaced + replaced + replaced) << "half a surrogate pair";
    EXPECT_EQ(text("\xEF\xBF\xBE"), replaced) << "U+FFFE";
    EXPECT_EQ(text("\xEF\xBF\xBF"), replaced) << "U+FFFF";
    EXPECT_EQ(attribute("\x01"), replaced);
}

TEST(Pieces, Numbers_of_any_size_are_written) {
    std::string out;
    Pieces pieces(out);
    pieces.addNumber(std::uint64_t{18446744073709551615U});
    pieces.addNumber(std::int64_t{INT64_MIN});
    EXPECT_EQ(pieces.flush(), "18446744073709551615-9223372036854775808");
}

TEST(Pieces, Pieces_of_any_length_keep_their_order) {
    std::string out = "-";
    std::string expected = "-";
    Pieces pieces(out);
    for (const std::size_t length : {1U, 1000U, 30U, 1024U, 1025U, 5000U, 0U, 23U}) {
        const std::string piece(length, static_cast<char>('a' + length % 26));
        pieces.add(piece);
        expected += piece;
    }
    pieces.flush();
    EXPECT_EQ(out, expected);
}

TEST(Pieces, Text_is_escaped_between_other_pieces) {
    std::string out;
    Pieces pieces(out);
    pieces.add("<a>");
    pieces.addText("plain");
    pieces.addText("1 < 2 \"\xC3\xA4\"");
    pieces.addAttribute("n", "1 < 2 \"\t\"");
    pieces.addAttributeText("plain");
    EXPECT_EQ(pieces.flush(), "<a>plain1 &lt; 2 \"\xC3\xA4\" n=\"1 &lt; 2 &quot;&#9;&quot;\"plain");
}

} // namespace
} // namespace qelo::cimxml
