#pragma once
// The parsed command line. Every other module reads its settings from here;
// none reads argv. The service makes a fresh one per request.
#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "base/Date.h"
#include "base/Uuid.h"
#include "domains/DomainChoice.h"

namespace bw {

// The run modes (`mode`).
enum Mode : std::uint32_t {
  kModeNone = 0,
  kModeDashboard = 1,
  kModeShowBattery = 2,
  kModeService = 3,
  kModeDump = 4,
  kModeShowEvents = 5,
  kModeListFiles = 6,
  kModeHelp = 7,  // never stored: usage is printed at once
  kModeDaily = 8,
  kModeServiceDebug = 9,
};

class Options {
 public:
  const std::optional<std::string>& from_path() const { return from_path_; }
  void setFrom_path(std::optional<std::string> v) { from_path_ = std::move(v); }

  std::uint64_t domain_start() const { return domain_start_; }
  void setDomain_start(std::uint64_t v) { domain_start_ = v; }
  std::uint64_t domain_end() const { return domain_end_; }
  void setDomain_end(std::uint64_t v) { domain_end_ = v; }

  std::uint32_t domain_ymd_year() const { return domain_ymd_year_; }
  void setDomain_ymd_year(std::uint32_t v) { domain_ymd_year_ = v; }
  std::uint32_t domain_ymd_month() const { return domain_ymd_month_; }
  void setDomain_ymd_month(std::uint32_t v) { domain_ymd_month_ = v; }
  std::uint32_t domain_ymd_day() const { return domain_ymd_day_; }
  void setDomain_ymd_day(std::uint32_t v) { domain_ymd_day_ = v; }

  std::uint32_t mode() const { return mode_; }
  void setMode(std::uint32_t v) { mode_ = v; }
  std::uint32_t domain_type() const { return domain_type_; }
  void setDomain_type(std::uint32_t v) { domain_type_ = v; }

  bool listfileswithnull() const { return listfileswithnull_; }
  void setListfileswithnull(bool v) { listfileswithnull_ = v; }
  bool show_all() const { return show_all_; }
  void setShow_all(bool v) { show_all_ = v; }
  bool exclude_post_install() const { return exclude_post_install_; }
  void setExclude_post_install(bool v) { exclude_post_install_ = v; }
  bool includingSubjobs() const { return includingSubjobs_; }
  void setIncludingSubjobs(bool v) { includingSubjobs_ = v; }

  const std::optional<std::string>& only_system_version() const { return only_system_version_; }
  void setOnly_system_version(std::optional<std::string> v) { only_system_version_ = std::move(v); }
  const std::optional<Uuid>& only_boot_uuid() const { return only_boot_uuid_; }
  void setOnly_boot_uuid(std::optional<Uuid> v) { only_boot_uuid_ = v; }

  // None counts as the distant past.
  const std::optional<Date>& load_periodic_files_newer_than() const { return load_periodic_files_newer_than_; }
  void setLoad_periodic_files_newer_than(std::optional<Date> v) { load_periodic_files_newer_than_ = v; }

  const std::optional<std::vector<std::string>>& domain_mask_states() const { return domain_mask_states_; }
  void setDomain_mask_states(std::optional<std::vector<std::string>> v) { domain_mask_states_ = std::move(v); }

 private:
  std::optional<std::string> from_path_;
  std::uint64_t domain_start_ = 0;
  std::uint64_t domain_end_ = ~std::uint64_t{0};
  std::uint32_t domain_ymd_year_ = 0;
  std::uint32_t domain_ymd_month_ = 0;
  std::uint32_t domain_ymd_day_ = 0;
  std::uint32_t mode_ = kModeNone;
  std::uint32_t domain_type_ = kDomainAll;
  bool listfileswithnull_ = false;
  bool show_all_ = false;
  bool exclude_post_install_ = false;
  bool includingSubjobs_ = false;
  std::optional<std::string> only_system_version_;
  std::optional<Uuid> only_boot_uuid_;
  std::optional<Date> load_periodic_files_newer_than_;
  std::optional<std::vector<std::string>> domain_mask_states_;
};

}  // namespace bw
