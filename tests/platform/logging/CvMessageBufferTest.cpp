#include "platform/CvLogger.h"

#include <gtest/gtest.h>

#include <iomanip>
#include <list>
#include <sstream>
#include <thread>
#include <type_traits>

namespace {

using CvLog::CvMessageBuffer;

static_assert(sizeof(CvMessageBuffer) == sizeof(void*), "holds exactly one pointer");
static_assert(!std::is_polymorphic_v<CvMessageBuffer>, "has no virtual functions");
static_assert(!std::is_copy_constructible_v<CvMessageBuffer>, "is not copyable");

TEST(CvMessageBuffer, A_new_buffer_is_empty) {
    CvMessageBuffer buffer;
    EXPECT_EQ(buffer.str(buffer), "");
}

TEST(CvMessageBuffer, Texts_numbers_and_flags_are_appended_in_order) {
    CvMessageBuffer buffer;
    buffer << "a" << std::string("b") << 0U << 4294967295U << true << false;
    EXPECT_EQ(buffer.str(buffer << "z"), "ab0429496729510z");
}

TEST(CvMessageBuffer, A_null_text_appends_nothing) {
    CvMessageBuffer buffer;
    const char* null = nullptr;
    EXPECT_EQ(buffer.str(buffer << "a" << null << "b"), "ab");
}

TEST(CvMessageBuffer, A_text_with_zero_bytes_is_appended_whole) {
    CvMessageBuffer buffer;
    EXPECT_EQ(buffer.str(buffer << std::string("a\0b", 3)), std::string("a\0b", 3));
}

TEST(CvMessageBuffer, Insertions_by_the_stream_and_by_the_buffer_make_one_text) {
    CvMessageBuffer buffer;
    buffer << "x=";
    std::ostream& stream = buffer;
    stream << -5 << ' ' << std::hex << 255;
    buffer << " end";
    EXPECT_EQ(buffer.str(buffer), "x=-5 ff end");
    EXPECT_EQ(buffer.str(stream), "x=-5 ff end");
}

TEST(CvMessageBuffer, A_pointer_goes_through_the_stream) {
    CvMessageBuffer buffer;
    const void* pointer = &buffer;
    std::ostringstream expected;
    expected << pointer;
    EXPECT_EQ(buffer.str(static_cast<std::ostream&>(buffer) << pointer), expected.str());
}

TEST(CvMessageBuffer, The_stream_is_always_the_same_one) {
    CvMessageBuffer buffer;
    std::ostream& first = buffer;
    std::ostream& second = buffer << "x";
    EXPECT_EQ(&first, &second);
}

TEST(CvMessageBuffer, What_a_stream_was_set_to_does_not_reach_the_next_buffer) {
    {
        CvMessageBuffer buffer;
        static_cast<std::ostream&>(buffer) << std::hex << std::setfill('*') << std::setw(9) << 1;
        static_cast<std::ostream&>(buffer).setstate(std::ios::failbit);
    }
    CvMessageBuffer next;
    EXPECT_EQ(next.str(static_cast<std::ostream&>(next) << std::setw(4) << 31), "  31");
}

TEST(CvMessageBuffer, The_text_of_an_earlier_buffer_does_not_appear_in_the_next) {
    for (int round = 0; round < 10; ++round) {
        CvMessageBuffer buffer;
        EXPECT_EQ(buffer.str(buffer << "secret"), "secret");
    }
}

TEST(CvMessageBuffer, The_text_of_another_buffer_is_read_where_that_is_given) {
    CvMessageBuffer buffer;
    CvMessageBuffer other;
    buffer << "mine";
    other << "other";
    EXPECT_EQ(buffer.str(other), "other");
    EXPECT_EQ(buffer.str(static_cast<std::ostream&>(other)), "other");
    EXPECT_EQ(buffer.str(buffer), "mine");
}

TEST(CvMessageBuffer, The_text_of_a_string_stream_is_read_and_of_other_streams_its_own) {
    CvMessageBuffer buffer;
    buffer << "mine";
    std::ostringstream text;
    text << "text";
    EXPECT_EQ(buffer.str(static_cast<std::ostream&>(text)), "text");
    std::ostream unreadable(nullptr);
    EXPECT_EQ(buffer.str(unreadable), "mine");
}

TEST(CvMessageBuffer, A_text_of_any_length_is_kept_whole) {
    const std::string large(3000000, 'x');
    CvMessageBuffer buffer;
    EXPECT_EQ(buffer.str(buffer << large << large.c_str()), large + large);
    static_cast<std::ostream&>(buffer) << large;
    EXPECT_EQ(buffer.str(buffer).size(), 9000000U);
}

TEST(CvMessageBuffer, Many_buffers_at_once_keep_their_texts_apart) {
    std::list<CvMessageBuffer> buffers;
    for (unsigned number = 0; number < 100; ++number) {
        buffers.emplace_back() << number;
    }
    unsigned number = 0;
    for (CvMessageBuffer& buffer : buffers) {
        EXPECT_EQ(buffer.str(buffer), std::to_string(number++));
    }
}

TEST(CvMessageBuffer, A_buffer_may_end_in_another_thread_than_it_began_in) {
    for (int round = 0; round < 20; ++round) {
        auto buffer = std::make_unique<CvMessageBuffer>();
        *buffer << "text";
        std::thread([&buffer] { buffer.reset(); }).join();
    }
}

// Made before the thread's first buffer and so destroyed after what buffers leave behind.
struct LateUser {
    std::string* result = nullptr;
    ~LateUser() {
        for (int round = 0; round < 3; ++round) {
            CvMessageBuffer buffer;
            static_cast<std::ostream&>(buffer) << "late";
            *result += buffer.str(buffer);
        }
    }
};
thread_local LateUser lateUser;

TEST(CvMessageBuffer, Buffers_work_while_their_thread_ends) {
    std::string result;
    std::thread([&result] {
        lateUser.result = &result;
        CvMessageBuffer buffer;
        buffer << "early";
    }).join();
    EXPECT_EQ(result, "latelatelate");
}

} // namespace
