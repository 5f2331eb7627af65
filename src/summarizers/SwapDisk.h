#pragma once
// The solid-state details of the disk that holds swap, for the standby
// report: the block device behind the first entry of /proc/swaps (for a
// partition, its parent disk), and its product name and firmware revision
// from /sys when the disk does not rotate.
#include <optional>
#include <string>

namespace bw {

struct SwapDiskInfo {
  // The disk does not rotate.
  bool solidState = false;
  std::optional<std::string> productName;
  std::optional<std::string> productRevisionLevel;
};

// Looks the disk up with every path under `root` ("" for the machine
// itself). No swap entry, a failing stat of the swap file or device, or a
// device number without a block device is written to the assumption log
// with the error number (0 when there is none) and answers nothing. A
// rotating disk or missing details answer nothing, silently.
SwapDiskInfo lookUpSwapDisk(const std::string& root);

// The machine's swap disk, looked up on the first call in the process.
const SwapDiskInfo& swapDiskInfo();

}  // namespace bw
