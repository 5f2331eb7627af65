#pragma once
// One boot: a record is inside exactly when it belongs to `uuid`. Made
// without a UUID, the domain adopts the boot of the first record, so it
// selects the timeline's first boot.
#include <optional>

#include "base/Uuid.h"
#include "domains/Domain.h"

namespace bw {

class BootDomain : public Domain {
 public:
  explicit BootDomain(std::optional<Uuid> uuid);

  void addEvent(const Record& event, std::uint64_t position, const AbsTime& absTime, std::uint64_t wallTime) override;

  const std::optional<Uuid>& uuid() const { return uuid_; }

 private:
  std::optional<Uuid> uuid_;
};

}  // namespace bw
