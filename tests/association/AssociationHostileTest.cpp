// Names and filters that mean harm.
#include "AssociationFixture.h"

#include <algorithm>

namespace qelo::test {
namespace {

using testing::ElementsAreArray;

const std::vector<std::string>& hostileTexts() {
    static const std::vector<std::string> texts = {
        std::string(600, 'a'), std::string(100000, 'b'),  "%s%s%n%d",     "new\nline\r\n",
        "\x01\x02\x7F",        "\xFF\xFE bad UTF-8 \xC3", "a,b:c=\"d\"'", " ",
    };
    return texts;
}

class HostileAssociations : public AssociationFixture {
protected:
    ~HostileAssociations() override {
        for (const LogLine& line : platform_.lines()) {
            EXPECT_LE(line.message.size(), 511U);
        }
    }
};

TEST_P(HostileAssociations, Names_of_both_ends_are_served_unchanged) {
    serveFar(hostileTexts());
    serveNear(hostileTexts());
    std::vector<std::string> sorted = hostileTexts();
    std::sort(sorted.begin(), sorted.end());
    expectOk(enumNames());
    EXPECT_THAT(returnedPairs(), ElementsAreArray(pairs(hostileTexts(), sorted)));
    expectOk(enumInstances());
    EXPECT_THAT(returnedPairs(), ElementsAreArray(pairs(hostileTexts(), sorted)));
    expectOk(associatorNames(nearPath("/a"), along()));
    EXPECT_THAT(returned("Name"), ElementsAreArray(hostileTexts()));
}

TEST_P(HostileAssociations, Classes_and_filters_may_be_any_text) {
    serveTwoAndThree();
    for (const std::string& text : hostileTexts()) {
        const CMPIObjectPath* source = broker_.makePath(requestNameSpace, text, {{"Name", text}});
        const AssociationFilters filters = {text.c_str(), text.c_str(), text.c_str(), text.c_str()};
        expectOk(associators(source, filters));
        expectNothingReturned();
        expectOk(associatorNames(source, filters));
        expectNothingReturned();
        expectOk(references(source, text.c_str()));
        expectNothingReturned();
        expectOk(referenceNames(source, text.c_str()));
        expectNothingReturned();
        expectOk(associators(nearPath(text), {text.c_str(), nullptr, nullptr, nullptr}));
        expectNothingReturned();
    }
}

TEST_P(HostileAssociations, A_name_from_the_request_comes_back_as_it_is) {
    serveTwoAndThree();
    for (const std::string& text : hostileTexts()) {
        expectOk(references(farPath(text)));
        EXPECT_THAT(returnedPairs(), ElementsAreArray(pairs({text}, {"/a", "/b", "/c"})));
    }
}

QELO_FOR_BOTH_ASSOCIATIONS(HostileAssociations);

} // namespace
} // namespace qelo::test
