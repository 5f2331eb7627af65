#include "summarizers/JobName.h"

#include <unicode/regex.h>
#include <unicode/unistr.h>

#include "base/Exception.h"

namespace bw {
namespace {

constexpr const char* kPattern =
    R"((\.[A-F0-9]{8}-[A-F0-9]{4}-[A-F0-9]{4}-[A-F0-9]{4}-[A-F0-9]{12}\Z|\.[0-9]+\Z|\A\[0x[a-fA-F0-9]+-0x[a-fA-F0-9]+\]\.))";

// The compiled pattern is shared; a matcher holds per-search state and
// refers to its input, so each thread (the service answers on several)
// keeps its own matcher and input text.
struct Search {
  std::unique_ptr<icu::RegexMatcher> matcher;
  icu::UnicodeString input;
};

Search& search() {
  static const icu::RegexPattern* const pattern = [] {
    UErrorCode status = U_ZERO_ERROR;
    UParseError parseError{};
    icu::RegexPattern* p = icu::RegexPattern::compile(icu::UnicodeString::fromUTF8(kPattern), 0, parseError, status);
    if (U_FAILURE(status)) terminateUnsupported("job name pattern does not compile");
    return p;
  }();
  thread_local Search local = [] {
    UErrorCode status = U_ZERO_ERROR;
    Search s{std::unique_ptr<icu::RegexMatcher>(pattern->matcher(status)), {}};
    if (U_FAILURE(status)) terminateUnsupported("job name matcher cannot be made");
    return s;
  }();
  return local;
}

}  // namespace

std::string stringByRemovingTrailingUUIDsAndLaunchServicesStuff(const std::string& name) {
  // Every alternative needs a dot: most names have none and skip the search.
  if (name.find('.') == std::string::npos) return name;
  Search& s = search();
  s.input = icu::UnicodeString::fromUTF8(name);
  s.matcher->reset(s.input);
  UErrorCode status = U_ZERO_ERROR;
  const icu::UnicodeString replaced = s.matcher->replaceAll(icu::UnicodeString(), status);
  if (U_FAILURE(status)) return name;
  std::string result;
  replaced.toUTF8String(result);
  return result;
}

JobNames::Name JobNames::cleanedLabel(const std::string& raw) {
  auto it = names_.find(raw);
  if (it != names_.end() && it->second.clean) return it->second.name;
  std::string cleaned = stringByRemovingTrailingUUIDsAndLaunchServicesStuff(raw);
  if (cleaned == raw) {
    Entry& entry = names_[raw];
    if (!entry.name) entry.name = std::make_shared<const std::string>(raw);
    entry.clean = true;
    return entry.name;
  }
  return shared(cleaned);
}

JobNames::Name JobNames::shared(const std::string& text) {
  Entry& entry = names_[text];
  if (!entry.name) entry.name = std::make_shared<const std::string>(text);
  return entry.name;
}

}  // namespace bw
