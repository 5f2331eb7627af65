#pragma once
// The one exception type of the system. It carries a standard name (which
// kind of fault), a fixed reason text and a small keyed user-info map.
// Only the record reader catches these; anywhere else they end the run and
// `main` reports them on standard error with exit status 70.
#include <any>
#include <map>
#include <stdexcept>
#include <string>

namespace bw {

inline constexpr const char* kInvalidArgumentException = "NSInvalidArgumentException";
inline constexpr const char* kInternalInconsistencyException = "NSInternalInconsistencyException";
inline constexpr const char* kRangeException = "NSRangeException";

class Exception : public std::runtime_error {
 public:
  using UserInfo = std::map<std::string, std::any>;

  Exception(std::string name, std::string reason, UserInfo userInfo = {});

  const std::string& name() const { return name_; }
  const std::string& reason() const { return reason_; }
  const UserInfo& userInfo() const { return userInfo_; }

 private:
  std::string name_;
  std::string reason_;
  UserInfo userInfo_;
};

// Stops the process for an operation that must never be called (abstract or
// unsupported): prints `what` on standard error and aborts.
[[noreturn]] void terminateUnsupported(const char* what);

}  // namespace bw
