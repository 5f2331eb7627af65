#include "ProcessCatalog.h"

#include <algorithm>
#include <cstdio>
#include <iterator>
#include <map>

namespace bw::samplestore {

namespace {

const char* const kDaemonWords[] = {
    "power", "index", "sync",   "backup",   "net",    "log",    "media", "print", "update",  "time",
    "audio", "hid",   "locate", "keystore", "notify", "config", "disk",  "cache", "thermal", "usb",
    "wlan",  "blue",  "crash",  "font",     "mount",  "secure", "trust", "usage", "report",  "install",
};
const char* const kDaemonEndings[] = {"d", "helper", "monitor"};

const char* const kAgentWords[] = {
    "cloud",  "photo", "contacts", "alarm",   "mail",    "share", "notes",  "music",
    "widget", "dock",  "menu",     "desktop", "preview", "input", "speech", "accounts",
};

struct AppModel {
  const char* name;
  const char* identifier;  // reverse-domain name
  double cpuWeight;
  std::uint64_t residentMB;
  bool slotLabel;  // recorded under the launcher's slot label
};
const AppModel kApps[] = {
    {"Harbor Browser", "com.harbor.browser", 0.22, 700, false},
    {"Tidepool Mail", "com.tidepool.mail", 0.05, 320, true},
    {"Inkwell", "org.inkwell.editor", 0.04, 260, false},
    {"Terminal", "com.vexil.terminal", 0.02, 90, false},
    {"Parley Chat", "io.parley.chat", 0.08, 420, true},
    {"Lumen Photos", "com.lumen.photos", 0.1, 520, false},
    {"Cadence Music", "fm.cadence.player", 0.06, 240, false},
    {"Calendar", "com.vexil.calendar", 0.01, 110, false},
    {"Ledger Sheets", "com.ledgerly.sheets", 0.05, 300, true},
    {"Quill Notes", "net.quill.notes", 0.02, 150, false},
    {"Meridian Maps", "com.meridian.maps", 0.07, 380, false},
    {"Vellum Reader", "com.vellum.reader", 0.03, 200, false},
    {"Atlas Code", "dev.atlas.code", 0.12, 650, false},
    {"Prism Slides", "com.prism.slides", 0.06, 340, true},
    {"Ember Video", "tv.ember.video", 0.18, 560, false},
    {"Kestrel Files", "com.kestrel.files", 0.02, 130, false},
};

struct ServiceModel {
  const char* suffix;
  double cpuShare;  // of the owner's weight
  bool uuidSuffix;
  bool numberSuffix;
};
const ServiceModel kServices[] = {
    {"Renderer", 0.8, true, false},  {"Networking", 0.2, false, false},  {"Thumbnailer", 0.3, false, true},
    {"Autosave", 0.05, false, true}, {"Spellcheck", 0.05, false, false}, {"Decoder", 0.5, true, false},
};

const char* const kPluginKinds[] = {"Video Decoder", "Audio Codec", "Document Viewer", "Web Content"};

}  // namespace

std::array<std::uint8_t, 16> executableUuidOf(const std::string& name) {
  std::array<std::uint8_t, 16> bytes{};
  std::uint64_t a = hashText(name.c_str());
  std::uint64_t b = mix64(a);
  for (int i = 0; i < 8; ++i) {
    bytes[static_cast<std::size_t>(i)] = static_cast<std::uint8_t>(a >> (8 * i));
    bytes[static_cast<std::size_t>(8 + i)] = static_cast<std::uint8_t>(b >> (8 * i));
  }
  return bytes;
}

std::vector<Program> makeCatalog(int scale, Random& rng) {
  const int total = std::max(scale, 10);
  // A user runs a handful of applications and agents however busy the
  // machine is; daemons and helper services make up the rest.
  const int apps = std::clamp(total * 10 / 100, 3, static_cast<int>(std::size(kApps)));
  const int agents = std::clamp(total * 12 / 100, 2, static_cast<int>(std::size(kAgentWords)));
  const int plugins = std::max(1, total * 5 / 100);
  const int services = std::max(2, total * 25 / 100);
  const int daemons = std::max(2, total - apps - agents - plugins - services);
  std::vector<Program> out;
  const auto round = [](int i, int n) { return i / n == 0 ? std::string() : std::to_string(i / n + 1); };

  for (int i = 0; i < daemons; ++i) {
    const int words = static_cast<int>(std::size(kDaemonWords));
    const int endings = static_cast<int>(std::size(kDaemonEndings));
    Program p;
    p.name = std::string(kDaemonWords[i % words]) + kDaemonEndings[(i / words) % endings] + round(i, words * endings);
    p.role = Role::Daemon;
    p.uid = i % 7 == 6 ? 200 + static_cast<std::uint32_t>(i % 40) : 0;  // a few run as service accounts
    p.cpuWeight = rng.uniform(0.001, 0.02) * (i % 11 == 1 ? 6 : 1);
    p.wakeRate = rng.uniform(0.5, 20);
    p.residentMB = static_cast<std::uint64_t>(rng.between(4, 60));
    out.push_back(std::move(p));
  }
  for (int i = 0; i < agents; ++i) {
    const int words = static_cast<int>(std::size(kAgentWords));
    Program p;
    p.name = std::string(kAgentWords[i % words]) + "agent" + round(i, words);
    p.role = Role::Agent;
    p.uid = 501;
    p.cpuWeight = rng.uniform(0.0005, 0.01);
    p.wakeRate = rng.uniform(0.2, 8);
    p.residentMB = static_cast<std::uint64_t>(rng.between(6, 80));
    out.push_back(std::move(p));
  }
  std::vector<int> appIndex;
  std::map<int, std::string> identifiers;
  for (int i = 0; i < apps; ++i) {
    const int n = static_cast<int>(std::size(kApps));
    const AppModel& app = kApps[i % n];
    Program p;
    p.displayName = std::string(app.name) + (i < n ? "" : " " + std::to_string(i / n + 1));
    std::string identifier = std::string(app.identifier) + round(i, n);
    if (app.slotLabel) {
      // Started by the application launcher: the label begins with its slot.
      char prefix[40];
      std::snprintf(prefix, sizeof prefix, "[0x0-0x%x].", 0x1a01a + i * 0x3003);
      p.name = prefix + identifier;
    } else {
      p.name = p.displayName;
    }
    p.role = Role::App;
    p.uid = 501;
    p.cpuWeight = app.cpuWeight * rng.uniform(0.7, 1.3);
    p.wakeRate = rng.uniform(5, 120);
    p.residentMB = app.residentMB;
    p.gui = true;
    appIndex.push_back(static_cast<int>(out.size()));
    identifiers[static_cast<int>(out.size())] = identifier;
    out.push_back(std::move(p));
  }
  for (int i = 0; i < services; ++i) {
    // Most services work for applications, a few for daemons.
    const bool forDaemon = i % 5 == 4;
    const int owner = forDaemon ? static_cast<int>(rng.below(static_cast<std::uint64_t>(daemons)))
                                : appIndex[static_cast<std::size_t>(i) % appIndex.size()];
    const ServiceModel& service = kServices[static_cast<std::size_t>(i / 2) % std::size(kServices)];
    const Program& o = out[static_cast<std::size_t>(owner)];
    Program p;
    p.name = forDaemon ? "com.vexil." + o.name + ".worker" : identifiers[owner] + "." + service.suffix;
    p.role = Role::Service;
    p.owner = owner;
    p.uid = o.uid;
    p.cpuWeight = o.cpuWeight * service.cpuShare;
    p.wakeRate = rng.uniform(1, 40);
    p.residentMB = std::max<std::uint64_t>(12, o.residentMB / 3);
    p.gui = !forDaemon && service.cpuShare >= 0.5;
    p.uuidSuffix = !forDaemon && service.uuidSuffix;
    p.numberSuffix = forDaemon || service.numberSuffix;
    out.push_back(std::move(p));
  }
  for (int i = 0; i < plugins; ++i) {
    const int owner = appIndex[static_cast<std::size_t>(i * 3) % appIndex.size()];
    Program p;
    p.name = "PluginProcess";
    p.displayName = out[static_cast<std::size_t>(owner)].displayName + " (" +
                    kPluginKinds[static_cast<std::size_t>(i) % std::size(kPluginKinds)] + ")";
    p.role = Role::Plugin;
    p.owner = owner;
    p.uid = 501;
    p.cpuWeight = rng.uniform(0.01, 0.08);
    p.wakeRate = rng.uniform(10, 60);
    p.residentMB = static_cast<std::uint64_t>(rng.between(60, 300));
    p.gui = true;
    out.push_back(std::move(p));
  }
  for (Program& p : out) p.executableUuid = executableUuidOf(p.name);
  return out;
}

const std::vector<const char*>& toolNames() {
  static const std::vector<const char*> names = {"sh",        "cp",        "tar",       "zip",      "df",
                                                 "ps",        "sort",      "date",      "logger",   "stat",
                                                 "sysreport", "fetchmeta", "diskcheck", "plistconv"};
  return names;
}

}  // namespace bw::samplestore
