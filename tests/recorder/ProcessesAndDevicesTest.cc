// Processes appearing, forking and exiting, and devices coming and going,
// over fixture trees; records read back from the store.
#include <unistd.h>

#include "RecorderFixture.h"
#include "Records/DeviceChange.h"
#include "Records/DisplayBrightness.h"
#include "Records/FanState.h"
#include "Records/ProcessUsage.h"

namespace bw::test {
namespace {

// A process as /proc shows it: stat (start in clock ticks), status, cgroup, exe.
void process(const MachineTree& tree, std::uint64_t pid, const std::string& comm, std::uint64_t ppid,
             std::uint64_t start, const std::string& cgroup, const std::string& exe, std::uint64_t utime = 0) {
  const std::string dir = "/proc/" + std::to_string(pid) + "/";
  tree.put(dir + "stat", std::to_string(pid) + " (" + comm + ") S " + std::to_string(ppid) + " 0 0 0 -1 0 0 0 7 0 " +
                             std::to_string(utime) + " 3 0 0 20 0 1 0 " + std::to_string(start) + " 0 0\n");
  tree.put(dir + "status", "Name:\t" + comm +
                               "\nUid:\t1000\t1000\t1000\t1000\nVmRSS:\t    2048 kB\n"
                               "RssAnon:\t    1024 kB\nVmSwap:\t      16 kB\n");
  tree.put(dir + "cgroup", "0::" + cgroup + "\n");
  if (!exe.empty()) tree.symlink(dir + "exe", exe);
}

std::uint64_t idOf(std::uint64_t pid, std::uint64_t start) { return pid == 1 ? 1 : start << 22 | pid; }

const ProcessUsage* find(const std::vector<const ProcessUsage*>& records, std::uint64_t pid, std::int64_t status) {
  for (const auto* r : records) {
    if (r->pid() == pid && r->exitStatus() == status) return r;
  }
  return nullptr;
}

TEST(RecorderProcesses, AppearForkAndExitWithServiceManagersNamedForTheJobRules) {
  Rig rig;
  const std::string user = "/user.slice/user-1000.slice/user@1000.service";
  process(rig.tree, 1, "systemd", 0, 1, "/init.scope", "/usr/lib/systemd/systemd");
  process(rig.tree, 2, "kthreadd", 0, 1, "/", "");
  process(rig.tree, 800, "systemd", 1, 40, user + "/init.scope", "/usr/lib/systemd/systemd");
  process(rig.tree, 900, "sshd", 1, 50, "/system.slice/ssh.service", "/usr/sbin/sshd", 25);
  process(rig.tree, 901, "sshd", 900, 60, "/system.slice/ssh.service", "/usr/sbin/sshd (deleted)");
  process(rig.tree, 950, "pipewire", 800, 55, user + "/session.slice/pipewire.service", "/usr/bin/pipewire");
  rig.recorder.begin();

  rig.clock.advance(10000);
  process(rig.tree, 902, "sshd", 900, 70, "/system.slice/ssh.service", "/usr/sbin/sshd");  // a fork
  rig.recorder.sampleProcesses();
  rig.clock.advance(10000);
  rig.tree.remove("/proc/901");
  rig.recorder.tick();  // the pid listing notices the exit between samples

  const auto store = rig.contents();
  const auto records = store.all<ProcessUsage>();
  const ProcessUsage *init = find(records, 1, -1), *manager = find(records, 800, -1), *kthread = find(records, 2, -1);
  const ProcessUsage *service = find(records, 900, -1), *user950 = find(records, 950, -1);
  const ProcessUsage *fork = find(records, 902, -1), *exit = find(records, 901, 0);
  for (const ProcessUsage* r : {init, manager, kthread, service, user950, fork, exit}) ASSERT_NE(r, nullptr);
  EXPECT_EQ(std::tuple(init->name(), init->uniqueid(), init->parentUniqueid()), std::tuple("launchd", 1u, 0u));
  EXPECT_EQ(std::tuple(manager->name(), manager->displayName(), manager->parentUniqueid()),
            std::tuple("com.vexil.launchd.peruser", "user@1000.service", 1u));
  EXPECT_EQ(manager->responsibleUniqueid(), manager->uniqueid());
  // No executable: the command name.
  EXPECT_EQ(std::tuple(kthread->name(), kthread->responsibleUniqueid(), kthread->hasDisplayName()),
            std::tuple("kthreadd", 0u, false));

  const std::uint64_t tick = static_cast<std::uint64_t>(sysconf(_SC_CLK_TCK));
  EXPECT_EQ(std::tuple(service->name(), service->displayName(), service->uniqueid(), service->responsibleUniqueid()),
            std::tuple("sshd", "ssh.service", idOf(900, 50), idOf(900, 50)));
  EXPECT_EQ(std::tuple(service->userTime(), service->residentSize(), service->physFootprint(), service->pageins(),
                       service->uid(), service->procStartAbstime()),
            std::tuple(25 * 1000000000ull / tick, 2048u * 1024, 1040u * 1024, 7u, 1000u, 50 * 1000 / tick));
  EXPECT_EQ(std::pair(user950->parentUniqueid(), user950->responsibleUniqueid()),
            std::pair(manager->uniqueid(), user950->uniqueid()));
  // A fork counts under the oldest process of its unit.
  EXPECT_EQ(std::tuple(fork->parentUniqueid(), fork->responsibleUniqueid(), fork->nowAbstime()),
            std::tuple(idOf(900, 50), idOf(900, 50), 5'010'000u));
  EXPECT_EQ(std::tuple(exit->name(), exit->uniqueid(), exit->procExitAbstime(), exit->absoluteTime()),
            std::tuple("sshd", idOf(901, 60), 5'020'000u, 5'020'000u));
  EXPECT_EQ(find(records, 900, 0), nullptr);  // still running
}

TEST(RecorderDevices, RadiosUsbDisplaysGpuBrightnessAndFans) {
  Rig rig;
  const auto radio = [&](const std::string& n, const char* type, const char* name, const char* state) {
    rig.tree.put("/sys/class/rfkill/" + n + "/type", type);
    rig.tree.put("/sys/class/rfkill/" + n + "/name", name);
    rig.tree.put("/sys/class/rfkill/" + n + "/state", state);
  };
  radio("rfkill0", "wlan\n", "phy0\n", "1\n");
  radio("rfkill1", "bluetooth\n", "hci0\n", "0\n");
  const std::string usb = "/sys/bus/usb/devices/";
  rig.tree.put(usb + "usb1/idVendor", "1d6b\n");  // a root hub
  rig.tree.put(usb + "1-2/idVendor", "0781\n");
  rig.tree.put(usb + "1-2/idProduct", "5583\n");
  rig.tree.put(usb + "1-2/product", "Ultra Fit\n");
  rig.tree.put(usb + "1-2/1-2:1.0/bInterfaceClass", "08\n");
  rig.tree.put(usb + "1-3/idVendor", "046d\n");
  rig.tree.put(usb + "1-3/1-3:1.0/bInterfaceClass", "ff\n");
  rig.tree.put(usb + "1-3/1-3:1.1/bInterfaceClass", "0e\n");
  rig.tree.put("/sys/class/drm/card0-eDP-1/status", "connected\n");  // the built-in panel
  rig.tree.put("/sys/class/drm/card0-HDMI-A-1/status", "connected\n");
  rig.tree.put("/sys/bus/pci/devices/0000:00:02.0/class", "0x030000\n");
  rig.tree.put("/sys/bus/pci/devices/0000:00:02.0/boot_vga", "1\n");
  rig.tree.put("/sys/bus/pci/devices/0000:00:02.0/power/runtime_status", "active\n");
  rig.tree.put("/sys/bus/pci/devices/0000:01:00.0/class", "0x030200\n");
  rig.tree.put("/sys/bus/pci/devices/0000:01:00.0/boot_vga", "0\n");
  rig.tree.put("/sys/bus/pci/devices/0000:01:00.0/vendor", "0x10de\n");
  rig.tree.put("/sys/bus/pci/devices/0000:01:00.0/device", "0x1f95\n");
  rig.tree.put("/sys/bus/pci/devices/0000:01:00.0/power/runtime_status", "suspended\n");
  rig.tree.put("/sys/class/backlight/intel_backlight/brightness", "50\n");
  rig.tree.put("/sys/class/backlight/intel_backlight/max_brightness", "200\n");
  rig.tree.put("/sys/class/hwmon/hwmon3/fan1_input", "2500\n");
  rig.tree.put("/sys/class/hwmon/hwmon3/fan2_input", "3200\n");
  rig.recorder.tick();
  rig.clock.advance(1000);
  rig.recorder.tick();  // nothing changed: nothing new
  rig.clock.advance(1000);
  radio("rfkill0", "wlan\n", "phy0\n", "0\n");
  radio("rfkill1", "bluetooth\n", "hci0\n", "1\n");
  rig.tree.remove(usb + "1-2");
  rig.tree.put("/sys/class/drm/card0-HDMI-A-1/status", "disconnected\n");
  rig.tree.put("/sys/bus/pci/devices/0000:01:00.0/power/runtime_status", "active\n");
  rig.tree.put("/sys/class/backlight/intel_backlight/brightness", "200\n");
  rig.tree.put("/sys/class/hwmon/hwmon3/fan2_input", "7100\n");
  rig.recorder.tick();

  const auto store = rig.contents();
  struct Expected {
    std::uint64_t time;
    std::uint32_t type;
    std::string name;
    std::uint32_t connected;
  };
  const std::vector<Expected> expected = {
      // At the first tick every device is announced; a vendor-specific
      // interface doesn't hide the camera interface beside it.
      {5'000'000, 1, "Ultra Fit", 1},
      {5'000'000, 8, "USB device", 1},
      {5'000'000, 5, "phy0", 1},
      {5'000'000, 6, "hci0", 0},
      {5'000'000, 4, "HDMI-A-1", 1},
      {5'000'000, 9, "GPU 0x10de:0x1f95", 0},
      // Then only changes; a device that went away is announced last.
      {5'002'000, 5, "phy0", 0},
      {5'002'000, 6, "hci0", 1},
      {5'002'000, 4, "HDMI-A-1", 0},
      {5'002'000, 9, "GPU 0x10de:0x1f95", 1},
      {5'002'000, 1, "Ultra Fit", 0},
  };
  const auto changes = store.all<DeviceChange>();
  ASSERT_EQ(changes.size(), expected.size());
  for (std::size_t i = 0; i < expected.size(); ++i) {
    SCOPED_TRACE(i);
    EXPECT_EQ(changes[i]->absoluteTime(), expected[i].time);
    EXPECT_EQ(changes[i]->deviceType(), expected[i].type);
    EXPECT_EQ(changes[i]->deviceName(), expected[i].name);
    EXPECT_EQ(changes[i]->nowConnected(), expected[i].connected);
  }
  const auto brightness = store.all<DisplayBrightness>();
  ASSERT_EQ(brightness.size(), 2u);
  EXPECT_EQ(brightness[0]->brightness(), 25u);
  EXPECT_EQ(brightness[1]->brightness(), 100u);
  const auto fans = store.all<FanState>();
  ASSERT_EQ(fans.size(), 2u);
  EXPECT_EQ(fans[0]->highestRpm(), 3200u);
  EXPECT_EQ(fans[0]->loudness(), 3);
  EXPECT_EQ(fans[1]->loudness(), 6);  // at most 6
}

}  // namespace
}  // namespace bw::test
