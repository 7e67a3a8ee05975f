// More accounts than the 16-bit counts can hold.
#include "AccountFixture.h"

#include <account/SimAccountObjFactory.h>

namespace qelo::test {
namespace {

using Tesk::SimpleIdentityManagementProvider::SimAccountFactory;
using testing::ElementsAre;

class ManyAccounts : public AccountFixture {
protected:
    void serveMany(unsigned int count) {
        platform_.setRecording(false);
        platform_.addNode(administrationNode());
        for (unsigned int i = 0; i < count; ++i) {
            const std::string number = std::to_string(1000000 + i);
            platform_.addNode({Tesk::NodeLexicon::UserAccount,
                               "/admin/account",
                               {{Tesk::NodeLexicon::Name, "u" + number}}});
        }
    }
};

TEST_F(ManyAccounts, A_map_of_65536_entries_counts_as_0) {
    serveMany(65536);
    SimAccountFactory factory(true, false);
    EXPECT_EQ(factory.getNumberOfInstances(), 0U);
}

TEST_F(ManyAccounts, Of_65537_names_one_is_returned) {
    serveMany(65537);
    expectSuccess(enumNames());
    EXPECT_THAT(returnedNames(), ElementsAre("u1000000"));
    EXPECT_EQ(broker_.doneCount(), 1);
}

} // namespace
} // namespace qelo::test
