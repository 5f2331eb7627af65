#include "summarizers/SwapDisk.h"

#include <sys/stat.h>
#include <sys/sysmacros.h>

#include <cerrno>
#include <filesystem>
#include <fstream>
#include <sstream>

#include "base/Console.h"
#include "base/Platform.h"

namespace bw {
namespace {

namespace fs = std::filesystem;

void reportFailure(const std::string& what, int errorNumber) {
  platform().assumptionLog(format("Swap disk lookup: %s: %d", what.c_str(), errorNumber));
}

// /proc/swaps writes blanks and other odd bytes of a path as \ooo.
std::string unescapeOctal(const std::string& text) {
  std::string out;
  for (std::size_t i = 0; i < text.size(); ++i) {
    if (text[i] == '\\' && i + 3 < text.size()) {
      const std::string digits = text.substr(i + 1, 3);
      if (digits.find_first_not_of("01234567") == std::string::npos) {
        out += static_cast<char>(std::stoi(digits, nullptr, 8));
        i += 3;
        continue;
      }
    }
    out += text[i];
  }
  return out;
}

// The first line of a sysfs attribute without surrounding blanks; none when
// the file cannot be read.
std::optional<std::string> readAttribute(const fs::path& path) {
  std::ifstream in(path);
  std::string line;
  if (!in || !std::getline(in, line)) return std::nullopt;
  const auto first = line.find_first_not_of(" \t\r\n");
  if (first == std::string::npos) return std::string();
  return line.substr(first, line.find_last_not_of(" \t\r\n") - first + 1);
}

}  // namespace

SwapDiskInfo lookUpSwapDisk(const std::string& root) {
  SwapDiskInfo info;

  // The first entry after the header line names the swap file or device.
  std::ifstream swaps(root + "/proc/swaps");
  if (!swaps) {
    reportFailure("cannot read /proc/swaps", errno);
    return info;
  }
  std::string line, swapPath;
  std::getline(swaps, line);
  if (std::getline(swaps, line)) std::istringstream(line) >> swapPath;
  if (swapPath.empty()) {
    reportFailure("no swap in use", 0);
    return info;
  }
  swapPath = unescapeOctal(swapPath);

  // A swap device is its own block device; a swap file lives on the one
  // that holds its file system.
  struct stat st {};
  if (::stat((root + swapPath).c_str(), &st) != 0) {
    reportFailure("stat " + swapPath, errno);
    return info;
  }
  const dev_t device = S_ISBLK(st.st_mode) ? st.st_rdev : st.st_dev;
  const std::string number = format("%u:%u", major(device), minor(device));
  std::error_code error;
  const fs::path node = fs::canonical(fs::path(root + "/sys/dev/block") / number, error);
  if (error) {
    reportFailure("no block device " + number, error.value());
    return info;
  }
  const std::string disk =
      fs::exists(node / "partition") ? node.parent_path().filename().string() : node.filename().string();

  const fs::path diskDir = fs::path(root + "/sys/block") / disk;
  if (readAttribute(diskDir / "queue" / "rotational") != "0") return info;
  info.solidState = true;
  info.productName = readAttribute(diskDir / "device" / "model");
  info.productRevisionLevel = readAttribute(diskDir / "device" / "rev");
  if (!info.productRevisionLevel) info.productRevisionLevel = readAttribute(diskDir / "device" / "firmware_rev");
  return info;
}

const SwapDiskInfo& swapDiskInfo() {
  static const SwapDiskInfo info = lookUpSwapDisk("");
  return info;
}

}  // namespace bw
