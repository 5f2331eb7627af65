#include "reports/ReportText.h"

#include <cmath>
#include <limits>

#include "base/Console.h"
#include "base/Duration.h"
#include "domains/WallTimeText.h"
#include "model/Model.h"

namespace bw {

void printHeading(std::ostream& o, const std::string& title) {
  o << '\n' << title << '\n' << std::string(title.size(), '=') << '\n';
}

void printLabelLine(std::ostream& o, const std::string& label, const std::string& value) {
  constexpr std::size_t kColumns = 20;
  if (label.size() < kColumns) o << std::string(kColumns - label.size(), ' ');
  o << label << ":\t" << value << '\n';
}

void printBlankLine(std::ostream& o) { o << '\n'; }

void printLine(std::ostream& o, const std::string& text) { o << text << '\n'; }

std::string dateText(std::uint64_t wallTime) { return formatWallTime(wallTime); }

std::string rangeText(const Model& model, const Range& range) {
  return dateText(model.wallTimeForRelative(range.location)) + " to " +
         dateText(model.wallTimeForRelative(range.location + range.length)) + " (" +
         durationText(static_cast<std::int64_t>(range.length)) + ")";
}

double plainNaN(double value) { return std::isnan(value) ? std::numeric_limits<double>::quiet_NaN() : value; }

std::string byteText(double bytes) {
  if (bytes > 1.073741824e12) return format("% 10.1f %s", bytes / 1073741824.0, "GB");
  if (bytes > 1048576.0) return format("% 10.1f %s", bytes / 1048576.0, "MB");
  return format("% 10.1f %s", bytes / 1024.0, "KB");
}

}  // namespace bw
