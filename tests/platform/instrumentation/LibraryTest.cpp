// The shared library as a program links it, with the logging library behind it.
#include "ScratchRoot.h"

#include <Instrumentation.h>

#include <gtest/gtest.h>

#include <stdexcept>

namespace qelo::nodes::tests {

namespace {

using namespace Tesk::NodeLexicon;

} // namespace

TEST(NodeStoreLibrary, Serves_an_account_database) {
    const ScratchRoot root;
    root.write("etc/passwd", "alice:x:1:1:Alice:/a:/bin/sh\n");
    root.write("etc/group", "staff:x:50:alice\n");
    const ScopedVariable variable("QELO_NODE_STORE", root.choice());
    Tesk::Instrumentation cursor;
    ASSERT_TRUE(cursor.selectNode(UserAccount));
    std::string name;
    EXPECT_TRUE(cursor.getProperty(FullName, name));
    EXPECT_EQ(name, "Alice");
    EXPECT_FALSE(++cursor);
}

TEST(NodeStoreLibrary, Its_errors_are_caught_as_standard_exceptions) {
    const ScopedVariable variable("QELO_NODE_STORE", "nothing");
    Tesk::Instrumentation cursor;
    EXPECT_THROW(cursor.selectNode(UserAccount), std::exception);
    EXPECT_FALSE(cursor);
}

} // namespace qelo::nodes::tests
