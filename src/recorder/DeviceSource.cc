#include "recorder/DeviceSource.h"

#include <algorithm>

namespace bw::recorder {

namespace {

std::uint32_t typeOfUsbClass(const std::string& hex) {
  if (hex == "08") return DeviceSource::kStorage;
  if (hex == "03") return DeviceSource::kInput;
  if (hex == "01") return DeviceSource::kAudio;
  if (hex == "0e") return DeviceSource::kCamera;
  return DeviceSource::kOther;
}

}  // namespace

std::vector<DeviceState> DeviceSource::read() const {
  std::vector<DeviceState> out;
  usb(out);
  radios(out);
  displays(out);
  gpus(out);
  return out;
}

void DeviceSource::usb(std::vector<DeviceState>& out) const {
  const std::string root = "/sys/bus/usb/devices/";
  for (const auto& name : machine_.list(root)) {
    if (name.find(':') != std::string::npos || name.rfind("usb", 0) == 0) continue;  // interfaces, root hubs
    const std::string dir = root + name + "/";
    const auto vendor = machine_.line(dir + "idVendor");
    if (!vendor) continue;
    // The first interface class that names a kind wins over "other".
    std::uint32_t type = DeviceSource::kOther;
    for (const auto& entry : machine_.list(dir)) {
      if (entry.rfind(name + ":", 0) != 0) continue;
      const std::uint32_t t = typeOfUsbClass(machine_.line(dir + entry + "/bInterfaceClass").value_or(""));
      if (t != DeviceSource::kOther) {
        type = t;
        break;
      }
    }
    DeviceState d;
    d.type = type;
    d.id = "usb:" + name + ":" + *vendor + ":" + machine_.line(dir + "idProduct").value_or("");
    d.name = machine_.line(dir + "product").value_or("USB device");
    d.on = true;
    out.push_back(d);
  }
}

void DeviceSource::radios(std::vector<DeviceState>& out) const {
  const std::string root = "/sys/class/rfkill/";
  for (const auto& entry : machine_.list(root)) {
    const std::string dir = root + entry + "/";
    const std::string type = machine_.line(dir + "type").value_or("");
    if (type != "wlan" && type != "bluetooth") continue;
    DeviceState d;
    d.type = type == "wlan" ? DeviceSource::kWiFi : DeviceSource::kBluetooth;
    d.name = machine_.line(dir + "name").value_or(entry);
    d.id = "rfkill:" + d.name;
    d.on = machine_.number(dir + "state").value_or(0) == 1;  // 1 unblocked, 0 soft, 2 hard blocked
    out.push_back(d);
  }
}

void DeviceSource::displays(std::vector<DeviceState>& out) const {
  const std::string root = "/sys/class/drm/";
  for (const auto& entry : machine_.list(root)) {
    const auto dash = entry.find('-');
    if (entry.rfind("card", 0) != 0 || dash == std::string::npos) continue;
    const std::string connector = entry.substr(dash + 1);
    if (connector.rfind("eDP", 0) == 0 || connector.rfind("LVDS", 0) == 0 || connector.rfind("DSI", 0) == 0) continue;
    const auto status = machine_.line(root + entry + "/status");
    if (!status) continue;
    out.push_back({DeviceSource::kDisplay, "drm:" + entry, connector, *status == "connected"});
  }
}

void DeviceSource::gpus(std::vector<DeviceState>& out) const {
  const std::string root = "/sys/bus/pci/devices/";
  for (const auto& address : machine_.list(root)) {
    const std::string dir = root + address + "/";
    const std::string cls = machine_.line(dir + "class").value_or("");
    if (cls.rfind("0x03", 0) != 0) continue;                           // display controllers
    if (machine_.number(dir + "boot_vga").value_or(1) != 0) continue;  // the integrated, boot one
    const auto status = machine_.line(dir + "power/runtime_status");
    if (!status) continue;
    out.push_back(
        {DeviceSource::kDiscreteGpu, "pci:" + address,
         "GPU " + machine_.line(dir + "vendor").value_or("") + ":" + machine_.line(dir + "device").value_or(""),
         *status == "active"});
  }
}

std::optional<std::uint64_t> PanelAndFanSource::brightnessPercent() const {
  const std::string root = "/sys/class/backlight/";
  for (const auto& entry : machine_.list(root)) {
    const auto value = machine_.number(root + entry + "/brightness");
    const auto max = machine_.number(root + entry + "/max_brightness");
    if (value && max && *max > 0) return (std::min(*value, *max) * 100 + *max / 2) / *max;
  }
  return std::nullopt;
}

std::optional<std::uint64_t> PanelAndFanSource::highestFanRpm() const {
  const std::string root = "/sys/class/hwmon/";
  std::optional<std::uint64_t> highest;
  for (const auto& entry : machine_.list(root)) {
    for (const auto& file : machine_.list(root + entry)) {
      if (file.rfind("fan", 0) != 0 || file.size() < 7 || file.compare(file.size() - 6, 6, "_input") != 0) continue;
      if (const auto rpm = machine_.number(root + entry + "/" + file)) highest = std::max(highest.value_or(0), *rpm);
    }
  }
  return highest;
}

}  // namespace bw::recorder
