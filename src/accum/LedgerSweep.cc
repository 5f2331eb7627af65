#include "accum/LedgerSweep.h"

#include <algorithm>
#include <limits>

namespace bw {

namespace {

std::size_t countAtOrBelow(const std::vector<std::uint64_t>& list, std::uint64_t p) {
  return static_cast<std::size_t>(std::upper_bound(list.begin(), list.end(), p) - list.begin());
}

std::size_t countBelow(const std::vector<std::uint64_t>& list, std::uint64_t p) {
  return static_cast<std::size_t>(std::lower_bound(list.begin(), list.end(), p) - list.begin());
}

}  // namespace

void LedgerSweep::clear() {
  credits_ = debits_ = 0;
  lastPosition_ = 0;
  lastWasCredit_ = false;
  level_.assign(1, 0);
  closedTime_.assign(1, 0);
  lastOpen_.assign(1, 0);
  lastCredit_.assign(1, -1);
  lastClose_.assign(1, -1);
}

void LedgerSweep::append(std::uint64_t position, bool isCredit) {
  const auto index = static_cast<std::int64_t>(level_.size()) - 1;
  std::int64_t level = level_.back();
  std::uint64_t closed = closedTime_.back();
  std::uint64_t open = lastOpen_.back();
  std::int64_t lastCredit = lastCredit_.back();
  std::int64_t lastClose = lastClose_.back();
  if (isCredit) {
    if (level == 0) open = position;
    ++level;
    lastCredit = index;
    ++credits_;
  } else {
    if (level == 1) {
      closed += position - open;
      lastClose = index;
    }
    --level;
    ++debits_;
  }
  level_.push_back(level);
  closedTime_.push_back(closed);
  lastOpen_.push_back(open);
  lastCredit_.push_back(lastCredit);
  lastClose_.push_back(lastClose);
  lastPosition_ = position;
  lastWasCredit_ = isCredit;
}

bool LedgerSweep::extend(std::span<const std::uint64_t> credits, std::span<const std::uint64_t> debits) {
  if (level_.size() > 1) {
    if (!credits.empty() && credits.front() < lastPosition_) return false;
    if (!debits.empty() && (debits.front() < lastPosition_ || (debits.front() == lastPosition_ && lastWasCredit_)))
      return false;
  }
  std::size_t c = 0, d = 0;
  while (c < credits.size() || d < debits.size()) {
    // At equal positions the debit goes first.
    if (c < credits.size() && (d == debits.size() || credits[c] < debits[d])) {
      append(credits[c++], true);
    } else {
      append(debits[d++], false);
    }
  }
  return true;
}

// With e = L + N, the events split into three runs: those at or before L,
// which only set the level (and may end the sweep with 0); those in (L, e],
// whose closed intervals come from the prefix table, the first one counted
// from L when it opened before the range; and those after e, of which only
// the credits before the first later debit and that debit itself matter.
std::uint64_t LedgerSweep::timeAboveZero(const std::vector<std::uint64_t>& credits,
                                         const std::vector<std::uint64_t>& debits, Range range) const {
  const std::uint64_t begin = range.location;
  const std::uint64_t end = range.location + range.length;
  if (!credits.empty() && credits.front() > end) return 0;
  if (credits.empty() && debits.empty()) return 0;

  const std::size_t creditsToEnd = countAtOrBelow(credits, end);
  const std::size_t debitsToEnd = countAtOrBelow(debits, end);
  const std::size_t i0 = countAtOrBelow(credits, begin) + countAtOrBelow(debits, begin);
  const std::size_t i1 = creditsToEnd + debitsToEnd;

  std::uint64_t total = 0;
  const std::int64_t lastClose = lastClose_[i1];
  if (lastClose >= static_cast<std::int64_t>(i0)) {
    total = closedTime_[i1] - closedTime_[i0];
    if (level_[i0] >= 1) total += lastOpen_[i0] - begin;
  }
  // A close with no credit after it up to e ends the sweep right there.
  if (lastClose >= 0 && lastClose > lastCredit_[i1]) return total;

  std::int64_t level = level_[i1];
  std::uint64_t open = std::max(lastOpen_[i1], begin);
  const bool debitAfterEnd = debitsToEnd < debits.size();
  const std::size_t creditsAfterEnd =
      (debitAfterEnd ? countBelow(credits, debits[debitsToEnd]) : credits.size()) - creditsToEnd;
  const auto credited = static_cast<std::int64_t>(creditsAfterEnd);
  if (level <= 0 && level + credited >= 1) open = credits[creditsToEnd + static_cast<std::size_t>(-level)];
  // The first debit past the end closes from `open` to e whatever the level.
  if (debitAfterEnd) return total + (end - open);
  if (level + credited >= 1 && open < end) total += end - open;
  return total;
}

std::uint64_t LedgerSweep::walk(const std::vector<std::uint64_t>& credits, const std::vector<std::uint64_t>& debits,
                                Range range) {
  constexpr std::uint64_t kInfinity = std::numeric_limits<std::uint64_t>::max();
  const std::uint64_t begin = range.location;
  const std::uint64_t end = range.location + range.length;
  if (!credits.empty() && credits.front() > end) return 0;
  if (credits.empty() && debits.empty()) return 0;
  std::int64_t level = 0;
  std::uint64_t open = begin;
  std::uint64_t total = 0;
  std::size_t ci = 0, di = 0;
  while (true) {
    const bool haveCredit = ci < credits.size();
    const bool haveDebit = di < debits.size();
    const std::uint64_t c = haveCredit ? credits[ci] : kInfinity;
    const std::uint64_t d = haveDebit ? debits[di] : kInfinity;
    if (haveCredit && (!haveDebit || c < d)) {
      if (level == 0) open = std::max(c, begin);
      ++level;
      ++ci;
    } else {
      if (level == 1 || d > end) {
        if (d > begin) total += std::min(d, end) - open;
        if (c > end) return total;
      }
      --level;
      ++di;
    }
    if (ci == credits.size() && di == debits.size()) break;
  }
  if (level >= 1 && open < end) total += end - open;
  return total;
}

}  // namespace bw
