#pragma once
// SleepWake: the system went to sleep (`reason` 0), woke fully (1) or woke
// dark (2), with the wall time of the moment and the wake's timing details.
// Written under two stream type numbers that both decode as this class.
#include "Records/RecordFields.h"

namespace bw {

#define BW_SLEEP_WAKE_FIELDS(F)                                                                           \
  F(absoluteTime, AbsoluteTime, 1, UInt64, Required, "absolute_time")                                     \
  F(wallTime, WallTime, 2, UInt64, Required, "wall_time")                                                 \
  F(reason, Reason, 3, UInt32, Optional, "reason")                                                        \
  F(wakeFromStandby, WakeFromStandby, 4, Bool, Optional, "wake_from_standby")                             \
  F(wakeType, WakeType, 5, String, Optional, "wake_type")                                                 \
  F(efiMsec, EfiMsec, 6, UInt64, Optional, "efi_msec")                                                    \
  F(booterMsec, BooterMsec, 7, UInt64, Optional, "booter_msec")                                           \
  F(trampolineMsec, TrampolineMsec, 8, UInt64, Optional, "trampoline_msec")                               \
  F(imageReadMsec, ImageReadMsec, 9, UInt64, Optional, "image_read_msec")                                 \
  F(imagePages, ImagePages, 10, UInt64, Optional, "image_pages")                                          \
  F(image1Pages, Image1Pages, 11, UInt64, Optional, "image1_pages")                                       \
  F(wakeNotificationMsec, WakeNotificationMsec, 12, UInt64, Optional, "wake_notification_msec")           \
  F(lockScreenReadyMsec, LockScreenReadyMsec, 13, UInt64, Optional, "lock_screen_ready_msec")             \
  F(graphicsReadyMsec, GraphicsReadyMsec, 14, UInt64, Optional, "graphics_ready_msec")                    \
  F(recordWriteAbsoluteTime, RecordWriteAbsoluteTime, 15, UInt64, Optional, "record_write_absolute_time") \
  F(xcpmDeepIdleStats, XcpmDeepIdleStats, 16, String, Optional, "xcpm_deep_idle_stats")

class SleepWake final : public Record {
 public:
  BW_RECORD_INTERFACE(SleepWake, BW_SLEEP_WAKE_FIELDS, BW_NO_REPEATED_FIELDS)

  // The `reason` codes.
  static constexpr std::uint32_t kSleep = 0;
  static constexpr std::uint32_t kWake = 1;
  static constexpr std::uint32_t kDarkWake = 2;

  // The record carries a wall time of its own.
  bool answersWallTime() const override { return true; }
  // "Sleep" when reason is 0; otherwise "DarkWake" (reason 2) or "Wake",
  // then " from Standby" when wakeFromStandby, then " (wakeType)".
  std::optional<std::string> prettyPrint() const override;

 private:
  BW_RECORD_STORAGE(BW_SLEEP_WAKE_FIELDS, BW_NO_REPEATED_FIELDS)
};

}  // namespace bw
