#pragma once
// The curves of one boot in an aggregate: membership by identity,
// each member once, kept in the order first added so that sums and the
// first refusal are repeatable. Members are shared, never copied.
#include <memory>
#include <unordered_set>
#include <vector>

#include "accum/Curve.h"

namespace bw {

class InterpolatorSet {
 public:
  static constexpr const char* kClassName = "InterpolatorSet";

  // Adds `member` unless it is already in the set (or null).
  void add(std::shared_ptr<const Curve> member) {
    if (member && identities_.insert(member.get()).second) members_.push_back(std::move(member));
  }
  bool contains(const Curve* member) const { return identities_.count(member) != 0; }
  std::size_t count() const { return members_.size(); }
  const std::vector<std::shared_ptr<const Curve>>& members() const { return members_; }

 private:
  std::vector<std::shared_ptr<const Curve>> members_;
  std::unordered_set<const Curve*> identities_;
};

}  // namespace bw
