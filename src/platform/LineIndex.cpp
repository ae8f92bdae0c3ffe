#include "platform/LineIndex.h"

#include <fcntl.h>
#include <sys/mman.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstring>

namespace zv {

MappedFile::~MappedFile() {
  close();
}

bool MappedFile::open(const std::string& path) {
  close();
  const int fd = ::open(path.c_str(), O_RDONLY | O_CLOEXEC);
  if (fd < 0) {
    error_ = std::strerror(errno);
    return false;
  }
  struct stat st {};
  bool ok = ::fstat(fd, &st) == 0;
  if (ok && !S_ISREG(st.st_mode)) {
    errno = EINVAL;
    ok = false;
  }
  if (ok && st.st_size > 0) {
    void* at = ::mmap(nullptr, static_cast<size_t>(st.st_size), PROT_READ, MAP_PRIVATE, fd, 0);
    ok = at != MAP_FAILED;
    if (ok) {
      data_ = static_cast<const char*>(at);
      size_ = static_cast<size_t>(st.st_size);
      mapped_ = true;
      ::madvise(at, size_, MADV_SEQUENTIAL);
    }
  }
  if (!ok) error_ = std::strerror(errno);
  ::close(fd);
  return ok;
}

void MappedFile::close() {
  if (mapped_) ::munmap(const_cast<char*>(data_), size_);
  data_ = nullptr;
  size_ = 0;
  mapped_ = false;
}

LineIndex::LineIndex(std::string_view text) : text_(text) {
  if (text_.empty()) complete_ = true;
}

bool LineIndex::build(size_t bytes) {
  std::lock_guard turn(build_);
  if (complete_) return true;
  const char* data = text_.data();
  const size_t size = text_.size();
  const size_t stop = size - scanned_ <= bytes ? size : scanned_ + bytes;
  std::vector<size_t> starts;
  size_t longest = 0;
  size_t at = scanned_;
  size_t lf = 0;  // the next LF at or after `at` (size: none), valid while lf >= at
  // A step ends only after a whole line, so a CR LF pair is never split.
  while (at < size && (at < stop || starts.empty())) {
    if (lf < at || at == scanned_) {
      const void* found = std::memchr(data + at, '\n', size - at);
      lf = found ? static_cast<size_t>(static_cast<const char*>(found) - data) : size;
    }
    const void* cr = std::memchr(data + at, '\r', lf - at);
    const size_t lineEnd = cr ? static_cast<size_t>(static_cast<const char*>(cr) - data) : lf;
    size_t next = lineEnd;
    if (next < size)
      next += data[next] == '\r' && next + 1 < size && data[next + 1] == '\n' ? 2 : 1;
    starts.push_back(at);
    longest = std::max(longest, lineEnd - at);
    at = next;
  }
  std::lock_guard lock(read_);
  starts_.insert(starts_.end(), starts.begin(), starts.end());
  longest_ = std::max(longest_, longest);
  scanned_ = at;
  if (at >= size) complete_ = true;
  return complete_;
}

size_t LineIndex::scanned() const {
  std::lock_guard lock(read_);
  return scanned_;
}

size_t LineIndex::lineCount() const {
  std::lock_guard lock(read_);
  return starts_.size();
}

std::string_view LineIndex::line(size_t i) const {
  std::lock_guard lock(read_);
  if (i >= starts_.size()) return {};
  size_t end = i + 1 < starts_.size() ? starts_[i + 1] : scanned_;
  if (end > starts_[i] && text_[end - 1] == '\n') --end;
  if (end > starts_[i] && text_[end - 1] == '\r') --end;
  return text_.substr(starts_[i], end - starts_[i]);
}

size_t LineIndex::lineStart(size_t i) const {
  std::lock_guard lock(read_);
  return i < starts_.size() ? starts_[i] : scanned_;
}

size_t LineIndex::lineAt(size_t offset) const {
  std::lock_guard lock(read_);
  if (starts_.empty()) return 0;
  const auto after = std::upper_bound(starts_.begin(), starts_.end(), offset);
  return static_cast<size_t>(after - starts_.begin()) - (after == starts_.begin() ? 0 : 1);
}

size_t LineIndex::longestLine() const {
  std::lock_guard lock(read_);
  return longest_;
}

}  // namespace zv
