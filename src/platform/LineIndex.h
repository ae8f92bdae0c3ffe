#pragma once
// Large text files without loading them: a read-only memory mapping of the
// whole file and an index of its line starts, built in steps so that the
// first lines can be shown while a background thread indexes the rest.

#include <atomic>
#include <cstddef>
#include <mutex>
#include <string>
#include <string_view>
#include <vector>

namespace zv {

class MappedFile {
 public:
  MappedFile() = default;
  ~MappedFile();
  MappedFile(const MappedFile&) = delete;
  MappedFile& operator=(const MappedFile&) = delete;

  // Maps the file; false with error() set when it cannot be opened or mapped.
  bool open(const std::string& path);
  void close();
  std::string_view bytes() const { return {data_, size_}; }
  const std::string& error() const { return error_; }

 private:
  const char* data_ = nullptr;
  size_t size_ = 0;
  bool mapped_ = false;
  std::string error_;
};

// Lines end in LF, CR LF or CR alone; a final line end does not start
// another line, and a last line without one is a line. The text must
// outlive the index. build() may run on one thread while others read.
class LineIndex {
 public:
  explicit LineIndex(std::string_view text);

  // Indexes about `bytes` more of the text; true once all of it is indexed.
  // Calls from several threads take turns.
  bool build(size_t bytes = static_cast<size_t>(-1));
  bool complete() const { return complete_; }
  // Bytes looked at so far.
  size_t scanned() const;

  // The lines found so far (all of them once complete).
  size_t lineCount() const;
  // Line i without its line end.
  std::string_view line(size_t i) const;
  size_t lineStart(size_t i) const;
  // The line holding the byte at offset (among the lines found so far).
  size_t lineAt(size_t offset) const;
  // The length of the longest line found so far, in bytes.
  size_t longestLine() const;

  std::string_view text() const { return text_; }

 private:
  std::string_view text_;
  std::mutex build_;
  mutable std::mutex read_;
  // starts_[i] is the first byte of line i; its line end is found from the
  // next start (a line holds no CR or LF).
  std::vector<size_t> starts_;
  size_t scanned_ = 0;
  size_t longest_ = 0;
  std::atomic<bool> complete_{false};
};

}  // namespace zv
