// More services than the 16-bit counts can hold.
#include "ServiceFixture.h"

#include <service/SimAccountManagementCapabilitiesObjFactory.h>
#include <service/SimAccountManagementServiceObjFactory.h>

namespace qelo::test {
namespace {

using Tesk::SimpleIdentityManagementProvider::SimAccountManagementCapabilitiesFactory;
using Tesk::SimpleIdentityManagementProvider::SimAccountManagementServiceFactory;
using testing::ElementsAre;

class ManyServices : public ServiceFixture {
protected:
    void serveMany(unsigned int count) {
        platform_.setRecording(false);
        for (unsigned int i = 0; i < count; ++i) {
            platform_.addNode(serviceNode("/" + std::to_string(1000000 + i)));
        }
    }
};

TEST_F(ManyServices, A_map_of_65536_entries_counts_as_0) {
    serveMany(65536);
    EXPECT_EQ(SimAccountManagementServiceFactory(true, false).getNumberOfInstances(), 0U);
    EXPECT_EQ(SimAccountManagementCapabilitiesFactory(true, false).getNumberOfInstances(), 0U);
}

TEST_F(ManyServices, Of_65537_names_one_is_returned) {
    serveMany(65537);
    expectOk(enumNames());
    EXPECT_THAT(returned("Name"), ElementsAre(serviceName("/1000000")));
    EXPECT_EQ(broker_.doneCount(), 1);
}

} // namespace
} // namespace qelo::test
