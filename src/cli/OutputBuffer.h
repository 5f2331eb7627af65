#pragma once
// Text gathered in one string and written to a stream in large pieces: the
// record listings print millions of short lines, and one stream write per
// piece of a line costs more than the text itself. Whatever is gathered is
// written at the latest when the buffer ends, also when a walk throws.
#include <cstddef>
#include <ostream>
#include <string>

namespace bw {

class OutputBuffer {
 public:
  explicit OutputBuffer(std::ostream& stream) : stream_(stream) { text_.reserve(kChunk + kChunk / 4); }
  ~OutputBuffer() { flush(); }
  OutputBuffer(const OutputBuffer&) = delete;
  OutputBuffer& operator=(const OutputBuffer&) = delete;

  // Where the lines go; call lineDone() after each.
  std::string& text() { return text_; }
  // Writes the text out once a chunk has gathered.
  void lineDone() {
    if (text_.size() >= kChunk) flush();
  }
  void flush() {
    if (text_.empty()) return;
    stream_.write(text_.data(), static_cast<std::streamsize>(text_.size()));
    text_.clear();
  }

 private:
  static constexpr std::size_t kChunk = std::size_t{1} << 20;
  std::ostream& stream_;
  std::string text_;
};

}  // namespace bw
