#pragma once
// Fan: when the fans were loud enough to hear. Each FanState sample has a
// class by its loudness: 0 and below up to 1 quiet or off, 2 audible, 3
// annoying, 4 and above very annoying. The fan state holds from the first
// audible-or-louder sample to the first quieter one; it also ends at a
// sleep and at the previous boot's last record when a boot changes.
// A FanState without a loudness says nothing: no answer, no sample.
//
// A summary counts the samples of each class that lie in its ranges
// (half-open, so a range from the first loud sample to the first quiet one
// counts just the loud ones) and adds up the ranges' lengths.
#include <array>
#include <cstdint>
#include <vector>

#include "framework/Summarizer.h"

namespace bw {

enum class FanClass : std::uint8_t { QuietOrOff, Audible, Annoying, VeryAnnoying };
FanClass fanClassOfLoudness(std::int32_t loudness);

// A boot's fan samples: absolute times per class, ascending.
class FanContext : public SummarizerContext {
 public:
  static constexpr const char* kClassName = "FanContext";
  const char* className() const override { return kClassName; }

  void addSample(FanClass c, std::uint64_t time);
  // Samples of class `c` at times in [L, L + N).
  std::uint64_t samplesInRange(FanClass c, Range range) const;

 private:
  std::array<std::vector<std::uint64_t>, 4> times_;
};

class FanSummary : public Summary {
 public:
  std::uint64_t samples() const { return samples_; }
  void setSamples(std::uint64_t v) { samples_ = v; }
  std::uint64_t quiet_or_off_samples() const { return quiet_or_off_samples_; }
  void setQuiet_or_off_samples(std::uint64_t v) { quiet_or_off_samples_ = v; }
  std::uint64_t audible_samples() const { return audible_samples_; }
  void setAudible_samples(std::uint64_t v) { audible_samples_ = v; }
  std::uint64_t annoying_samples() const { return annoying_samples_; }
  void setAnnoying_samples(std::uint64_t v) { annoying_samples_ = v; }
  std::uint64_t veryannoying_samples() const { return veryannoying_samples_; }
  void setVeryannoying_samples(std::uint64_t v) { veryannoying_samples_ = v; }

 private:
  std::uint64_t samples_ = 0;
  std::uint64_t quiet_or_off_samples_ = 0;
  std::uint64_t audible_samples_ = 0;
  std::uint64_t annoying_samples_ = 0;
  std::uint64_t veryannoying_samples_ = 0;
};

class FanSummarizer : public Summarizer {
 public:
  FanSummarizer();

  std::unique_ptr<Summary> newSummary() const override { return std::make_unique<FanSummary>(); }
  // By annoying + very annoying samples, then by all samples; ascending.
  SummaryComparator comparator() const override { return &compareLoudSamples; }
  static int compareLoudSamples(const Summary& a, const Summary& b);

  void summarize(Summary& summary, const AbsRange& range) override;
  using Summarizer::summarize;
};

}  // namespace bw
