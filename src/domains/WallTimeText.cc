#include "domains/WallTimeText.h"

#include <unicode/smpdtfmt.h>
#include <unicode/timezone.h>

#include <memory>
#include <mutex>

#include "base/Console.h"
#include "base/DecimalText.h"
#include "time/Calendar.h"

namespace bw {

namespace {

std::string formatWithIcu(std::uint64_t ms, bool withOffset) {
  static std::unique_ptr<icu::SimpleDateFormat> formatters[2];
  std::unique_ptr<icu::SimpleDateFormat>& formatter = formatters[withOffset ? 1 : 0];
  if (!formatter) {
    UErrorCode status = U_ZERO_ERROR;
    formatter = std::make_unique<icu::SimpleDateFormat>(
        icu::UnicodeString(withOffset ? "yyyy-MM-dd HH:mm:ss ZZ" : "yyyy-MM-dd HH:mm:ss"), icu::Locale::getRoot(),
        status);
  }
  icu::UnicodeString text;
  formatter->format(static_cast<UDate>(ms), text);
  std::string result;
  text.toUTF8String(result);
  return result;
}

}  // namespace

std::string formatWallTime(std::uint64_t ms) {
  // The text changes once a second at most; listings print many records per
  // second, so the last second's text is kept. Years 1600 to 9999 are
  // formatted from the zone's offset by arithmetic, which gives what the
  // calendar formatter gives there; anything else goes to the formatter.
  static std::mutex lock;
  static std::unique_ptr<icu::TimeZone> zone;
  static std::uint64_t cachedSecond = 0;
  static int cachedMode = -1;
  static std::string cachedText;
  std::lock_guard<std::mutex> guard(lock);

  const bool withOffset = gDebug != 0;
  const std::uint64_t second = ms / 1000;
  if (cachedMode == static_cast<int>(withOffset) && cachedSecond == second) return cachedText;

  if (!zone) zone.reset(icu::TimeZone::createDefault());
  UErrorCode status = U_ZERO_ERROR;
  std::int32_t rawOffset = 0, dstOffset = 0;
  zone->getOffset(static_cast<UDate>(ms), false, rawOffset, dstOffset, status);
  const std::int64_t offsetSeconds = (static_cast<std::int64_t>(rawOffset) + dstOffset) / 1000;
  const std::int64_t local = static_cast<std::int64_t>(second) + offsetSeconds;
  std::int64_t days = local / 86400, secondOfDay = local % 86400;
  if (secondOfDay < 0) {
    secondOfDay += 86400;
    --days;
  }
  const YearMonthDay ymd = civilFromDays(days);
  const std::int64_t year = ymd.year;
  const unsigned month = static_cast<unsigned>(ymd.month), day = static_cast<unsigned>(ymd.day);

  std::string text;
  if (U_FAILURE(status) || year < 1600 || year > 9999 || (offsetSeconds % 60) != 0) {
    text = formatWithIcu(ms, withOffset);
  } else {
    const auto two = [&text](long long v) { appendDecimal(text, v, 2, DecimalPad::kZeros); };
    appendDecimal(text, static_cast<long long>(year), 4, DecimalPad::kZeros);
    text += '-';
    two(month);
    text += '-';
    two(day);
    text += ' ';
    two(secondOfDay / 3600);
    text += ':';
    two(secondOfDay / 60 % 60);
    text += ':';
    two(secondOfDay % 60);
    if (withOffset) {
      const std::int64_t minutes = (offsetSeconds < 0 ? -offsetSeconds : offsetSeconds) / 60;
      text += offsetSeconds < 0 ? " -" : " +";
      two(minutes / 60);
      two(minutes % 60);
    }
  }
  cachedSecond = second;
  cachedMode = withOffset;
  cachedText = text;
  return text;
}

}  // namespace bw
