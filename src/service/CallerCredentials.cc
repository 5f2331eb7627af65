#include "service/CallerCredentials.h"

#include <grp.h>
#include <pwd.h>

#include <algorithm>
#include <cstdint>
#include <optional>
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

bool mayReadProcessUsage(uid_t uid, const std::vector<gid_t>& groups, const gid_t* admGroup) {
  if (uid == 0) return true;
  return admGroup && std::find(groups.begin(), groups.end(), *admGroup) != groups.end();
}

}  // namespace

bool senderMayReadProcessUsage(sd_bus_message* message) {
  sd_bus_creds* creds = nullptr;
  const std::uint64_t mask =
      SD_BUS_CREDS_UID | SD_BUS_CREDS_EUID | SD_BUS_CREDS_GID | SD_BUS_CREDS_EGID | SD_BUS_CREDS_SUPPLEMENTARY_GIDS;
  if (sd_bus_query_sender_creds(message, mask, &creds) < 0) return false;
  uid_t uid = 0;
  bool known = sd_bus_creds_get_euid(creds, &uid) >= 0 || sd_bus_creds_get_uid(creds, &uid) >= 0;
  std::vector<gid_t> groups;
  const gid_t* supplementary = nullptr;
  int n = known ? sd_bus_creds_get_supplementary_gids(creds, &supplementary) : -1;
  if (n >= 0) {
    groups.assign(supplementary, supplementary + n);
    gid_t gid = 0;
    if (sd_bus_creds_get_egid(creds, &gid) >= 0 || sd_bus_creds_get_gid(creds, &gid) >= 0) groups.push_back(gid);
  } else if (known) {
    groups = groupsOfUser(uid);
  }
  sd_bus_creds_unref(creds);
  if (!known) return false;
  const std::optional<gid_t> adm = admGroupId();
  return mayReadProcessUsage(uid, groups, adm ? &*adm : nullptr);
}

}  // namespace bw
