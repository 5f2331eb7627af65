#pragma once
// Job names: a process name without the parts that differ between
// instances of one program, and a table that lets every process of a job
// share one copy of its cleaned label and display name.
#include <memory>
#include <string>
#include <unordered_map>

namespace bw {

// Removes, by ICU regular-expression search, a trailing "." plus an
// upper-case UUID, a trailing "." plus decimal digits, and a leading
// "[0xHEX-0xHEX]." launcher slot: "Foo.12345" and "[0x1f-0x2e].Foo" give
// "Foo"; a lower-case UUID suffix is kept. One pass: "Foo.1.2" gives
// "Foo.1".
std::string stringByRemovingTrailingUUIDsAndLaunchServicesStuff(const std::string& name);

// Shared, immutable copies of label and display-name texts, one per
// distinct text, so that thousands of processes of a job cost one string.
class JobNames {
 public:
  using Name = std::shared_ptr<const std::string>;

  // The cleaned form of `raw`, shared.
  Name cleanedLabel(const std::string& raw);
  // `text` itself, shared.
  Name shared(const std::string& text);

 private:
  struct Entry {
    Name name;
    bool clean = false;  // cleaning the key gives the key itself
  };
  std::unordered_map<std::string, Entry> names_;
};

}  // namespace bw
