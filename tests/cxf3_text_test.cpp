// The crossings between public UTF-8 strings and the binding's UTF-16 ones.
#include <gtest/gtest.h>

#include "dll/cxfwrapper/source/cxf3text.h"

#include <boost/shared_ptr.hpp>

#include <stdexcept>

TEST(CxF3Text, NarrowToWideToNarrowKeepsAllOfUnicode) {
    const std::string text = "A\xC3\xA9\xE8\x89\xB2\xF0\x9F\x8E\xA8\xEF\xBF\xBF\xF4\x8F\xBF\xBF";
    const std::wstring wide = ToWide(text);
    // A, é, 色 one unit each; the two code points above U+FFFF two each.
    EXPECT_EQ(wide.size(), 8u);
    EXPECT_EQ(wide[3], static_cast<wchar_t>(0xD83C)); // U+1F3A8 as a surrogate pair
    EXPECT_EQ(wide[4], static_cast<wchar_t>(0xDFA8));
    EXPECT_EQ(ToNarrow(wide), text);
}

TEST(CxF3Text, TextIsTakenUpToItsFirstNul) {
    EXPECT_EQ(ToWide(std::string("ab\0cd", 5)), L"ab");
    EXPECT_EQ(ToNarrow(std::wstring(L"ab\0cd", 5)), "ab");
}

TEST(CxF3Text, EmptyTextStaysEmpty) {
    EXPECT_EQ(ToWide(""), L"");
    EXPECT_EQ(ToNarrow(L""), "");
}

TEST(CxF3Text, CurrentTimeIsWholeSecondsInUtc) {
    const std::string stamp = CurrentUtcDateTime().get_as_string();
    ASSERT_EQ(stamp.size(), 20u) << stamp;
    EXPECT_EQ(stamp[4], '-');
    EXPECT_EQ(stamp[10], 'T');
    EXPECT_EQ(stamp[19], 'Z');
}

TEST(CxF3Text, HandleThatRefersToNothingNamesItsClass) {
    const boost::shared_ptr<int> nothing;
    try {
        RequireTarget(nothing, "CxF3Object");
        FAIL() << "expected an exception";
    } catch (const std::logic_error &error) {
        EXPECT_STREQ(error.what(), "CxF3Object: the handle refers to nothing (unknown id)");
    }
}
