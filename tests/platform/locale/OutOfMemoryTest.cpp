// Every allocation of a lookup fails in its turn.
#include "../logging/FailingNew.h"

#include "platform/TeskLocale.h"

#include <gtest/gtest.h>

#include <new>

namespace {

using qelo::test::FailingNew;
using Tesk::Locale;
using Tesk::ResourceString;

constexpr int kMostAllocations = 1000;

TEST(OutOfMemory, A_lookup_gives_bad_alloc_and_is_right_the_next_time) {
    bool failed = true;
    int failures = 0;
    for (; failed && failures < kMostAllocations; ++failures) {
        const FailingNew failing(failures + 1);
        try {
            const std::wstring library = Locale::getResourceLibrary(2, "fr");
            const std::wstring text =
                ResourceString(library, L"MSGID_SIMPLE_ID_MANAGEMENT_CAPTION");
            EXPECT_EQ(text, L"Gestion simple des identit\u00e9s");
        } catch (const std::bad_alloc&) {
        }
        failed = failing.hasFailed();
    }
    EXPECT_GT(failures, 5);
    EXPECT_LT(failures, kMostAllocations);
}

} // namespace
