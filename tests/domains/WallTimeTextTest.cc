#include <gtest/gtest.h>

#include <unicode/smpdtfmt.h>

#include <random>

#include "base/Console.h"
#include "domains/Support.h"
#include "domains/WallTimeText.h"

namespace bw {
namespace {

std::string icuText(std::uint64_t ms, const char* pattern) {
  UErrorCode status = U_ZERO_ERROR;
  icu::SimpleDateFormat formatter(icu::UnicodeString(pattern), icu::Locale::getRoot(), status);
  icu::UnicodeString text;
  formatter.format(static_cast<UDate>(ms), text);
  std::string out;
  text.toUTF8String(out);
  return out;
}

// The arithmetic fast path and its one-second memo must print exactly what
// the calendar formatter prints, across daylight-saving changes and far
// dates, with and without the offset.
TEST(WallTimeText, MatchesTheCalendarFormatterEverywhere) {
  std::mt19937_64 random(11);
  std::vector<std::uint64_t> instants = {0,
                                         1711846799999,
                                         1711846800000,
                                         1729990800000,
                                         1729994400000,
                                         253402300799999,
                                         253402300800000,
                                         ~std::uint64_t{0}};
  for (int i = 0; i < 3000; ++i) instants.push_back(random() % 4102444800000);  // up to 2100
  for (int i = 0; i < 200; ++i) instants.push_back(1711846800000 + random() % 7200000 - 3600000);
  for (int debug : {0, 1}) {
    gDebug = debug;
    for (std::uint64_t ms : instants) {
      EXPECT_EQ(formatWallTime(ms), icuText(ms, debug ? "yyyy-MM-dd HH:mm:ss ZZ" : "yyyy-MM-dd HH:mm:ss")) << ms;
      if (ms < ~std::uint64_t{0} - 999) {
        EXPECT_EQ(formatWallTime(ms + 999 - ms % 1000), formatWallTime(ms)) << ms;
      }
    }
  }
  gDebug = 0;
}

}  // namespace
}  // namespace bw
