// Marks, memory blocks, the early end of objects, and threads.
#include "BrokerFixture.h"

#include <broker/Instances.h>

#include <cstdint>
#include <cstring>
#include <thread>

namespace qelo::broker::testing {
namespace {

class MemoryTest : public BrokerTest {
protected:
    const CMPIBrokerMemFT& mft() { return *mb()->mft; }
};

TEST_F(MemoryTest, The_capabilities_announce_the_memory_table) {
    EXPECT_NE(mb()->bft->brokerCapabilities &
                  static_cast<unsigned int>(CMPI_MB_Supports_MemEnhancements),
              0U);
    EXPECT_EQ(mft().ftVersion, 200);
}

TEST_F(MemoryTest, Objects_made_before_a_mark_survive_its_release) {
    CMPIInstance* before = instance();
    CMPIGcStat* mark = mft().mark(mb(), &st);
    EXPECT_EQ(rc(), CMPI_RC_OK);
    ASSERT_NE(mark, nullptr);
    // Set inside the mark, but part of the older object.
    const CMPIString* inner = string("inner");
    before->ft->setProperty(before, "P", reinterpret_cast<const CMPIValue*>(&inner), CMPI_string);
    EXPECT_EQ(mft().release(mb(), mark).rc, CMPI_RC_OK);
    EXPECT_EQ(text(before->ft->getProperty(before, "P", nullptr).value.string), "inner");
}

TEST_F(MemoryTest, Levels_that_follow_each_other_do_not_disturb_each_other) {
    for (int level = 0; level < 1000; ++level) {
        CMPIGcStat* mark = mft().mark(mb(), nullptr);
        CMPIInstance* made = instance();
        const std::string expected = std::to_string(level);
        for (const char* name : {"P", "Q", "p2"}) {
            const CMPIString* value = string(expected.c_str());
            made->ft->setProperty(made, name, reinterpret_cast<const CMPIValue*>(&value),
                                  CMPI_string);
        }
        EXPECT_EQ(made->ft->getPropertyCount(made, nullptr), 3U);
        EXPECT_EQ(text(made->ft->getProperty(made, "p2", nullptr).value.string), expected);
        ASSERT_EQ(mft().release(mb(), mark).rc, CMPI_RC_OK);
    }
}

TEST_F(MemoryTest, Names_without_end_are_kept_apart_and_end_with_their_level) {
    constexpr int levels = 300;
    constexpr int names = 50;
    for (int level = 0; level < levels; ++level) {
        CMPIGcStat* mark = mft().mark(mb(), nullptr);
        CMPIInstance* made = instance();
        for (int name = 0; name < names; ++name) {
            const std::string spelled = "P" + std::to_string(level * names + name);
            const CMPIUint32 value = static_cast<CMPIUint32>(name);
            made->ft->setProperty(made, spelled.c_str(), reinterpret_cast<const CMPIValue*>(&value),
                                  CMPI_uint32);
            CMPIString* given = nullptr;
            made->ft->getPropertyAt(made, static_cast<CMPICount>(name), &given, nullptr);
            ASSERT_EQ(text(given), spelled);
        }
        ASSERT_EQ(mft().release(mb(), mark).rc, CMPI_RC_OK);
    }
}

TEST_F(MemoryTest, A_clone_made_inside_a_mark_survives_its_release) {
    CMPIGcStat* mark = mft().mark(mb(), nullptr);
    CMPIString* inner = string("inner");
    CMPIString* copy = inner->ft->clone(inner, nullptr);
    EXPECT_EQ(mft().release(mb(), mark).rc, CMPI_RC_OK);
    EXPECT_EQ(text(copy), "inner");
    copy->ft->release(copy);
}

TEST_F(MemoryTest, Marks_nest_and_only_the_innermost_can_be_released) {
    CMPIGcStat* outer = mft().mark(mb(), nullptr);
    CMPIGcStat* inner = mft().mark(mb(), nullptr);
    EXPECT_EQ(mft().release(mb(), outer).rc, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(mft().release(mb(), inner).rc, CMPI_RC_OK);
    EXPECT_EQ(mft().release(mb(), outer).rc, CMPI_RC_OK);
    EXPECT_EQ(mft().release(mb(), outer).rc, CMPI_RC_ERR_INVALID_HANDLE);
}

TEST_F(MemoryTest, A_mark_of_nobody_and_a_null_mark_are_refused) {
    int elsewhere = 0;
    EXPECT_EQ(mft().release(mb(), &elsewhere).rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(mft().release(mb(), nullptr).rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(mft().release(nullptr, &elsewhere).rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(mft().mark(nullptr, &st), nullptr);
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_HANDLE);
}

TEST_F(MemoryTest, A_mark_that_is_never_released_ends_with_the_call) {
    ASSERT_NE(mft().mark(mb(), nullptr), nullptr);
    string("left inside the mark");
    nextCall(); // the leak checker sees what stays
    EXPECT_EQ(text(string("after")), "after");
}

TEST_F(MemoryTest, Blocks_behave_as_those_of_the_C_library) {
    auto* bytes = static_cast<unsigned char*>(mft().cmpiMalloc(mb(), 16));
    ASSERT_NE(bytes, nullptr);
    std::memset(bytes, 7, 16);
    bytes = static_cast<unsigned char*>(mft().cmpiRealloc(mb(), bytes, 1000));
    ASSERT_NE(bytes, nullptr);
    EXPECT_EQ(bytes[15], 7);
    bytes = static_cast<unsigned char*>(mft().cmpiRealloc(mb(), bytes, 4));
    ASSERT_NE(bytes, nullptr);
    EXPECT_EQ(bytes[3], 7);
    mft().cmpiFree(mb(), bytes);

    auto* zeros = static_cast<unsigned char*>(mft().cmpiCalloc(mb(), 3, 5));
    ASSERT_NE(zeros, nullptr);
    EXPECT_EQ(zeros[14], 0);
    char* copy = mft().cmpiStrDup(mb(), "text");
    EXPECT_STREQ(copy, "text");
    void* fresh = mft().cmpiRealloc(mb(), nullptr, 8);
    EXPECT_NE(fresh, nullptr);
    // The broker frees these three; the leak checker sees whether it does.
}

TEST_F(MemoryTest, A_block_is_freed_once_whatever_the_provider_does) {
    void* block = mft().cmpiMalloc(mb(), 16);
    mft().cmpiFree(mb(), block);
    mft().cmpiFree(mb(), block);
    int own = 0;
    mft().cmpiFree(mb(), &own);
    mft().cmpiFree(mb(), nullptr);
    EXPECT_EQ(mft().cmpiRealloc(mb(), &own, 10), nullptr);
}

TEST_F(MemoryTest, A_size_that_overflows_gives_null) {
    EXPECT_EQ(mft().cmpiCalloc(mb(), SIZE_MAX / 2, 4), nullptr);
    EXPECT_EQ(mft().cmpiStrDup(mb(), nullptr), nullptr);
    EXPECT_EQ(mft().cmpiMalloc(nullptr, 4), nullptr);
    EXPECT_NE(mft().cmpiMalloc(mb(), 0), nullptr);
}

TEST_F(MemoryTest, Freed_objects_are_dead) {
    CMPIInstance* freedInstance = instance();
    CMPIObjectPath* freedPath = path();
    CMPIArgs* freedArgs = args();
    CMPIString* freedString = string("text");
    CMPIArray* freedArray = array(1, CMPI_uint8);
    CMPIDateTime* freedTime = mb()->eft->newDateTime(mb(), nullptr);
    mft().freeInstance(mb(), freedInstance);
    mft().freeObjectPath(mb(), freedPath);
    mft().freeArgs(mb(), freedArgs);
    mft().freeString(mb(), freedString);
    mft().freeArray(mb(), freedArray);
    mft().freeDateTime(mb(), freedTime);
    mft().freeSelectExp(mb(), nullptr);
    EXPECT_EQ(freedInstance->hdl, nullptr);
    EXPECT_EQ(freedPath->hdl, nullptr);
    EXPECT_EQ(freedArgs->hdl, nullptr);
    EXPECT_EQ(freedString->hdl, nullptr);
    EXPECT_EQ(freedArray->hdl, nullptr);
    EXPECT_EQ(freedTime->hdl, nullptr);
    mft().freeString(mb(), freedString);
    mft().freeString(mb(), nullptr);
}

TEST_F(MemoryTest, Freeing_a_clone_or_a_part_of_another_object_does_nothing) {
    CMPIString* copy = string("text")->ft->clone(string("text"), nullptr);
    mft().freeString(mb(), copy);
    EXPECT_EQ(text(copy), "text");
    copy->ft->release(copy);

    CMPIInstance* whole = instance();
    CMPIObjectPath* part = whole->ft->getObjectPath(whole, nullptr);
    mft().freeObjectPath(mb(), part);
    EXPECT_EQ(part->ft->release(part).rc, CMPI_RC_OK);
    EXPECT_EQ(text(part->ft->getClassName(part, nullptr)), "TEST_Thing");
}

TEST_F(MemoryTest, A_thread_outside_any_call_can_make_objects) {
    std::string seen;
    std::thread([&] { seen = text(string("made in a thread")); }).join();
    EXPECT_EQ(seen, "made in a thread");
}

TEST_F(MemoryTest, An_attached_thread_owns_objects_until_it_detaches) {
    CMPIContext* prepared = mb()->bft->prepareAttachThread(mb(), context({"alice", "", "", ""}));
    ASSERT_NE(prepared, nullptr);
    nextCall(); // the old thread's call is over before the new thread starts
    std::thread([&] {
        EXPECT_EQ(mb()->bft->attachThread(mb(), prepared).rc, CMPI_RC_OK);
        EXPECT_EQ(openFrame()->kind(), Frame::Kind::Attachment);
        const CMPIData who = prepared->ft->getEntry(prepared, CMPIPrincipal, nullptr);
        EXPECT_EQ(text(who.value.string), "alice");
        EXPECT_EQ(text(string("inside")), "inside");
        EXPECT_EQ(mb()->bft->detachThread(mb(), prepared).rc, CMPI_RC_OK);
        EXPECT_EQ(openFrame(), nullptr);
    }).join();
}

TEST_F(MemoryTest, Detaching_what_is_not_attached_is_refused) {
    CMPIContext* prepared = mb()->bft->prepareAttachThread(mb(), context());
    EXPECT_EQ(mb()->bft->detachThread(mb(), prepared).rc, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(mb()->bft->attachThread(mb(), nullptr).rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(mb()->bft->detachThread(mb(), nullptr).rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(mb()->bft->attachThread(nullptr, prepared).rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(mb()->bft->prepareAttachThread(mb(), nullptr), nullptr);
}

TEST_F(MemoryTest, A_thread_that_ends_attached_leaves_nothing_behind) {
    CMPIContext* prepared = mb()->bft->prepareAttachThread(mb(), context());
    std::thread([&] {
        EXPECT_EQ(mb()->bft->attachThread(mb(), prepared).rc, CMPI_RC_OK);
        string("left behind");
    }).join(); // the leak checker sees what stays
}

TEST_F(MemoryTest, A_key_destructor_of_an_ending_thread_gets_no_objects_and_no_crash) {
    static const CMPIBroker* theBroker = nullptr;
    static CMPIStatus seen = {};
    theBroker = mb();
    CMPI_THREAD_KEY_TYPE key = 0;
    ASSERT_EQ(mb()->xft->createThreadKey(
                  &key, [](void*) { (void)theBroker->eft->newString(theBroker, "late", &seen); }),
              0);
    std::thread([&] {
        string("early");
        mb()->xft->setThreadSpecific(key, &seen);
    }).join();
    EXPECT_EQ(seen.rc, CMPI_RC_ERR_FAILED);
    mb()->xft->destroyThreadKey(key);
}

} // namespace
} // namespace qelo::broker::testing
