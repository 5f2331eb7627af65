#pragma once
// A fresh directory under the system's temporary folder, removed with
// everything in it when the object goes away.
#include <string>

namespace bw::test {

class TempDir {
 public:
  TempDir();
  ~TempDir();
  TempDir(const TempDir&) = delete;
  TempDir& operator=(const TempDir&) = delete;

  const std::string& path() const { return path_; }
  // `path()` joined with `relative`.
  std::string operator/(const std::string& relative) const { return path_ + "/" + relative; }

  // Writes `bytes` to `relative`, creating parent directories.
  std::string write(const std::string& relative, const std::string& bytes = "") const;

 private:
  std::string path_;
};

// Sets a file's modification time to `seconds` since 1970.
void setModificationTime(const std::string& path, long long seconds);

}  // namespace bw::test
