#include "SweptProviders.h"

#include "support/platform/SampleNodes.h"

#include <gtest/gtest.h>

namespace qelo::test {

namespace {

using namespace Tesk::NodeLexicon;

StoreNode groupNode(const std::string& name, const std::vector<std::string>& members) {
    return {UserGroup,
            std::string(administrationPath) + "/" + name,
            {{Name, name}, {GroupMembers, members}}};
}

} // namespace

SweptProviders::SweptProviders() { prepareStore(); }

void SweptProviders::prepareStore() {
    platform_.reset();
    platform_.addNode(administrationNode());
    platform_.addNode(fullAccountNode("an account with quite a long name"));
    platform_.addNode(accountNode("bob"));
    platform_.addNode(groupNode("a group with quite a long name", {"root", "bob"}));
    platform_.addNode(groupNode("adm", {}));
    platform_.addNode({AccountServiceRoot, "/b", {}});
    platform_.addNode({AccountServiceRoot, "/a", {}});
    // The store holds more than was read before, so that each operation reads it anew.
    for (const NodeType type : {UserAccount, UserGroup}) {
        platform_.setEntryCount(type, 9);
    }
    // Where paths are compared, the second is the one that is looked for.
    platform_.setPathAnswers({false, true});
}

void judgeFaultyRun(SweptProviders& providers, const SweptOperation& operation,
                    const SweptRun& good, const SweptRun& run) {
    judgeFaultyRun(static_cast<SweptLibrary&>(providers), operation, good, run);
    EXPECT_EQ(providers.platform().openCursors(), 0U);
}

void expectGoodRun(SweptProviders& providers, const SweptRun& good, const SweptRun& run) {
    expectGoodRun(static_cast<SweptLibrary&>(providers), good, run);
    EXPECT_EQ(providers.platform().openCursors(), 0U);
}

} // namespace qelo::test
