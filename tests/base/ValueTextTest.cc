#include <gtest/gtest.h>

#include <climits>
#include <cstdio>

#include "base/DecimalText.h"
#include "base/Duration.h"
#include "base/Value.h"

namespace bw {
namespace {

TEST(ValueText, NestedDictionaryAndArrayIndentFourSpacesPerLevel) {
  Dictionary inner{{"level", Value(std::uint64_t{1})}, {"residency", Value(std::uint64_t{250})}};
  Dictionary outer{{"absolute_time", Value(std::uint64_t{5})}, {"states", Value(Array{Value(inner), Value(inner)})}};
  EXPECT_EQ(describeValue(Value(outer)),
            "{\n"
            "    absolute_time = 5;\n"
            "    states = (\n"
            "        {\n"
            "            level = 1;\n"
            "            residency = 250;\n"
            "        },\n"
            "        {\n"
            "            level = 1;\n"
            "            residency = 250;\n"
            "        }\n"
            "    );\n"
            "}");
}

TEST(ValueText, StringsAreQuotedOnlyWhenTheyHoldOtherCharacters) {
  EXPECT_EQ(describeValue(Value("abc_$./:-09")), "abc_$./:-09");
  EXPECT_EQ(describeValue(Value("two words")), "\"two words\"");
  EXPECT_EQ(describeValue(Value("")), "\"\"");
  EXPECT_EQ(describeValue(Value("say \"hi\"\n")), "\"say \\\"hi\\\"\\n\"");
}

// The hot text writers' integers print as printf prints them (the space
// flag means nothing to an unsigned conversion).
TEST(DecimalText, MatchesPrintfForEveryWidthAndFlag) {
  const auto check = [](auto v, int width, const char* spaces, const char* zeros, const char* sign) {
    char expected[64];
    const struct {
      DecimalPad pad;
      const char* format;
    } rows[] = {{DecimalPad::kSpaces, spaces}, {DecimalPad::kZeros, zeros}, {DecimalPad::kSignSpace, sign}};
    for (const auto& row : rows) {
      std::string text;
      appendDecimal(text, v, width, row.pad);
      std::snprintf(expected, sizeof expected, row.format, width, v);
      EXPECT_EQ(text, expected) << row.format << " " << width;
    }
  };
  for (int width : {0, 1, 2, 5, 8, 25, 60}) {
    for (long long v : {0LL, 7LL, -7LL, 42LL, -42LL, 123456789LL, LLONG_MIN, LLONG_MAX})
      check(v, width, "%*lld", "%0*lld", "% *lld");
    for (unsigned long long v : {0ULL, 42ULL, ULLONG_MAX}) check(v, width, "%*llu", "%0*llu", "%*llu");
  }
  EXPECT_EQ(durationText(-4000), "00:00:-4");
}

}  // namespace
}  // namespace bw
