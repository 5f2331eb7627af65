#pragma once
// A read-only memory map of a whole file, unmapped when the object goes.
#include <cstddef>
#include <cstdint>
#include <string>

namespace bw {

class MappedFile {
 public:
  // Maps `path`; `ok()` is false when the file cannot be opened or mapped.
  // An empty file maps to an empty, valid view.
  explicit MappedFile(const std::string& path);
  ~MappedFile();
  MappedFile(const MappedFile&) = delete;
  MappedFile& operator=(const MappedFile&) = delete;

  bool ok() const { return ok_; }
  // The errno value of the failure when not ok() (EISDIR for a non-file).
  int error() const { return error_; }
  const std::uint8_t* data() const { return data_; }
  std::size_t size() const { return size_; }

 private:
  const std::uint8_t* data_ = nullptr;
  std::size_t size_ = 0;
  bool ok_ = false;
  bool mapped_ = false;
  int error_ = 0;
};

}  // namespace bw
