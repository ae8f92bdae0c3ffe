#pragma once
// Line-based text I/O: lines end in LF or CR LF when read, CR LF when written.
// Written files go to a temporary file in the same folder and are renamed
// into place, so a failed write never leaves a half-written file.

#include <cstdio>
#include <istream>
#include <string>
#include <string_view>
#include <vector>

namespace zv {

bool FileExists(const std::string& path);

class LineReader {
 public:
  explicit LineReader(std::istream& in);
  // The next line without its line end; false at the end of the input.
  // The view stays valid until the next call.
  bool next(std::string_view& line);
  // True when the whole input was consumed (a read error is not the end).
  bool atEnd() const { return eof_ && pos_ >= buf_.size(); }

 private:
  bool fill();
  std::istream& in_;
  std::string buf_;
  size_t pos_ = 0;
  size_t chunk_ = 64 << 10;
  bool eof_ = false;
};

// Reads a whole text file into lines; false when it cannot be opened.
bool ReadTextLines(const std::string& path, std::vector<std::string>& lines);

class TextFileWriter {
 public:
  explicit TextFileWriter(std::string path);
  ~TextFileWriter();
  TextFileWriter(const TextFileWriter&) = delete;
  TextFileWriter& operator=(const TextFileWriter&) = delete;

  // Creates the temporary file; false (with error()) when it cannot.
  bool open();
  // The line and a CR LF.
  void line(std::string_view text) {
    buf_.append(text);
    buf_ += "\r\n";
    if (buf_.size() >= kFlushAt) flush();
  }
  // A string being built in place; call lineDone() afterwards.
  std::string& buffer() { return buf_; }
  void lineDone() {
    buf_ += "\r\n";
    if (buf_.size() >= kFlushAt) flush();
  }
  // Writes everything and renames the file into place.
  bool commit();
  const std::string& error() const { return error_; }

 private:
  static constexpr size_t kFlushAt = 1 << 20;
  void flush();
  std::string path_;
  std::string tempPath_;
  std::FILE* file_ = nullptr;
  std::string buf_;
  bool failed_ = false;
  std::string error_;
};

// Writes the given lines with CR LF through a temporary file.
bool WriteTextLines(const std::string& path, const std::vector<std::string>& lines,
                    std::string* error = nullptr);

}  // namespace zv
