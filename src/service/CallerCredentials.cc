#include "service/CallerCredentials.h"

#include <grp.h>
#include <pwd.h>

#include <algorithm>
#include <cstdint>
#include <optional>
#include <string_view>
#include <vector>

namespace bw {

namespace {

std::optional<gid_t> admGroupId() {
  group entry{};
  group* found = nullptr;
  std::vector<char> buffer(16384);
  if (getgrnam_r("adm", &entry, buffer.data(), buffer.size(), &found) != 0 || !found) return std::nullopt;
  return found->gr_gid;
}

// The user's groups from the group database (primary group included).
std::vector<gid_t> groupsOfUser(uid_t uid) {
  passwd entry{};
  passwd* found = nullptr;
  std::vector<char> buffer(16384);
  if (getpwuid_r(uid, &entry, buffer.data(), buffer.size(), &found) != 0 || !found) return {};
  int count = 64;
  std::vector<gid_t> groups(static_cast<std::size_t>(count));
  if (getgrouplist(found->pw_name, found->pw_gid, groups.data(), &count) < 0) {
    groups.resize(static_cast<std::size_t>(count));
    if (getgrouplist(found->pw_name, found->pw_gid, groups.data(), &count) < 0) return {};
  }
  groups.resize(static_cast<std::size_t>(count));
  return groups;
}

// The sender's groups as the bus daemon saw them when it connected
// ("UnixGroupIDs" of GetConnectionCredentials); none when it does not say.
std::optional<std::vector<gid_t>> groupsFromBus(sd_bus_message* message) {
  sd_bus_message* reply = nullptr;
  sd_bus_error error = SD_BUS_ERROR_NULL;
  std::optional<std::vector<gid_t>> groups;
  int r = sd_bus_call_method(sd_bus_message_get_bus(message), "org.freedesktop.DBus", "/org/freedesktop/DBus",
                             "org.freedesktop.DBus", "GetConnectionCredentials", &error, &reply, "s",
                             sd_bus_message_get_sender(message));
  if (r >= 0) r = sd_bus_message_enter_container(reply, 'a', "{sv}");
  while (r >= 0 && sd_bus_message_enter_container(reply, 'e', "sv") > 0) {
    const char* key = nullptr;
    if (sd_bus_message_read_basic(reply, 's', &key) < 0) break;
    if (std::string_view(key) == "UnixGroupIDs" && sd_bus_message_enter_container(reply, 'v', "au") > 0) {
      const void* data = nullptr;
      std::size_t size = 0;
      if (sd_bus_message_read_array(reply, 'u', &data, &size) >= 0) {
        const auto* ids = static_cast<const std::uint32_t*>(data);
        groups.emplace(ids, ids + size / sizeof(std::uint32_t));
      }
      sd_bus_message_exit_container(reply);
    } else if (sd_bus_message_skip(reply, "v") < 0) {
      break;
    }
    sd_bus_message_exit_container(reply);
  }
  sd_bus_message_unref(reply);
  sd_bus_error_free(&error);
  return groups;
}

}  // namespace

bool senderMayReadProcessUsage(sd_bus_message* message) {
  sd_bus_creds* creds = nullptr;
  if (sd_bus_query_sender_creds(message, SD_BUS_CREDS_EUID | SD_BUS_CREDS_UID, &creds) < 0) return false;
  uid_t uid = 0;
  const bool known = sd_bus_creds_get_euid(creds, &uid) >= 0 || sd_bus_creds_get_uid(creds, &uid) >= 0;
  sd_bus_creds_unref(creds);
  if (!known) return false;
  if (uid == 0) return true;
  std::optional<std::vector<gid_t>> groups = groupsFromBus(message);
  if (!groups) groups = groupsOfUser(uid);
  const std::optional<gid_t> adm = admGroupId();
  return adm && std::find(groups->begin(), groups->end(), *adm) != groups->end();
}

}  // namespace bw
