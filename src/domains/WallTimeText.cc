#include "domains/WallTimeText.h"

#include <unicode/smpdtfmt.h>

#include <memory>
#include <mutex>

#include "base/Console.h"

namespace bw {

std::string formatWallTime(std::uint64_t ms) {
  // One formatter per pattern, made on first use in the process's zone and
  // shared; ICU formatters are not safe to use from two threads at once.
  static std::mutex lock;
  static std::unique_ptr<icu::SimpleDateFormat> plain;
  static std::unique_ptr<icu::SimpleDateFormat> withOffset;
  std::lock_guard<std::mutex> guard(lock);
  std::unique_ptr<icu::SimpleDateFormat>& formatter = gDebug ? withOffset : plain;
  if (!formatter) {
    UErrorCode status = U_ZERO_ERROR;
    formatter = std::make_unique<icu::SimpleDateFormat>(
        icu::UnicodeString(gDebug ? "yyyy-MM-dd HH:mm:ss ZZ" : "yyyy-MM-dd HH:mm:ss"), icu::Locale::getRoot(),
        status);
  }
  icu::UnicodeString text;
  formatter->format(static_cast<UDate>(ms), text);
  std::string result;
  text.toUTF8String(result);
  return result;
}

}  // namespace bw
