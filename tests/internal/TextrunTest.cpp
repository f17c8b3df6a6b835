#include <zelmar/internal/platform/Textrun.h>

#include <gtest/gtest.h>

#include <cstdlib>
#include <memory>
#include <string>

namespace {

std::string Escaped(const char* text) {
    const std::unique_ptr<char, decltype(&std::free)> copy(Textrun_EscapeBuffer(text, -1, 0),
                                                           &std::free);
    return copy.get();
}

TEST(Textrun, AcceptsStrictUtf8AndEscapesTheRestByteByByte) {
    const std::pair<const char*, const char*> cases[] = {
        {"", ""},
        {"a\x7f\n\\x", "a\x7f\n\\x"},
        {"\xc2\x80\xdf\xbf", "\xc2\x80\xdf\xbf"},
        {"\xe0\xa0\x80\xed\x9f\xbf\xee\x80\x80", "\xe0\xa0\x80\xed\x9f\xbf\xee\x80\x80"},
        {"\xf0\x90\x80\x80\xf4\x8f\xbf\xbf", "\xf0\x90\x80\x80\xf4\x8f\xbf\xbf"},
        {"\xc0\x80", R"(\xc0\x80)"},                  // overlong
        {"\xc1\xbf", R"(\xc1\xbf)"},                  // overlong
        {"\xe0\x9f\xbf", R"(\xe0\x9f\xbf)"},          // overlong
        {"\xf0\x8f\xbf\xbf", R"(\xf0\x8f\xbf\xbf)"},  // overlong
        {"\xed\xa0\x80", R"(\xed\xa0\x80)"},          // surrogate
        {"\xf4\x90\x80\x80", R"(\xf4\x90\x80\x80)"},  // above the last
        {"\xf5\x80\x80\x80\xff", R"(\xf5\x80\x80\x80\xff)"},
        {"\x80z", "\\x80z"},  // nothing to continue
        {"\xc3", R"(\xc3)"},  // cut short
        {"\xe2\x82", R"(\xe2\x82)"},
        {"\xf0\x9f\x98z", R"(\xf0\x9f\x98z)"},
        {"\xe2\xc3\xa4", "\\xe2\xc3\xa4"},  // and resumes at the next lead
    };
    for (const auto& [text, escaped] : cases) {
        EXPECT_EQ(Textrun_IsBufferValid(text, -1, 0), std::string(text) == escaped) << escaped;
        EXPECT_EQ(Escaped(text), escaped);
        EXPECT_TRUE(Textrun_IsBufferValid(escaped, -1, 0)) << escaped;
    }
    EXPECT_TRUE(Textrun_IsBufferValid("\xc3\xa4\xff", 2, 0));
    EXPECT_FALSE(Textrun_IsBufferValid("\xc3\xa4\xff", 3, 0));
}

}  // namespace
