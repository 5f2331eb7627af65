#pragma once
// Real records for boot timeline tests, owned by the store that made them.
#include <deque>
#include <memory>
#include <optional>
#include <vector>

#include "Records/LogStartsV0.h"
#include "Records/LogStartsV1.h"
#include "Records/SleepWake.h"
#include "Records/TimeChange.h"
#include "Records/UserIdle.h"

namespace bw::test {

// 2023-11-14 22:13:20 UTC, a wall time well after the clock-set cut-off.
inline constexpr std::uint64_t kWall = 1700000000000ULL;

class BootRecordStore {
 public:
  // The boot's header; a null `version` leaves the system version absent.
  Record* header(std::uint64_t abs, std::uint64_t wall, const char* version = "23A344",
                 std::optional<Uuid> last = std::nullopt) {
    auto r = std::make_unique<LogStartsV1>();
    r->setVersion("1");
    r->setAbsoluteTime(abs);
    r->setWallTime(wall);
    if (version != nullptr) r->setSystemVersion(version);
    r->setLastBootUUID(last);
    return keep(std::move(r));
  }
  Record* idle(std::uint64_t abs) {
    auto r = std::make_unique<UserIdle>();
    r->setAbsoluteTime(abs);
    return keep(std::move(r));
  }
  Record* wake(std::uint64_t abs, std::uint64_t wall) {
    auto r = std::make_unique<SleepWake>();
    r->setAbsoluteTime(abs);
    r->setWallTime(wall);
    r->setReason(1);
    return keep(std::move(r));
  }
  Record* clockSet(std::uint64_t abs, std::uint64_t wall) {
    auto r = std::make_unique<TimeChange>();
    r->setAbsoluteTime(abs);
    r->setWallTime(wall);
    return keep(std::move(r));
  }
  Record* oldHeader(std::uint64_t abs, std::uint64_t wall) {
    auto r = std::make_unique<LogStartsV0>();
    r->setAbsoluteTime(abs);
    r->setWallTime(wall);
    return keep(std::move(r));
  }

 private:
  Record* keep(std::unique_ptr<Record> r) { return records_.emplace_back(std::move(r)).get(); }
  std::deque<std::unique_ptr<Record>> records_;
};

}  // namespace bw::test
