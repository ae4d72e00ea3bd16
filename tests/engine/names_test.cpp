// Name folding, comparison and path splitting.
#include <gtest/gtest.h>

#include <string>

#include "engine/names.h"
#include "engine/platform.h"

using namespace vrx::engine;

namespace {

TEST(Names, StrUpperFoldsAsciiAndSkipsTwoByteCharacters) {
    struct Case {
        std::string in, out;
    };
    const Case cases[] = {
        {"box01", "BOX01"},
        {"MiXeD-case_9", "MIXED-CASE_9"},
        // 0x82 0x61 is one two-byte character: its trail byte 'a' stays as it is.
        {"a\x82"
         "ab",
         "A\x82"
         "aB"},
        {"\xb0", "\xb0"}, // a lead byte at the end
        {"", ""},
    };
    for (const Case& c : cases) {
        std::string s = c.in;
        EXPECT_EQ(StrUpper(s.data()), s.data());
        EXPECT_EQ(s, c.out) << c.in;
    }
}

TEST(Names, CaseFoldingComparisons) {
    constexpr int kWhole = INT32_MIN;
    struct Case {
        const char *a, *b;
        int n; // kWhole: the whole strings
        int sign;
    };
    const Case cases[] = {
        {"Box01", "BOX01", kWhole, 0},
        {"a", "ab", kWhole, -1},
        {"ab", "a", kWhole, 1},
        {"abc", "ABD", kWhole, -1},
        {"", "", kWhole, 0},
        {"\xe9", "a", kWhole, -1},
        {"tga", "TGA", 3, 0},
        {"tgx", "TGA", 2, 0},
        {"tga", "TGB", 3, -1},
        {"x", "y", 0, 0},
        {"x", "y", -3, 0},
        {"a\0b", "a\0c", 3, -1}, // a counted compare does not stop at a terminator
    };
    for (const Case& c : cases) {
        int r = c.n == kWhole ? StrCmpNoCase(c.a, c.b) : StrNCmpNoCase(c.a, c.b, c.n);
        EXPECT_EQ((r > 0) - (r < 0), c.sign) << c.a << " vs " << c.b << " n=" << c.n;
    }
    // The difference is of the folded bytes: 'a' (as 'A') minus 'c' (as 'C').
    EXPECT_EQ(StrCmpNoCase("a", "c"), 'A' - 'C');
}

TEST(Paths, SplittingAcceptsBothSeparatorsAndHostPathsUseSlashes) {
    struct Case {
        const char* path;
        const char* base;
        size_t dir_len;
    };
    const Case cases[] = {{"data\\tex\\wall.tga", "wall.tga", 9},
                          {"data/tex/wall.tga", "wall.tga", 9},
                          {"data\\tex/wall.tga", "wall.tga", 9},
                          {"wall.tga", "wall.tga", 0},
                          {"dir\\", "", 4}};
    for (const Case& c : cases) {
        EXPECT_STREQ(path_base_name(c.path), c.base) << c.path;
        EXPECT_EQ(path_dir_length(c.path), c.dir_len) << c.path;
    }
    char out[16];
    ASSERT_TRUE(host_path("a\\b\\c.tga", out, sizeof out));
#if !defined(_WIN32)
    EXPECT_STREQ(out, "a/b/c.tga");
#endif
    EXPECT_FALSE(host_path("0123456789abcdef", out, sizeof out)); // 16 + NUL does not fit
}

} // namespace
