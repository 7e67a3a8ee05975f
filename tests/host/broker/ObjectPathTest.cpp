// Object paths, slot by slot.
#include "BrokerFixture.h"

namespace qelo::broker::testing {
namespace {

class ObjectPathTest : public BrokerTest {};

TEST_F(ObjectPathTest, Its_parts_can_be_set_and_read) {
    CMPIObjectPath* op = path();
    EXPECT_EQ(text(op->ft->getNameSpace(op, &st)), "root/test");
    EXPECT_EQ(rc(), CMPI_RC_OK);
    EXPECT_EQ(text(op->ft->getHostname(op, &st)), "");
    EXPECT_EQ(rc(), CMPI_RC_OK);
    EXPECT_EQ(op->ft->setNameSpace(op, "root/other").rc, CMPI_RC_OK);
    EXPECT_EQ(op->ft->setHostname(op, "host").rc, CMPI_RC_OK);
    EXPECT_EQ(op->ft->setClassName(op, "TEST_Other").rc, CMPI_RC_OK);
    EXPECT_EQ(text(op->ft->getNameSpace(op, nullptr)), "root/other");
    EXPECT_EQ(text(op->ft->getHostname(op, nullptr)), "host");
    EXPECT_EQ(text(op->ft->getClassName(op, &st)), "TEST_Other");
    EXPECT_EQ(rc(), CMPI_RC_OK);
}

TEST_F(ObjectPathTest, Setters_refuse_null_texts_and_dead_paths) {
    CMPIObjectPath* op = path();
    const CMPIObjectPathFT* ft = op->ft;
    EXPECT_EQ(ft->setNameSpace(op, nullptr).rc, CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_EQ(ft->setHostname(op, nullptr).rc, CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_EQ(ft->setClassName(op, nullptr).rc, CMPI_RC_ERR_INVALID_PARAMETER);
    ft->release(op);
    EXPECT_EQ(ft->setNameSpace(op, "x").rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(ft->setHostname(op, "x").rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(ft->setClassName(op, "x").rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(ft->addKey(op, "K", chars("x"), CMPI_chars).rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(ft->setNameSpaceFromObjectPath(op, path()).rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(ft->getNameSpace(op, &st), nullptr);
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(ft->getHostname(op, &st), nullptr);
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(ft->getClassName(op, &st), nullptr);
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(ft->getKeyCount(op, &st), 0U);
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_TRUE(isNull(ft->getKey(op, "K", &st)));
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_HANDLE);
    CMPIString* name = string("stale");
    EXPECT_TRUE(isNull(ft->getKeyAt(op, 0, &name, &st)));
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(name, nullptr);
    EXPECT_EQ(ft->toString(op, &st), nullptr);
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_HANDLE);
}

TEST_F(ObjectPathTest, Keys_are_found_by_name_in_any_case_and_by_position) {
    CMPIObjectPath* op = path();
    EXPECT_EQ(op->ft->getKeyCount(op, &st), 0U);
    EXPECT_EQ(rc(), CMPI_RC_OK);
    const CMPIValue number = uint32Value(5);
    EXPECT_EQ(op->ft->addKey(op, "Name", chars("one"), CMPI_chars).rc, CMPI_RC_OK);
    EXPECT_EQ(op->ft->addKey(op, "Number", &number, CMPI_uint32).rc, CMPI_RC_OK);
    EXPECT_EQ(op->ft->addKey(op, "NAME", chars("two"), CMPI_chars).rc, CMPI_RC_OK);
    EXPECT_EQ(op->ft->getKeyCount(op, nullptr), 2U);
    const CMPIData byName = op->ft->getKey(op, "name", &st);
    EXPECT_EQ(rc(), CMPI_RC_OK);
    EXPECT_EQ(byName.state, CMPI_goodValue | CMPI_keyValue);
    EXPECT_EQ(byName.type, CMPI_string);
    EXPECT_EQ(text(byName.value.string), "two");
    CMPIString* name = nullptr;
    const CMPIData second = op->ft->getKeyAt(op, 1, &name, &st);
    EXPECT_EQ(rc(), CMPI_RC_OK);
    EXPECT_EQ(text(name), "Number");
    EXPECT_EQ(second.value.uint32, 5U);
    EXPECT_EQ(op->ft->getKeyAt(op, 1, nullptr, nullptr).value.uint32, 5U);
}

TEST_F(ObjectPathTest, Missing_keys_and_positions_are_told_apart_from_bad_names) {
    const CMPIObjectPath* op = path();
    const CMPIData missing = op->ft->getKey(op, "None", &st);
    EXPECT_EQ(rc(), CMPI_RC_ERR_NO_SUCH_PROPERTY);
    EXPECT_EQ(missing.value.string, nullptr);
    CMPIString* name = string("stale");
    op->ft->getKeyAt(op, 0, &name, &st);
    EXPECT_EQ(rc(), CMPI_RC_ERR_NO_SUCH_PROPERTY);
    EXPECT_EQ(name, nullptr);
    op->ft->getKey(op, nullptr, &st);
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_PARAMETER);
}

TEST_F(ObjectPathTest, Keys_are_never_null_nor_arrays_nor_objects_other_than_references) {
    CMPIObjectPath* op = path();
    EXPECT_EQ(op->ft->addKey(op, "K", nullptr, CMPI_string).rc, CMPI_RC_ERR_INVALID_PARAMETER);
    CMPIValue value = {};
    EXPECT_EQ(op->ft->addKey(op, "K", &value, CMPI_string).rc, CMPI_RC_ERR_INVALID_PARAMETER);
    value.array = array(1, CMPI_uint8);
    EXPECT_EQ(op->ft->addKey(op, "K", &value, CMPI_uint8A).rc, CMPI_RC_ERR_INVALID_DATA_TYPE);
    value.inst = instance();
    EXPECT_EQ(op->ft->addKey(op, "K", &value, CMPI_instance).rc, CMPI_RC_ERR_INVALID_DATA_TYPE);
    EXPECT_EQ(op->ft->addKey(op, "", chars("x"), CMPI_chars).rc, CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_EQ(op->ft->addKey(op, nullptr, chars("x"), CMPI_chars).rc,
              CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_EQ(op->ft->getKeyCount(op, nullptr), 0U);
    value.ref = path("TEST_Target");
    EXPECT_EQ(op->ft->addKey(op, "R", &value, CMPI_ref).rc, CMPI_RC_OK);
    EXPECT_EQ(op->ft->getKey(op, "R", nullptr).type, CMPI_ref);
}

TEST_F(ObjectPathTest, It_can_be_its_own_key_once_copied) {
    CMPIObjectPath* op = path();
    CMPIValue value = {};
    value.ref = op;
    EXPECT_EQ(op->ft->addKey(op, "Self", &value, CMPI_ref).rc, CMPI_RC_OK);
    const CMPIObjectPath* inner = op->ft->getKey(op, "Self", nullptr).value.ref;
    EXPECT_NE(inner, op);
    EXPECT_EQ(inner->ft->getKeyCount(inner, nullptr), 0U);
}

TEST_F(ObjectPathTest, Place_is_copied_from_another_path) {
    CMPIObjectPath* from = mb()->eft->newObjectPath(mb(), "root/from", "TEST_From", nullptr);
    from->ft->setHostname(from, "far");
    CMPIObjectPath* op = path();
    op->ft->setHostname(op, "near");
    EXPECT_EQ(op->ft->setNameSpaceFromObjectPath(op, from).rc, CMPI_RC_OK);
    EXPECT_EQ(text(op->ft->toString(op, nullptr)), "//near/root/from:TEST_From");
    EXPECT_EQ(op->ft->setHostAndNameSpaceFromObjectPath(op, from).rc, CMPI_RC_OK);
    EXPECT_EQ(text(op->ft->toString(op, &st)), "//far/root/from:TEST_From");
    EXPECT_EQ(rc(), CMPI_RC_OK);
    EXPECT_EQ(op->ft->setNameSpaceFromObjectPath(op, nullptr).rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(op->ft->setHostAndNameSpaceFromObjectPath(op, nullptr).rc,
              CMPI_RC_ERR_INVALID_HANDLE);
}

TEST_F(ObjectPathTest, Qualifiers_are_not_supported) {
    const CMPIObjectPath* op = path();
    EXPECT_TRUE(isNull(op->ft->getClassQualifier(op, "Q", &st)));
    EXPECT_EQ(rc(), CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_TRUE(isNull(op->ft->getPropertyQualifier(op, "P", "Q", &st)));
    EXPECT_EQ(rc(), CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_TRUE(isNull(op->ft->getMethodQualifier(op, "M", "Q", &st)));
    EXPECT_EQ(rc(), CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_TRUE(isNull(op->ft->getParameterQualifier(op, "M", "P", "Q", &st)));
    EXPECT_EQ(rc(), CMPI_RC_ERR_NOT_SUPPORTED);
    op->ft->getClassQualifier(nullptr, "Q", &st);
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_HANDLE);
}

} // namespace
} // namespace qelo::broker::testing
