#include "platform/TextIo.h"

#include <unistd.h>

#include <cerrno>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <random>

namespace zv {

bool FileExists(const std::string& path) {
  std::error_code ec;
  return !path.empty() && std::filesystem::is_regular_file(path, ec);
}

LineReader::LineReader(std::istream& in) : in_(in) {}

bool LineReader::fill() {
  if (eof_) return false;
  if (pos_ > 0) {
    buf_.erase(0, pos_);
    pos_ = 0;
  }
  const size_t chunk = chunk_;
  chunk_ = 1 << 20;  // small inputs get a small buffer, long files 1 MiB chunks
  size_t old = buf_.size();
  buf_.resize(old + chunk);
  in_.read(buf_.data() + old, static_cast<std::streamsize>(chunk));
  size_t got = static_cast<size_t>(in_.gcount());
  buf_.resize(old + got);
  if (got == 0 || !in_) eof_ = true;
  return got > 0;
}

bool LineReader::next(std::string_view& line) {
  for (;;) {
    size_t nl = buf_.find('\n', pos_);
    if (nl != std::string::npos) {
      size_t end = nl;
      if (end > pos_ && buf_[end - 1] == '\r') --end;
      line = std::string_view(buf_).substr(pos_, end - pos_);
      pos_ = nl + 1;
      return true;
    }
    if (!fill()) {
      if (pos_ >= buf_.size()) return false;
      size_t end = buf_.size();
      if (end > pos_ && buf_[end - 1] == '\r') --end;
      line = std::string_view(buf_).substr(pos_, end - pos_);
      pos_ = buf_.size();
      return true;
    }
  }
}

bool ReadTextLines(const std::string& path, std::vector<std::string>& lines) {
  std::ifstream in(path, std::ios::binary);
  if (!in) return false;
  LineReader reader(in);
  std::string_view line;
  while (reader.next(line)) lines.emplace_back(line);
  return true;
}

TextFileWriter::TextFileWriter(std::string path) : path_(std::move(path)) {}

TextFileWriter::~TextFileWriter() {
  if (file_) {
    std::fclose(file_);
    std::remove(tempPath_.c_str());
  }
}

bool TextFileWriter::open() {
  std::filesystem::path target(path_);
  std::filesystem::path folder = target.parent_path();
  std::random_device rd;
  for (int attempt = 0; attempt < 5 && !file_; ++attempt) {
    std::filesystem::path temp =
        folder / ("." + target.filename().string() + "." + std::to_string(getpid()) + "." +
                  std::to_string(rd() % 100000) + ".tmp");
    tempPath_ = temp.string();
    file_ = std::fopen(tempPath_.c_str(), "wbx");
    if (!file_ && errno != EEXIST) break;
  }
  if (!file_) {
    error_ = std::strerror(errno);
    return false;
  }
  buf_.reserve(kFlushAt + 4096);
  return true;
}

void TextFileWriter::flush() {
  if (!file_ || failed_ || buf_.empty()) {
    buf_.clear();
    return;
  }
  if (std::fwrite(buf_.data(), 1, buf_.size(), file_) != buf_.size()) {
    failed_ = true;
    error_ = std::strerror(errno);
  }
  buf_.clear();
}

bool TextFileWriter::commit() {
  if (!file_) return false;
  flush();
  bool ok = !failed_;
  if (std::fflush(file_) != 0 && ok) {
    ok = false;
    error_ = std::strerror(errno);
  }
  if (std::fclose(file_) != 0 && ok) {
    ok = false;
    error_ = std::strerror(errno);
  }
  file_ = nullptr;
  if (ok) {
    // Keep the permissions of a file that is replaced.
    std::error_code ec;
    auto perms = std::filesystem::status(path_, ec).permissions();
    if (!ec) std::filesystem::permissions(tempPath_, perms, ec);
    if (std::rename(tempPath_.c_str(), path_.c_str()) != 0) {
      ok = false;
      error_ = std::strerror(errno);
    }
  }
  if (!ok) std::remove(tempPath_.c_str());
  return ok;
}

bool WriteTextLines(const std::string& path, const std::vector<std::string>& lines,
                    std::string* error) {
  TextFileWriter writer(path);
  bool ok = writer.open();
  if (ok) {
    for (const auto& l : lines) writer.line(l);
    ok = writer.commit();
  }
  if (!ok && error) *error = writer.error();
  return ok;
}

}  // namespace zv
