// Held against the table by which the system itself compares names, so it exists on Windows alone.
#include <gtest/gtest.h>

#include "platform/name_case.h"
#include "platform/win32.h"

namespace {

TEST(NameCase, TakesForOneWhateverTheSystemDoes) {
    int alike = 0;
    for (wchar_t unit = 1; unit < 0xFFFF; ++unit) {
        wchar_t upper = unit;
        ASSERT_EQ(LCMapStringEx(LOCALE_NAME_INVARIANT, LCMAP_UPPERCASE, &unit, 1, &upper, 1, nullptr, nullptr, 0), 1);
        if (CompareStringOrdinal(&unit, 1, &upper, 1, TRUE) == CSTR_EQUAL && upper != unit) {
            EXPECT_EQ(platform::NameInUpperCase(std::wstring(1, unit)),
                      platform::NameInUpperCase(std::wstring(1, upper)))
                << static_cast<int>(unit);
            ++alike;
        }
    }
    EXPECT_GT(alike, 600);
}

}  // namespace
