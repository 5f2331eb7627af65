// Every source against fixture trees of /sys and /proc, through the
// Recorder, with the records read back from the store by the project's reader.
#include <unistd.h>

#include "RecorderFixture.h"
#include "Records/BatteryChargeLevel.h"
#include "Records/Cstates.h"
#include "Records/DeviceChange.h"
#include "Records/DisplayBrightness.h"
#include "Records/FanState.h"
#include "Records/Interrupts.h"
#include "Records/PackageEnergyStatistics.h"
#include "Records/PowerStateChange.h"
#include "Records/ProcessUsage.h"
#include "Records/SystemIO.h"
#include "Records/SystemMemory.h"
#include "recorder/CpuSource.h"
#include "support/Records.h"

namespace bw::test {
namespace {

TEST(RecorderSources, BatteryDischargingThenOnExternalPower) {
  Rig rig;
  const std::string bat = "/sys/class/power_supply/BAT0/";
  rig.tree.put(bat + "type", "Battery\n");
  rig.tree.put(bat + "status", "Discharging\n");
  rig.tree.put(bat + "charge_now", "3000000\n");
  rig.tree.put(bat + "charge_full", "5000000\n");
  rig.tree.put(bat + "voltage_now", "11400000\n");
  rig.tree.put(bat + "current_now", "1500000\n");
  rig.tree.put(bat + "cycle_count", "42\n");
  rig.tree.put("/sys/class/power_supply/AC/type", "Mains\n");
  rig.tree.put("/sys/class/power_supply/AC/online", "0\n");
  // A wireless mouse's battery is not the machine's.
  rig.tree.put("/sys/class/power_supply/hidpp_battery_0/type", "Battery\n");
  rig.tree.put("/sys/class/power_supply/hidpp_battery_0/scope", "Device\n");
  rig.tree.put("/sys/class/power_supply/hidpp_battery_0/charge_now", "100000\n");
  rig.tree.put("/sys/class/power_supply/hidpp_battery_0/charge_full", "100000\n");
  rig.recorder.tick();
  rig.clock.advance(60000);
  rig.recorder.tick();  // no power change: only the gauge
  rig.clock.advance(60000);
  rig.tree.put("/sys/class/power_supply/AC/online", "1\n");
  rig.tree.put(bat + "status", "Full\n");
  rig.tree.put(bat + "charge_now", "5000000\n");
  rig.tree.put(bat + "current_now", "200000\n");
  rig.recorder.tick();

  const auto store = rig.contents();
  std::vector<std::string> records;
  for (const Record* r : store.records) {
    if (recordCast<PowerStateChange>(r) || recordCast<BatteryChargeLevel>(r)) records.push_back(fieldsOf(*r));
  }
  // Battery, then external power; the gauge at every tick.
  EXPECT_EQ(records, (std::vector<std::string>{
                         "{ absoluteTime = 5000000; change = 1; isFullyCharged = 0; wallTime = 1790000000000; }",
                         "{ absoluteTime = 5000000; charge = 3000; cycleCount = 42; instantAmperage = -1500; "
                         "instantVoltage = 11400; isFullyCharged = 0; maxCharge = 5000; }",
                         "{ absoluteTime = 5060000; charge = 3000; cycleCount = 42; instantAmperage = -1500; "
                         "instantVoltage = 11400; isFullyCharged = 0; maxCharge = 5000; }",
                         "{ absoluteTime = 5120000; change = 0; isFullyCharged = 1; wallTime = 1790000120000; }",
                         "{ absoluteTime = 5120000; charge = 5000; cycleCount = 42; instantAmperage = 200; "
                         "instantVoltage = 11400; isFullyCharged = 1; maxCharge = 5000; }",
                     }));
}

TEST(RecorderSources, EnergyOnlyBatteryInMilliampHours) {
  recorder::MachineFiles none("/nonexistent-root");
  EXPECT_FALSE(recorder::PowerSupplySource(none).read().battery);
  MachineTree tree;
  const std::string bat = "/sys/class/power_supply/BAT1/";
  tree.put(bat + "type", "Battery\n");
  tree.put(bat + "status", "Discharging\n");
  tree.put(bat + "energy_now", "45600000\n");  // µWh
  tree.put(bat + "energy_full", "57000000\n");
  tree.put(bat + "voltage_now", "11400000\n");  // µV
  tree.put(bat + "power_now", "11400000\n");    // µW
  recorder::MachineFiles machine(tree.dir.path());
  const auto state = recorder::PowerSupplySource(machine).read();
  ASSERT_TRUE(state.battery);
  EXPECT_EQ(std::tuple(state.battery->charge(), state.battery->maxCharge(), state.battery->instantAmperage()),
            std::tuple(4000, 5000, -1000));
  ASSERT_TRUE(state.external);  // no adapter: a discharging battery means battery power
  EXPECT_FALSE(*state.external);
}

// Two CPUs with cpuidle and cpufreq, a RAPL package zone and /proc/stat.
void writeCpus(const MachineTree& tree, std::uint64_t c0s1, std::uint64_t c0s2, std::uint64_t c1s1, std::uint64_t c1s2,
               std::uint64_t energy) {
  const std::uint64_t times[2][2] = {{c0s1, c0s2}, {c1s1, c1s2}};
  for (int cpu = 0; cpu < 2; ++cpu) {
    const std::string dir = "/sys/devices/system/cpu/cpu" + std::to_string(cpu) + "/";
    tree.put(dir + "cpuidle/state0/time", "100\n");
    tree.put(dir + "cpuidle/state1/time", std::to_string(times[cpu][0]) + "\n");
    tree.put(dir + "cpuidle/state2/time", std::to_string(times[cpu][1]) + "\n");
    tree.put(dir + "cpufreq/scaling_cur_freq", cpu == 0 ? "2000000\n" : "3000000\n");
    tree.put(dir + "cpufreq/base_frequency", "2400000\n");
  }
  tree.put("/sys/class/powercap/intel-rapl:0/name", "package-0\n");
  tree.put("/sys/class/powercap/intel-rapl:0/energy_uj", std::to_string(energy) + "\n");
  tree.put("/sys/class/powercap/intel-rapl:0/max_energy_range_uj", "1000000\n");
  tree.put("/sys/class/powercap/intel-rapl:0:0/name", "core\n");  // a subzone: not the package
  tree.put("/sys/class/powercap/intel-rapl:0:0/energy_uj", "777\n");
  tree.put("/proc/stat", "cpu  100 50 30 1000 0 0 0 0 0 0\ncpu0 50 25 15 500 0 0 0 0 0 0\n");
}

TEST(RecorderSources, CpuidleAndRaplCountersMakePackageRecords) {
  MachineTree tree;
  writeCpus(tree, 1'000'000, 2'000'000, 1'000'000, 2'000'000, 900'000);
  recorder::MachineFiles machine(tree.dir.path());
  recorder::CpuSource cpu(machine);
  ASSERT_EQ(sysconf(_SC_CLK_TCK), 100);  // /proc/stat counts in hundredths of a second
  const auto first = cpu.read(1000);
  ASSERT_TRUE(first.package);
  // Residency counting starts here; the mean frequency; QoS from /proc/stat
  // (nice and idle time per CPU).
  EXPECT_EQ(fieldsOf(*first.package),
            "{ absolute_time = 1000; energy_model_millijoules = 900; pkg_cany_residency = 0; pkg_cmax_residency = 0; "
            "pkg_freq = 2500; pkg_freq_nominal = 2400; qos_bg_time = 250; qos_idle_time = 5000; }");
  ASSERT_EQ(first.cstates.size(), 3u);  // package, cpu0, cpu1; µs to ms
  EXPECT_EQ(fieldsOf(first.cstates[0]),
            "{ absolute_time = 1000; core = -1; is_core = 0; states = ( { level = 1; residency = 0; }, { level = 2; "
            "residency = 0; } ); }");
  EXPECT_EQ(fieldsOf(first.cstates[2]),
            "{ absolute_time = 1000; core = 1; is_core = 1; states = ( { level = 0; residency = 0; }, { level = 1; "
            "residency = 1000; }, { level = 2; residency = 2000; } ); }");

  // cpu0 idles 300 ms in C1 and 500 in C2, cpu1 200 and 700: the package
  // counts only what both did; the energy counter wrapped at 1 J.
  writeCpus(tree, 1'300'000, 2'500'000, 1'200'000, 2'700'000, 400'000);
  const auto second = cpu.read(2000);
  ASSERT_TRUE(second.package);
  EXPECT_EQ(fieldsOf(*second.package),
            "{ absolute_time = 2000; energy_model_millijoules = 1400; pkg_cany_residency = 800; pkg_cmax_residency = "
            "500; pkg_freq = 2500; pkg_freq_nominal = 2400; qos_bg_time = 250; qos_idle_time = 5000; }");
  EXPECT_EQ(fieldsOf(second.cstates[0]),
            "{ absolute_time = 2000; core = -1; is_core = 0; states = ( { level = 1; residency = 200; }, { level = 2; "
            "residency = 500; } ); }");
}

TEST(RecorderSources, CountersOfWholeDisksNetworksInterruptsAndMemory) {
  Rig rig;
  rig.tree.put("/proc/diskstats",
               "   8       0 sda 100 0 2000 50 200 0 4000 60 0 0 0\n"
               "   8       1 sda1 90 0 1800 40 190 0 3800 50 0 0 0\n"
               "   7       0 loop0 5 0 10 1 0 0 0 0 0 0 0\n"
               " 259       0 nvme0n1 10 0 100 5 20 0 300 6 0 0 0\n"
               " 259       1 nvme0n1p1 10 0 100 5 20 0 300 6 0 0 0\n");
  rig.tree.put("/sys/block/sda/device/model", "disk\n");
  rig.tree.put("/sys/block/nvme0n1/device/model", "ssd\n");
  rig.tree.put("/sys/block/loop0/size", "0\n");
  rig.tree.put("/proc/net/dev",
               "Inter-|   Receive |  Transmit\n face |bytes packets errs drop fifo frame compressed multicast|...\n"
               "    lo: 5000 50 0 0 0 0 0 0 5000 50 0 0 0 0 0 0\n"
               "  eth0: 1000 10 0 0 0 0 0 0 2000 20 0 0 0 0 0 0\n"
               " wlan0: 300 3 0 0 0 0 0 0 400 4 0 0 0 0 0 0\n");
  rig.tree.put("/proc/interrupts",
               "           CPU0       CPU1\n  0:         12          0   IO-APIC   2-edge      timer\n"
               "LOC:        500        700   Local timer interrupts\nERR:          0\n");
  rig.tree.put("/proc/meminfo",
               "MemTotal:       8000000 kB\nMemFree:        400000 kB\nActive(anon):   100000 kB\n"
               "Inactive(anon):  20000 kB\nActive(file):   300000 kB\nInactive(file): 100000 kB\n"
               "Unevictable:       4000 kB\nKernelStack:       8000 kB\nPageTables:       12000 kB\n"
               "SUnreclaim:       16000 kB\n");
  rig.tree.put("/proc/vmstat", "pgpgin 8000\npgpgout 4000\npswpin 3\npswpout 5\npgfault 123456\n");
  rig.tree.put("/proc/swaps", "Filename Type Size Used Priority\n/dev/nvme0n1p2 partition 100 0 -2\n");
  rig.tree.put("/sys/block/nvme0n1/queue/rotational", "0\n");
  rig.recorder.tick();

  const auto store = rig.contents();
  // Whole disks only (sectors of 512 bytes); no loopback.
  const auto io = store.all<SystemIO>();
  ASSERT_EQ(io.size(), 1u);
  EXPECT_EQ(fieldsOf(*io[0]),
            "{ absoluteTime = 5000000; diskBytesRead = 1075200; diskBytesWritten = 2201600; diskReadOps = 110; "
            "diskWriteOps = 220; networkBytesIn = 1300; networkBytesOut = 2400; networkPacketsIn = 13; "
            "networkPacketsOut = 24; }");
  const auto interrupts = store.all<Interrupts>();  // zero counts left out
  ASSERT_EQ(interrupts.size(), 1u);
  EXPECT_EQ(fieldsOf(*interrupts[0]),
            "{ absoluteTime = 5000000; vectors = ( { cpuNumber = 0; interruptCount = 12; vectorName = 0; }, { "
            "cpuNumber = 0; interruptCount = 500; vectorName = LOC; }, { cpuNumber = 1; interruptCount = 700; "
            "vectorName = LOC; } ); }");

  const auto memory = store.all<SystemMemory>();
  ASSERT_EQ(memory.size(), 1u);
  const std::uint64_t page = static_cast<std::uint64_t>(sysconf(_SC_PAGESIZE));
  const SystemMemory& m = *memory[0];
  EXPECT_EQ(std::tuple(m.memorySize(), m.pageSize(), m.freeCount(), m.wiredCount(), m.internalPageCount()),
            std::tuple(8000000ull * 1024, page, 400000u * 1024 / page, 40000u * 1024 / page, 120000u * 1024 / page));
  EXPECT_EQ(std::tuple(m.pageins(), m.swapouts(), m.faults(), m.hasSwapDeviceIsSsd(), m.swapDeviceIsSsd()),
            std::tuple(8000u / (page / 1024), 5u, 123456u, true, true));
}

}  // namespace
}  // namespace bw::test
