#pragma once
// Line-based text I/O: lines end in CR LF, LF or CR alone when read (a
// leading UTF-8 byte-order mark is skipped), CR LF when written. Written
// files go to a temporary file in the same folder and are renamed into place,
// so a failed write never leaves a half-written file; the temporary file is
// removed when the process is ended by SIGINT, SIGTERM or SIGHUP, and one
// left by a killed run is removed by the next write of the same file.

#include <cstdint>
#include <cstdio>
#include <istream>
#include <string>
#include <string_view>
#include <vector>

namespace zv {

bool FileExists(const std::string& path);

// True when something other than a regular file (a device, a pipe, a socket,
// a folder, or a link to one) exists at path.
bool IsNonRegularFile(const std::string& path);
// The reason a writer gives for such a path.
inline constexpr const char* kNotRegularFile =
    "It is not a regular file (a device, pipe, socket or folder) and is not replaced.";

// True when text starting with `head` is UTF-16: a byte-order mark FF FE or
// FE FF, or NUL bytes in every other position.
bool LooksLikeUtf16(std::string_view head);
// True when the file at path starts like UTF-16 text.
bool IsUtf16File(const std::string& path);
// The refusal of a UTF-16 file, naming it.
std::string Utf16Refusal(const std::string& path);
inline constexpr const char* kUtf16Title = "Unsupported Text Encoding";

class RunProgress;

class LineReader {
 public:
  // With a progress, every chunk read is reported (and a stop request
  // ends the read by its exception).
  explicit LineReader(std::istream& in, RunProgress* progress = nullptr);
  // The next line without its line end; false at the end of the input.
  // The view stays valid until the next call.
  bool next(std::string_view& line);
  // True when the whole input was consumed (a read error is not the end).
  bool atEnd() const { return eof_ && pos_ >= buf_.size(); }
  // True when the input starts like UTF-16 text (reads the first chunk).
  bool isUtf16();

 private:
  bool fill();
  void start();
  size_t find(char c, size_t& cached) const;
  std::istream& in_;
  std::string buf_;
  size_t pos_ = 0;
  size_t chunk_ = 64 << 10;
  // Positions of the next CR and LF at or after pos_ (buf_.size(): none in
  // the buffer; npos: not searched yet).
  size_t nextCr_ = std::string::npos;
  size_t nextLf_ = std::string::npos;
  RunProgress* progress_;
  std::uintmax_t read_ = 0, total_ = 0;
  bool eof_ = false;
  bool started_ = false;
  bool utf16_ = false;
};

// Reads a whole text file into lines; false when it cannot be opened.
bool ReadTextLines(const std::string& path, std::vector<std::string>& lines,
                   RunProgress* progress = nullptr);

class TextFileWriter {
 public:
  explicit TextFileWriter(std::string path);
  ~TextFileWriter();
  TextFileWriter(const TextFileWriter&) = delete;
  TextFileWriter& operator=(const TextFileWriter&) = delete;

  // Creates the temporary file; false (with error()) when it cannot, also
  // when the path names something other than a regular file.
  bool open();
  // The line and a CR LF.
  void line(std::string_view text) {
    buf_.append(text);
    buf_ += "\r\n";
    if (buf_.size() >= kFlushAt) flush();
  }
  // Bytes as they are, line ends included.
  void raw(std::string_view bytes) {
    buf_.append(bytes);
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
  int slot_ = -1;  // the entry of the temporary file in the removal list
  std::string buf_;
  bool failed_ = false;
  std::string error_;
};

// Writes the given lines with CR LF through a temporary file.
bool WriteTextLines(const std::string& path, const std::vector<std::string>& lines,
                    std::string* error = nullptr);

}  // namespace zv
