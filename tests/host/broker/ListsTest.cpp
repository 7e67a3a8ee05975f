// Argument lists, contexts and enumerations, slot by slot.
#include "BrokerFixture.h"

namespace qelo::broker::testing {
namespace {

class ListsTest : public BrokerTest {};

TEST_F(ListsTest, Arguments_are_found_by_name_in_any_case_and_by_position) {
    CMPIArgs* list = args();
    EXPECT_EQ(list->ft->getArgCount(list, &st), 0U);
    EXPECT_EQ(rc(), CMPI_RC_OK);
    EXPECT_EQ(list->ft->addArg(list, "A", chars("1"), CMPI_chars).rc, CMPI_RC_OK);
    EXPECT_EQ(list->ft->addArg(list, "B", chars("2"), CMPI_chars).rc, CMPI_RC_OK);
    EXPECT_EQ(list->ft->addArg(list, "a", chars("3"), CMPI_chars).rc, CMPI_RC_OK);
    EXPECT_EQ(list->ft->getArgCount(list, nullptr), 2U);
    EXPECT_EQ(text(list->ft->getArg(list, "a", &st).value.string), "3");
    EXPECT_EQ(rc(), CMPI_RC_OK);
    CMPIString* name = nullptr;
    EXPECT_EQ(text(list->ft->getArgAt(list, 1, &name, &st).value.string), "2");
    EXPECT_EQ(rc(), CMPI_RC_OK);
    EXPECT_EQ(text(name), "B");
    list->ft->getArgAt(list, 2, &name, &st);
    EXPECT_EQ(rc(), CMPI_RC_ERR_NO_SUCH_PROPERTY);
    list->ft->getArg(list, "C", &st);
    EXPECT_EQ(rc(), CMPI_RC_ERR_NO_SUCH_PROPERTY);
    EXPECT_EQ(list->ft->addArg(list, nullptr, chars("1"), CMPI_chars).rc,
              CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_EQ(list->ft->addArg(nullptr, "A", chars("1"), CMPI_chars).rc,
              CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(list->ft->getArgCount(nullptr, &st), 0U);
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_HANDLE);
    list->ft->getArgAt(nullptr, 0, &name, &st);
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_HANDLE);
}

TEST_F(ListsTest, A_context_carries_what_is_known_of_the_request) {
    const CMPIContext* ctx = context({"alice", "admin", "de", "en", 5});
    EXPECT_EQ(text(ctx->ft->getEntry(ctx, CMPIPrincipal, &st).value.string), "alice");
    EXPECT_EQ(rc(), CMPI_RC_OK);
    EXPECT_EQ(text(ctx->ft->getEntry(ctx, CMPIRole, nullptr).value.string), "admin");
    EXPECT_EQ(text(ctx->ft->getEntry(ctx, CMPIAcceptLanguage, nullptr).value.string), "de");
    EXPECT_EQ(text(ctx->ft->getEntry(ctx, CMPIContentLanguage, nullptr).value.string), "en");
    const CMPIData flags = ctx->ft->getEntry(ctx, CMPIInvocationFlags, nullptr);
    EXPECT_EQ(flags.type, CMPI_uint32);
    EXPECT_EQ(flags.value.uint32, 5U);
    EXPECT_EQ(ctx->ft->getEntryCount(ctx, &st), 5U);
    EXPECT_EQ(rc(), CMPI_RC_OK);
    ctx->ft->getEntry(ctx, "None", &st);
    EXPECT_EQ(rc(), CMPI_RC_ERR_NO_SUCH_PROPERTY);
}

TEST_F(ListsTest, A_context_takes_entries_even_raw_pointers) {
    const CMPIContext* ctx = context();
    CMPIValue value = {};
    value.dataPtr.ptr = &value;
    value.dataPtr.length = 3;
    EXPECT_EQ(ctx->ft->addEntry(ctx, "Mine", &value, CMPI_ptr).rc, CMPI_RC_OK);
    const CMPIData back = ctx->ft->getEntry(ctx, "mine", nullptr);
    EXPECT_EQ(back.value.dataPtr.ptr, &value);
    EXPECT_EQ(back.value.dataPtr.length, 3U);
    EXPECT_EQ(ctx->ft->addEntry(ctx, "Bad", &value, CMPI_args).rc, CMPI_RC_ERR_INVALID_DATA_TYPE);
    EXPECT_EQ(ctx->ft->addEntry(nullptr, "Bad", &value, CMPI_ptr).rc, CMPI_RC_ERR_INVALID_HANDLE);
    CMPIString* name = nullptr;
    ctx->ft->getEntryAt(ctx, 5, &name, &st);
    EXPECT_EQ(rc(), CMPI_RC_OK);
    EXPECT_EQ(text(name), "Mine");
    ctx->ft->getEntryAt(ctx, 6, &name, &st);
    EXPECT_EQ(rc(), CMPI_RC_ERR_NO_SUCH_PROPERTY);
    EXPECT_EQ(ctx->ft->getEntryCount(nullptr, &st), 0U);
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_NE(text(mb()->eft->toString(mb(), ctx, nullptr)).find("Mine=pointer"),
              std::string::npos);
}

TEST_F(ListsTest, A_context_can_be_cloned_and_released) {
    CMPIContext* ctx = context({"alice", "", "", ""});
    CMPIContext* copy = ctx->ft->clone(ctx, &st);
    ASSERT_NE(copy, nullptr);
    EXPECT_EQ(rc(), CMPI_RC_OK);
    EXPECT_EQ(ctx->ft->release(ctx).rc, CMPI_RC_OK); // an argument: nothing happens
    EXPECT_EQ(ctx->ft->getEntryCount(ctx, nullptr), 5U);
    nextCall();
    EXPECT_EQ(text(copy->ft->getEntry(copy, CMPIPrincipal, nullptr).value.string), "alice");
    EXPECT_EQ(copy->ft->release(copy).rc, CMPI_RC_OK);
}

TEST_F(ListsTest, An_enumeration_yields_each_element_once) {
    router.paths = {cim::ObjectPath("root/test", "A"), cim::ObjectPath("root/test", "B")};
    CMPIEnumeration* en = mb()->bft->enumerateInstanceNames(mb(), context(), path(), &st);
    ASSERT_EQ(rc(), CMPI_RC_OK);
    EXPECT_TRUE(en->ft->hasNext(en, &st));
    EXPECT_EQ(rc(), CMPI_RC_OK);
    const CMPIData first = en->ft->getNext(en, &st);
    EXPECT_EQ(rc(), CMPI_RC_OK);
    EXPECT_EQ(first.type, CMPI_ref);
    EXPECT_EQ(text(first.value.ref->ft->getClassName(first.value.ref, nullptr)), "A");
    CMPIEnumeration* copy = en->ft->clone(en, nullptr);
    en->ft->getNext(en, nullptr);
    EXPECT_FALSE(en->ft->hasNext(en, &st));
    EXPECT_EQ(rc(), CMPI_RC_OK);
    EXPECT_TRUE(isNull(en->ft->getNext(en, &st)));
    EXPECT_EQ(rc(), CMPI_RC_NO_MORE_ELEMENTS);
    EXPECT_TRUE(copy->ft->hasNext(copy, nullptr)); // as far as the original was
    copy->ft->release(copy);
    const CMPIArray* all = en->ft->toArray(en, &st);
    EXPECT_EQ(rc(), CMPI_RC_OK);
    EXPECT_EQ(all->ft->getSize(all, nullptr), 2U);
    EXPECT_EQ(all->ft->getSimpleType(all, nullptr), CMPI_ref);
}

TEST_F(ListsTest, A_dead_enumeration_refuses_everything) {
    CMPIEnumeration* en = mb()->bft->enumerateInstanceNames(mb(), context(), path(), nullptr);
    en->ft->release(en);
    EXPECT_FALSE(en->ft->hasNext(en, &st));
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_HANDLE);
    en->ft->getNext(en, &st);
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(en->ft->toArray(en, &st), nullptr);
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_HANDLE);
}

} // namespace
} // namespace qelo::broker::testing
