// More groups than the 16-bit counts can hold.
#include "GroupFixture.h"

namespace qelo::test {
namespace {

using testing::ElementsAre;

class ManyGroups : public GroupFixture {
protected:
    void serveMany(unsigned int count) {
        platform_.setRecording(false);
        for (unsigned int i = 0; i < count; ++i) {
            platform_.addNode(groupNode("g" + std::to_string(1000000 + i)));
        }
    }
};

TEST_F(ManyGroups, Of_65536_records_none_is_kept) {
    serveMany(65536);
    expectOk(enumNames());
    expectNothingReturned();
    EXPECT_EQ(broker_.doneCount(), 0);
    EXPECT_THAT(broker_.traces(),
                ElementsAre(BrokerTrace{1, "SimGroupProvider", "***No instance found***"}));
}

TEST_F(ManyGroups, Of_65537_records_the_first_is_kept) {
    serveMany(65537);
    expectOk(enumInstances());
    EXPECT_THAT(returned("Name"), ElementsAre("g1000000"));
    EXPECT_EQ(broker_.doneCount(), 1);
}

} // namespace
} // namespace qelo::test
