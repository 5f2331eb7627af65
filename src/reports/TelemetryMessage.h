#pragma once
// One telemetry message: a domain and its keyed fields, in the order set.
// Keys are "com.vexil.message.PREFIX.NAME" (or without the prefix and its
// dot), cut to 63 characters; values are cut to 127. Numbers are rounded to
// the nearest whole number; a value that is not a number is left out. With
// the debug flag every field set is also printed "KEY: VALUE" on standard
// error.
#include <optional>
#include <string>
#include <utility>
#include <vector>

namespace bw {

class TelemetryMessage {
 public:
  static constexpr std::size_t kMaxKey = 63;
  static constexpr std::size_t kMaxValue = 127;

  explicit TelemetryMessage(std::string domain) : domain_(std::move(domain)) {}

  // `prefix` may be empty (no group). A key set again keeps its place and
  // takes the new value.
  void setField(const std::string& prefix, const std::string& name, const std::string& value);
  // round(value) as "%lld"; nothing for NaN or an infinity.
  void setNumber(const std::string& prefix, const std::string& name, double value);

  const std::string& domain() const { return domain_; }
  const std::vector<std::pair<std::string, std::string>>& fields() const { return fields_; }
  // The value under the full key, or none.
  std::optional<std::string> value(const std::string& key) const;

 private:
  std::string domain_;
  std::vector<std::pair<std::string, std::string>> fields_;
};

// Where finished messages go.
class TelemetrySink {
 public:
  virtual ~TelemetrySink() = default;
  virtual void send(const TelemetryMessage& message) = 0;
};

// Keeps every message sent, for tests and in-process callers.
class CapturingSink : public TelemetrySink {
 public:
  void send(const TelemetryMessage& message) override { messages.push_back(message); }
  std::vector<TelemetryMessage> messages;
};

}  // namespace bw
