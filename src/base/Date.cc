#include "base/Date.h"

#include <unicode/smpdtfmt.h>
#include <unicode/timezone.h>

#include <memory>
#include <mutex>

namespace bw {

std::string describeDate(Date d) {
  // ICU's calendar switches to Julian before 1582, so distant dates read as
  // users of this format expect.
  static std::once_flag once;
  static std::unique_ptr<icu::SimpleDateFormat> format;
  static std::mutex lock;
  std::call_once(once, [] {
    UErrorCode status = U_ZERO_ERROR;
    format = std::make_unique<icu::SimpleDateFormat>(icu::UnicodeString("yyyy-MM-dd HH:mm:ss Z"),
                                                     icu::Locale::getRoot(), status);
    format->adoptTimeZone(icu::TimeZone::createTimeZone("UTC"));
  });
  std::lock_guard<std::mutex> guard(lock);
  icu::UnicodeString out;
  format->format(d.milliseconds(), out);
  std::string text;
  out.toUTF8String(text);
  return text;
}

}  // namespace bw
