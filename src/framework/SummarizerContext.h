#pragma once
// Per-boot state of a summarizer: its accumulators for one boot.
#include <memory>
#include <string>

#include "accum/HashFactory.h"
#include "accum/Interpolator.h"

namespace bw {

class SummarizerContext {
 public:
  virtual ~SummarizerContext() = default;
  virtual const char* className() const = 0;
};

// A context holding one interpolator per key, made on first use.
class InterpolatorContext : public SummarizerContext {
 public:
  static constexpr const char* kClassName = "InterpolatorContext";
  const char* className() const override { return kClassName; }

  // The interpolator under `key`, made empty when missing.
  Interpolator& operator[](const std::string& key) { return interpolators_.objectForKey(key); }
  // The interpolator under `key`, or null; never creates.
  const Interpolator* find(const std::string& key) const { return interpolators_.objectForKeyedSubscript(key).get(); }
  const HashFactory<std::string, Interpolator>& interpolators() const { return interpolators_; }

 private:
  HashFactory<std::string, Interpolator> interpolators_ = HashFactory<std::string, Interpolator>::withClass();
};

}  // namespace bw
