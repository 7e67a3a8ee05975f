// Documents from people who mean harm.
#include "Documents.h"

namespace qelo::cimxml {
namespace {

std::string repeated(const std::string& text, std::size_t count) {
    std::string result;
    result.reserve(text.size() * count);
    for (std::size_t i = 0; i < count; ++i) {
        result += text;
    }
    return result;
}

TEST(Hostile, Document_types_and_their_entities_are_refused) {
    EXPECT_EQ(refusal("<!DOCTYPE CIM><CIM/>"), kNotValid);
    EXPECT_EQ(refusal("<!DOCTYPE CIM SYSTEM \"file:///etc/passwd\"><CIM/>"), kNotValid);
    EXPECT_EQ(refusal("<!DOCTYPE x [<!ENTITY a \"b\"><!ENTITY c \"&a;&a;\">]><x>&c;</x>"),
              kNotValid);
    EXPECT_EQ(refusal("<!DOCTYPE x [<!ENTITY % p SYSTEM \"http://h/\"> %p;]><x/>"), kNotValid);
    EXPECT_EQ(refusal("<CIM>&undefined;</CIM>"), kNotWellFormed);
}

TEST(Hostile, Other_encodings_are_refused) {
    EXPECT_EQ(refusal("<?xml version=\"1.0\" encoding=\"ISO-8859-1\"?><CIM/>"), kNotValid);
    EXPECT_EQ(refusal("<?xml version=\"1.0\" encoding=\"UTF-7\"?><CIM/>"), kNotValid);
    const std::string request = intrinsic("");
    std::string little;
    std::string big;
    for (const char c : request) {
        little += {c, '\0'};
        big += {'\0', c};
    }
    EXPECT_EQ(refusal(request), "accepted");
    EXPECT_EQ(refusal("\xEF\xBB\xBF" + request), "accepted");
    for (const std::string& body : {"\xFF\xFE" + little, "\xFE\xFF" + big, little, big}) {
        EXPECT_EQ(refusal(body), kNotValid);
    }
}

TEST(Hostile, Other_encodings_are_refused_in_pieces_too) {
    XmlReader reader({});
    reader.feed("<");
    EXPECT_THROW(reader.feed(std::string(1, '\0')), NotValid);
}

TEST(Hostile, Broken_bytes_are_not_well_formed) {
    for (const std::string& text :
         {std::string("a\0b", 3), std::string("\x01"), std::string("\xC0\x80"),
          std::string("\xED\xA0\x80"), std::string("\xF5\x80\x80\x80"), std::string("\xC3"),
          std::string("&#0;"), std::string("&#x1;"), std::string("\xEF\xBF\xBF")}) {
        EXPECT_EQ(
            refusal(intrinsic("<IPARAMVALUE NAME=\"P\"><VALUE>" + text + "</VALUE></IPARAMVALUE>")),
            kNotWellFormed)
            << ::testing::PrintToString(text);
    }
}

TEST(Hostile, No_prefix_of_a_request_is_a_request) {
    const std::string whole = intrinsic("<IPARAMVALUE NAME=\"P\"><VALUE>x</VALUE></IPARAMVALUE>");
    for (std::size_t length = 0; length < whole.size(); ++length) {
        EXPECT_EQ(refusal(whole.substr(0, length)), kNotWellFormed) << length;
    }
    EXPECT_EQ(refusal(whole + "x"), kNotWellFormed);
    EXPECT_EQ(refusal(whole + "<CIM/>"), kNotWellFormed);
}

TEST(Hostile, Depth_is_limited) {
    EXPECT_EQ(refusal(repeated("<a>", 100'000)), kNotValid);
    const ReadLimits limits = {6, 1000};
    EXPECT_EQ(refusal(intrinsic("<IPARAMVALUE NAME=\"P\"><VALUE/></IPARAMVALUE>"), limits),
              "accepted");
    EXPECT_EQ(refusal(intrinsic("<IPARAMVALUE NAME=\"P\"><CLASS NAME=\"C\"><METHOD "
                                "NAME=\"M\"/></CLASS></IPARAMVALUE>"),
                      limits),
              kNotValid);
}

TEST(Hostile, The_number_of_elements_is_limited) {
    const auto list = [](std::size_t count) {
        return intrinsic("<IPARAMVALUE NAME=\"P\"><VALUE.ARRAY>" + repeated("<VALUE/>", count) +
                         "</VALUE.ARRAY></IPARAMVALUE>");
    };
    const ReadLimits limits = {64, 1000};
    EXPECT_EQ(refusal(list(900), limits), "accepted");
    EXPECT_EQ(refusal(list(1000), limits), kNotValid);
    EXPECT_EQ(refusal(list(190'000)), "accepted");
    EXPECT_EQ(refusal(list(200'000)), kNotValid);
}

TEST(Hostile, Too_many_attributes_are_refused) {
    std::string attributes;
    for (int i = 0; i < 20'000; ++i) {
        attributes += " a" + std::to_string(i) + "=\"\"";
    }
    EXPECT_EQ(refusal("<CIM" + attributes + "/>"), kNotValid);
    EXPECT_EQ(refusal("<CIM a=\"\" a=\"\"/>"), kNotWellFormed);
}

TEST(Hostile, A_tag_without_end_is_refused_early) {
    XmlReader reader({});
    const std::string piece(64 << 10, 'x');
    reader.feed("<a b=\"");
    EXPECT_THROW(
        for (int i = 0; i < 1000; ++i) { reader.feed(piece); }, NotValid);
}

TEST(Hostile, Many_properties_of_different_names_take_no_quadratic_time) {
    std::string properties;
    for (int i = 0; i < 90'000; ++i) {
        properties += "<PROPERTY NAME=\"P" + std::to_string(i) + "\" TYPE=\"uint8\"/>";
    }
    EXPECT_EQ(refusal(intrinsic("<IPARAMVALUE NAME=\"P\"><INSTANCE CLASSNAME=\"C\">" + properties +
                                "</INSTANCE></IPARAMVALUE>")),
              "accepted");
}

// An instance inside an instance inside ..., each one a text of the next.
std::string nested(int levels) {
    const auto escaped = [](const std::string& text) {
        std::string result;
        for (const char c : text) {
            result += c == '<' ? "&lt;" : c == '&' ? "&amp;" : std::string(1, c);
        }
        return result;
    };
    std::string document = "<INSTANCE CLASSNAME=\"E\"/>";
    for (int i = 0; i < levels; ++i) {
        document = "<INSTANCE CLASSNAME=\"E\"><PROPERTY NAME=\"P\" TYPE=\"string\" "
                   "EmbeddedObject=\"instance\"><VALUE>" +
                   escaped(document) + "</VALUE></PROPERTY></INSTANCE>";
    }
    return intrinsic("<IPARAMVALUE NAME=\"P\">" + document + "</IPARAMVALUE>");
}

TEST(Hostile, Embedded_documents_share_the_depth_of_those_around_them) {
    EXPECT_EQ(refusal(nested(4)), "accepted");
    const ReadLimits limits = {16, 1000};
    EXPECT_EQ(refusal(nested(3), limits), "accepted");
    EXPECT_EQ(refusal(nested(4), limits), kNotValid);
}

TEST(Hostile, Embedded_documents_share_the_number_of_elements) {
    const std::string document = "&lt;INSTANCE CLASSNAME=\"E\"&gt;" +
                                 repeated("&lt;QUALIFIER NAME=\"Q\" TYPE=\"string\"/&gt;", 100) +
                                 "&lt;/INSTANCE&gt;";
    const auto request = [&](std::size_t count) {
        return extrinsic("<PARAMVALUE NAME=\"P\" PARAMTYPE=\"string\" EmbeddedObject=\"instance\">"
                         "<VALUE.ARRAY>" +
                         repeated("<VALUE>" + document + "</VALUE>", count) +
                         "</VALUE.ARRAY></PARAMVALUE>");
    };
    const ReadLimits limits = {64, 1000};
    EXPECT_EQ(refusal(request(9), limits), "accepted");
    EXPECT_EQ(refusal(request(11), limits), kNotValid);
}

TEST(Hostile, Embedded_documents_know_no_entities_either) {
    EXPECT_EQ(refusal(extrinsic("<PARAMVALUE NAME=\"P\" PARAMTYPE=\"string\" "
                                "EmbeddedObject=\"instance\"><VALUE>&lt;!DOCTYPE x&gt;&lt;INSTANCE "
                                "CLASSNAME=\"E\"/&gt;</VALUE></PARAMVALUE>")),
              kNotValid);
}

} // namespace
} // namespace qelo::cimxml
