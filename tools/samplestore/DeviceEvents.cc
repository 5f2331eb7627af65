#include "DeviceEvents.h"

#include <algorithm>

#include "Records/BluetoothPowerResidency.h"
#include "Records/DeviceChange.h"
#include "Records/DisplayBrightness.h"
#include "Records/PanelSelfRefresh.h"
#include "Records/SystemIO.h"
#include "Records/SystemMemory.h"

namespace bw::samplestore {

namespace {

// Device types as the power daemon reports them.
constexpr std::uint32_t kStorage = 1;
constexpr std::uint32_t kKeyboard = 2;
constexpr std::uint32_t kAudio = 3;
constexpr std::uint32_t kDisplay = 4;
constexpr std::uint32_t kWiFi = DeviceChange::kWiFi;
constexpr std::uint32_t kBluetooth = DeviceChange::kBluetooth;
constexpr std::uint32_t kDiscreteGpu = DeviceChange::kDiscreteGraphics;

struct Device {
  std::uint32_t type;
  const char* name;
  const char* id;
  std::uint64_t registry;
};

constexpr Device kWiFiRadio{kWiFi, "Wi-Fi", "wlan0", 0x100000321};
constexpr Device kBluetoothRadio{kBluetooth, "Bluetooth", "bt0", 0x100000344};
constexpr Device kGpu{kDiscreteGpu, "Discrete GPU", "gpu1", 0x1000004a0};
constexpr Device kExternalDisplay{kDisplay, "External Display", "disp-27q-4c2a", 0x100000b10};
constexpr Device kDeskKeyboard{kKeyboard, "Keyboard", "hid-kb-0193", 0x100000b42};
constexpr Device kUsbStick{kStorage, "USB Storage", "usb-msc-77f1", 0x100000c07};
constexpr Device kHeadset{kAudio, "Headset", "bt-audio-5e10", 0x100000c31};

void change(const Device& d, std::uint64_t abs, bool connected, RecordSink& sink) {
  DeviceChange c;
  c.setAbsoluteTime(abs);
  c.setDeviceType(d.type);
  c.setDeviceName(d.name);
  c.setDeviceId(d.id);
  c.setNowConnected(connected ? 1 : 0);
  c.setRegistryEntryId(d.registry);
  sink.add(Stream::Power, c);
}

std::uint64_t runFirstAbs(const Boot& boot, const Run& run) {
  return run.start == RunStart::Boot ? boot.firstRecordAbs : run.absStart;
}

}  // namespace

DeviceEvents::DeviceEvents(const MachinePlan& plan) : plan_(plan), rng_(plan.seed(), 4) {
  constexpr std::uint64_t kGiB = 1ULL << 30;
  constexpr std::uint64_t kMemory[] = {8 * kGiB, 16 * kGiB, 32 * kGiB};
  memoryBytes_ = kMemory[rng_.below(3)];
  pageSize_ = rng_.chance(0.5) ? 16'384 : 4'096;
  preferredBrightness_ = static_cast<int>(rng_.between(45, 85));
}

void DeviceEvents::boot(std::size_t index, RecordSink& sink) {
  const Boot& boot = plan_.boots()[index];
  deviceChanges(boot, sink);
  brightness(boot, sink);
  counters(boot, sink);
}

void DeviceEvents::deviceChanges(const Boot& boot, RecordSink& sink) {
  change(kWiFiRadio, boot.firstRecordAbs + 2'000, true, sink);
  change(kBluetoothRadio, boot.firstRecordAbs + 2'500, true, sink);
  bool bluetoothOn = true;
  for (const Run& run : boot.runs) {
    const std::uint64_t first = runFirstAbs(boot, run);
    const std::uint64_t last = run.absEnd() - 5'000;  // a margin before the sleep
    bool wifiOn = true;
    if (run.start != RunStart::Boot) change(kWiFiRadio, run.absStart + 1'500, true, sink);
    if (!run.dark) {
      if (!bluetoothOn) {
        change(kBluetoothRadio, run.absStart + 1'700, true, sink);
        bluetoothOn = true;
      }
      const auto within = [&](double from, double to) {
        return first + static_cast<std::uint64_t>(rng_.uniform(from, to) * static_cast<double>(last - first));
      };
      // Now and then the user switches a radio off for a while.
      if (run.duration > 30 * kMinute && rng_.chance(0.05)) {
        const std::uint64_t off = within(0.2, 0.7);
        const std::uint64_t on = off + static_cast<std::uint64_t>(rng_.between(5 * kMinute, 40 * kMinute));
        change(kWiFiRadio, off, false, sink);
        if (on < last) {
          change(kWiFiRadio, on, true, sink);
        } else {
          wifiOn = false;
        }
      }
      if (run.duration > 30 * kMinute && rng_.chance(0.04)) {
        const std::uint64_t off = within(0.1, 0.8);
        const std::uint64_t on = off + static_cast<std::uint64_t>(rng_.between(5 * kMinute, 60 * kMinute));
        change(kBluetoothRadio, off, false, sink);
        if (on < last) {
          change(kBluetoothRadio, on, true, sink);
        } else {
          bluetoothOn = false;
        }
      }
      // The discrete GPU powers up for heavy work.
      bool gpuOn = false;
      for (std::uint64_t t = first + 60'000; t < last; t += 60'000) {
        const bool heavy = plan_.heavyAt(run.wallAt(t));
        if (heavy != gpuOn) {
          change(kGpu, t + 700, heavy, sink);
          gpuOn = heavy;
        }
      }
      if (gpuOn) change(kGpu, last + 700, false, sink);
      peripherals(run, first, sink);
    }
    if (run.end == RunEnd::Sleep && wifiOn) change(kWiFiRadio, run.absEnd() - 600, false, sink);
  }
}

void DeviceEvents::peripherals(const Run& run, std::uint64_t first, RecordSink& sink) {
  const std::uint64_t last = run.absEnd() - 5'000;
  const Zone zone = plan_.zoneAt(run.wallStart);
  const std::int64_t local = static_cast<std::int64_t>(run.wallStart) + zone.gmtoff * 1000;
  const std::int64_t hour = (local % kDay + kDay) % kDay / kHour;
  const bool atDesk = plan_.onACAt(run.wallStart + 90'000) && hour >= 7 && hour < 19 && run.duration > 20 * kMinute;
  const bool stays = run.end == RunEnd::Running;
  if (atDesk) {
    change(kExternalDisplay, first + 20'000, true, sink);
    change(kDeskKeyboard, first + 25'000, true, sink);
    if (!stays) {
      change(kDeskKeyboard, last + 500, false, sink);
      change(kExternalDisplay, last + 1'000, false, sink);
    }
  }
  const auto visit = [&](const Device& d, double p, std::int64_t minMinutes, std::int64_t maxMinutes) {
    if (run.duration < 20 * kMinute || !rng_.chance(p)) return;
    const std::uint64_t on = first + 60'000 + rng_.below(run.duration / 2);
    const std::uint64_t off = on + static_cast<std::uint64_t>(rng_.between(minMinutes * kMinute, maxMinutes * kMinute));
    change(d, on, true, sink);
    if (off < last) {
      change(d, off, false, sink);
    } else if (!stays) {
      change(d, last + 1'500, false, sink);
    }
  };
  visit(kUsbStick, 0.12, 5, 30);
  visit(kHeadset, 0.2, 15, 90);
}

void DeviceEvents::brightness(const Boot& boot, RecordSink& sink) {
  const auto set = [&sink](std::uint64_t abs, int level) {
    DisplayBrightness b;
    b.setAbsoluteTime(abs);
    b.setBrightness(static_cast<std::uint64_t>(std::clamp(level, 0, 100)));
    sink.add(Stream::Power, b);
  };
  const auto& idle = plan_.idle();
  for (const Run& run : boot.runs) {
    if (run.dark) continue;
    int level = preferredBrightness_ + static_cast<int>(rng_.between(-10, 10));
    if (!plan_.onACAt(run.wallStart)) level -= 10;
    set(runFirstAbs(boot, run) + 2'200, level);
    // Dim while the user is away, restore on return.
    auto it = std::lower_bound(idle.begin(), idle.end(), run.wallStart,
                               [](const Interval& i, std::uint64_t w) { return i.end <= w; });
    for (; it != idle.end() && it->start < run.wallEnd(); ++it) {
      if (it->start > run.wallStart + 2'200) set(run.absAt(it->start) + 1, level * 3 / 10);
      if (it->end < run.wallEnd()) set(run.absAt(it->end) + 1, level);
    }
    if (run.duration > 30 * kMinute && rng_.chance(0.3)) {
      const std::uint64_t at = run.absStart + 5 * kMinute + rng_.below(run.duration - 10 * kMinute);
      if (!plan_.userIdleAt(run.wallAt(at))) set(at, level + static_cast<int>(rng_.between(-15, 15)));
    }
    if (run.end == RunEnd::Sleep) set(run.absEnd() - 200, 0);
  }
}

void DeviceEvents::counters(const Boot& boot, RecordSink& sink) {
  const std::uint64_t pages = memoryBytes_ / pageSize_;
  struct {
    std::uint64_t readOps = 0, writeOps = 0, read = 0, written = 0, packetsIn = 0, packetsOut = 0, bytesIn = 0,
                  bytesOut = 0;
    std::uint64_t faults = 0, zeroFills = 0, reactivations = 0, pageins = 0, pageouts = 0, purges = 0;
    std::uint64_t compressions = 0, decompressions = 0, swapins = 0, swapouts = 0;
    std::uint64_t psrOff = 0, psrTransit = 0, psrOn = 0, psrSleep = 0, dpbOff = 0, dpbOn = 0;
    std::uint64_t btOn = 0, btSleep = 0, btIdle = 0;
  } c;
  std::uint64_t previous = boot.firstRecordAbs;
  std::uint64_t tick = 0;
  forEachTick(boot, 30'000, 60'000, [&](const Run& run, std::uint64_t abs) {
    const double sec = static_cast<double>(abs - previous) / 1000;
    const std::uint64_t dt = abs - previous;
    previous = abs;
    const std::uint64_t wall = run.wallAt(abs);
    const double load = plan_.loadAt(wall, run.dark);
    const auto per = [sec](double rate) { return static_cast<std::uint64_t>(rate * sec); };

    const std::uint64_t reads = per(3 + 160 * load), writes = per(2 + 90 * load);
    c.readOps += reads;
    c.writeOps += writes;
    c.read += reads * (16'384 + rng_.below(49'152));
    c.written += writes * (8'192 + rng_.below(24'576));
    const std::uint64_t in = per(20 + 420 * load), out = per(12 + 250 * load);
    c.packetsIn += in;
    c.packetsOut += out;
    c.bytesIn += in * (600 + rng_.below(800));
    c.bytesOut += out * (200 + rng_.below(400));
    SystemIO io;
    io.setAbsoluteTime(abs);
    io.setDiskReadOps(c.readOps);
    io.setDiskWriteOps(c.writeOps);
    io.setDiskBytesRead(c.read);
    io.setDiskBytesWritten(c.written);
    io.setNetworkPacketsIn(c.packetsIn);
    io.setNetworkPacketsOut(c.packetsOut);
    io.setNetworkBytesIn(c.bytesIn);
    io.setNetworkBytesOut(c.bytesOut);
    sink.add(Stream::Periodic, io);

    if (run.dark) {
      c.psrSleep += dt;
      c.btSleep += dt;
    } else {
      const bool idle = plan_.userIdleAt(wall);
      const std::uint64_t on = dt * (idle ? 85 : 45) / 100;
      c.psrOn += on;
      c.psrTransit += (dt - on) / 10;
      c.psrOff += (dt - on) - (dt - on) / 10;
      c.dpbOn += dt * 3 / 10;
      c.dpbOff += dt - dt * 3 / 10;
      const std::uint64_t radio = dt * (idle ? 5 : 20) / 100;
      c.btOn += radio;
      c.btIdle += (dt - radio) * 7 / 10;
      c.btSleep += (dt - radio) - (dt - radio) * 7 / 10;
    }
    PanelSelfRefresh psr;
    psr.setAbsoluteTime(abs + 50);
    psr.setPsrOff(c.psrOff);
    psr.setPsrTransit(c.psrTransit);
    psr.setPsrOn(c.psrOn);
    psr.setPsrSleep(c.psrSleep);
    psr.setDpbOff(c.dpbOff);
    psr.setDpbOn(c.dpbOn);
    sink.add(Stream::Periodic, psr);

    c.faults += per(800 + 9'000 * load);
    c.zeroFills += per(300 + 3'500 * load);
    c.reactivations += per(5 + 60 * load);
    c.pageins += per(5 + 80 * load);
    c.pageouts += per(0.5 + 4 * load);
    c.purges += per(0.2 + 2 * load);
    c.compressions += per(50 + 600 * load);
    c.decompressions += per(40 + 480 * load);
    c.swapins += per(0.1 * load);
    c.swapouts += per(0.15 * load);
    if (tick++ % 2 == 0) {
      const auto share = [pages](double f) { return static_cast<std::uint64_t>(static_cast<double>(pages) * f); };
      SystemMemory m;
      m.setAbsoluteTime(abs + 100);
      m.setFreeCount(share(0.08 + 0.2 * (1 - load)));
      m.setWiredCount(share(0.16 + 0.04 * load));
      const std::uint64_t compressor = share(0.05 + 0.1 * load);
      m.setCompressorPageCount(compressor);
      m.setPurgeableCount(share(0.02));
      m.setPurges(c.purges);
      m.setFaults(c.faults);
      m.setZeroFills(c.zeroFills);
      m.setReactivations(c.reactivations);
      m.setPageins(c.pageins);
      m.setPageouts(c.pageouts);
      m.setDecompressions(c.decompressions);
      m.setCompressions(c.compressions);
      m.setSwapins(c.swapins);
      m.setSwapouts(c.swapouts);
      m.setCompressedPageCount(compressor * 5 / 2);
      m.setInternalPageCount(share(0.42 + 0.1 * load));
      m.setExternalPageCount(share(0.2));
      const std::uint64_t graphics = (300 + static_cast<std::uint64_t>(600 * load)) << 20;
      m.setIoaccelAllocatedSize(graphics);
      m.setIoaccelResidentSize(graphics * 8 / 10);
      m.setIoaccelWiredSize(graphics / 4);
      m.setIoaccelDirtySize(graphics / 10);
      m.setIoaccelCachedSize(graphics / 5);
      m.setIoaccelPurgeableSize(graphics / 20);
      m.setMemorySize(memoryBytes_);
      m.setPageSize(pageSize_);
      m.setSwapDeviceIsSsd(true);
      sink.add(Stream::Periodic, m);
    }
    if (tick % 5 == 1) {
      BluetoothPowerResidency bt;
      bt.setAbsoluteTime(abs + 200);
      bt.setTimeOff(0);
      bt.setTimeOn(c.btOn);
      bt.setTimeSleep(c.btSleep);
      bt.setTimeIdle(c.btIdle);
      sink.add(Stream::Periodic, bt);
    }
  });
}

}  // namespace bw::samplestore
