#include "platform/TextIo.h"

#include <dirent.h>
#include <signal.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <atomic>
#include <cerrno>
#include <climits>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <mutex>
#include <sstream>

#include "platform/Progress.h"
#include "platform/Strings.h"

namespace zv {

namespace fs = std::filesystem;

bool FileExists(const std::string& path) {
  std::error_code ec;
  return !path.empty() && fs::is_regular_file(path, ec);
}

bool IsNonRegularFile(const std::string& path) {
  struct stat st {};
  return !path.empty() && ::stat(path.c_str(), &st) == 0 && !S_ISREG(st.st_mode);
}

bool LooksLikeUtf16(std::string_view head) {
  if (head.starts_with("\xFF\xFE") || head.starts_with("\xFE\xFF")) return true;
  // Latin text in UTF-16 has a NUL in every other byte; binary data has NULs
  // in both positions.
  const size_t pairs = std::min<size_t>(head.size(), 4096) / 2;
  size_t nul[2] = {0, 0};
  for (size_t i = 0; i < pairs * 2; ++i)
    if (head[i] == '\0') ++nul[i & 1];
  const size_t major = std::max(nul[0], nul[1]);
  const size_t minor = std::min(nul[0], nul[1]);
  return pairs > 0 && major * 2 >= pairs && minor * 16 <= major;
}

bool IsUtf16File(const std::string& path) {
  std::ifstream in(path, std::ios::binary);
  char head[4096];
  in.read(head, sizeof head);
  return LooksLikeUtf16(std::string_view(head, static_cast<size_t>(in.gcount())));
}

std::string Utf16Refusal(const std::string& path) {
  return "The file '" + path +
         "' is UTF-16 text, which can not be read.  Save it as UTF-8 or ANSI text.";
}

LineReader::LineReader(std::istream& in, RunProgress* progress) : in_(in), progress_(progress) {}

bool LineReader::fill() {
  if (eof_) return false;
  if (pos_ > 0) {
    buf_.erase(0, pos_);
    pos_ = 0;
  }
  nextCr_ = nextLf_ = std::string::npos;
  const size_t chunk = chunk_;
  chunk_ = 1 << 20;  // small inputs get a small buffer, long files 1 MiB chunks
  size_t old = buf_.size();
  buf_.resize(old + chunk);
  in_.read(buf_.data() + old, static_cast<std::streamsize>(chunk));
  size_t got = static_cast<size_t>(in_.gcount());
  buf_.resize(old + got);
  if (got == 0 || !in_) eof_ = true;
  read_ += got;
  if (progress_) progress_->step(RunStage::Reading, read_, total_);
  return got > 0;
}

void LineReader::start() {
  started_ = true;
  if (progress_) {
    const std::istream::pos_type at = in_.tellg();
    if (at != std::istream::pos_type(-1) && in_.seekg(0, std::ios::end)) {
      const std::istream::pos_type end = in_.tellg();
      if (end >= at) total_ = static_cast<std::uintmax_t>(end - at);
    }
    in_.clear();
    in_.seekg(at);
  }
  fill();
  utf16_ = LooksLikeUtf16(buf_);
  if (std::string_view(buf_).starts_with("\xEF\xBB\xBF")) pos_ = 3;
}

bool LineReader::isUtf16() {
  if (!started_) start();
  return utf16_;
}

size_t LineReader::find(char c, size_t& cached) const {
  if (cached == std::string::npos || cached < pos_) {
    const void* hit = std::memchr(buf_.data() + pos_, c, buf_.size() - pos_);
    cached = hit ? static_cast<size_t>(static_cast<const char*>(hit) - buf_.data()) : buf_.size();
  }
  return cached;
}

bool LineReader::next(std::string_view& line) {
  if (!started_) start();
  for (;;) {
    const size_t cr = find('\r', nextCr_);
    const size_t lf = cr == pos_ ? cr : find('\n', nextLf_);
    const size_t end = std::min(cr, lf);
    // A CR at the end of the buffer may be the first half of a CR LF.
    const bool complete = end < buf_.size() && (end + 1 < buf_.size() || buf_[end] == '\n' || eof_);
    if (complete) {
      line = std::string_view(buf_).substr(pos_, end - pos_);
      pos_ = end + 1;
      if (buf_[end] == '\r' && pos_ < buf_.size() && buf_[pos_] == '\n') ++pos_;
      return true;
    }
    if (!fill()) {
      if (pos_ >= buf_.size()) return false;
      line = std::string_view(buf_).substr(pos_);
      if (line.ends_with('\r')) line.remove_suffix(1);
      pos_ = buf_.size();
      return true;
    }
  }
}

bool ReadTextLines(const std::string& path, std::vector<std::string>& lines,
                   RunProgress* progress) {
  std::ifstream in(path, std::ios::binary);
  if (!in) return false;
  LineReader reader(in, progress);
  std::string_view line;
  while (reader.next(line)) lines.emplace_back(line);
  return true;
}

namespace {

// Temporary files being written, for the signal handler: fixed buffers so
// that the handler needs no allocation. State 0 free, 1 being filled, 2 live.
struct TempSlot {
  std::atomic<int> state{0};
  char path[PATH_MAX];
};
constexpr int kTempSlots = 16;
TempSlot g_tempSlots[kTempSlots];
constexpr int kCleanupSignals[] = {SIGINT, SIGTERM, SIGHUP};
// 0: signals end the process; 1: SIGINT and SIGTERM ask the run to stop;
// 2: such a request came.
std::atomic<int> g_stopState{0};

extern "C" void RemoveTempsAndDie(int sig) {
  if (sig != SIGHUP) {
    int expected = 1;
    if (g_stopState.compare_exchange_strong(expected, 2)) return;
  }
  for (TempSlot& slot : g_tempSlots)
    if (slot.state.load() == 2) ::unlink(slot.path);
  struct sigaction fallback {};
  fallback.sa_handler = SIG_DFL;
  sigemptyset(&fallback.sa_mask);
  ::sigaction(sig, &fallback, nullptr);
  // Delivered once this handler returns: the process ends by the signal.
  ::raise(sig);
}

// Only signals that would end the process anyway get the handler; one the
// caller ignores or handles stays as it is.
void InstallCleanupHandlers() {
  static std::once_flag once;
  std::call_once(once, [] {
    struct sigaction action {};
    action.sa_handler = RemoveTempsAndDie;
    sigemptyset(&action.sa_mask);
    for (int sig : kCleanupSignals) sigaddset(&action.sa_mask, sig);
    for (int sig : kCleanupSignals) {
      struct sigaction old {};
      if (::sigaction(sig, nullptr, &old) == 0 && !(old.sa_flags & SA_SIGINFO) &&
          old.sa_handler == SIG_DFL) {
        ::sigaction(sig, &action, nullptr);
      }
    }
  });
}

int RegisterTemp(const std::string& path) {
  if (path.size() >= PATH_MAX) return -1;
  for (int i = 0; i < kTempSlots; ++i) {
    int expected = 0;
    if (g_tempSlots[i].state.compare_exchange_strong(expected, 1)) {
      std::memcpy(g_tempSlots[i].path, path.c_str(), path.size() + 1);
      g_tempSlots[i].state.store(2);
      return i;
    }
  }
  return -1;
}

void UnregisterTemp(int& slot) {
  if (slot >= 0) g_tempSlots[slot].state.store(0);
  slot = -1;
}

// Temporary files are named ".zv-<hash of the file name>-<pid>-<n>.tmp":
// short whatever the length of the file name, and recognisable as those of
// one output file and one process.
std::string TempPrefix(const std::string& fileName) {
  return ".zv-" + StableHashHex(fileName) + "-";
}

// Seconds since the epoch at which process pid started; 0 when unknown.
double ProcessStartTime(long pid) {
  static const double bootTime = [] {
    std::ifstream stat("/proc/stat");
    std::string key;
    double value = 0;
    while (stat >> key)
      if (key == "btime" && stat >> value) return value;
    return 0.0;
  }();
  char statPath[64];
  std::snprintf(statPath, sizeof statPath, "/proc/%ld/stat", pid);
  std::ifstream in(statPath);
  std::string text((std::istreambuf_iterator<char>(in)), std::istreambuf_iterator<char>());
  size_t close = text.rfind(')');
  if (bootTime == 0 || close == std::string::npos) return 0;
  // Field 22, the start time in clock ticks after boot; the text after the
  // command name begins with field 3.
  std::istringstream fields(text.substr(close + 1));
  std::string field;
  for (int i = 3; i < 22 && fields >> field; ++i) {
  }
  double ticks = 0;
  if (!(fields >> ticks)) return 0;
  return bootTime + ticks / static_cast<double>(::sysconf(_SC_CLK_TCK));
}

// A temporary file is stale when its process is gone, or when the process
// with that number started after the file was last written (a reused pid).
bool IsStaleTemp(const std::string& path, long pid) {
  if (::kill(static_cast<pid_t>(pid), 0) != 0 && errno == ESRCH) return true;
  struct stat st {};
  if (::lstat(path.c_str(), &st) != 0) return false;
  double started = ProcessStartTime(pid);
  return started > 0 && static_cast<double>(st.st_mtime) + 2 < started;
}

void RemoveStaleTemps(const fs::path& folder, const std::string& prefix) {
  const std::string dirName = folder.empty() ? "." : folder.string();
  DIR* dir = ::opendir(dirName.c_str());
  if (!dir) return;
  while (const dirent* entry = ::readdir(dir)) {
    std::string_view name = entry->d_name;
    if (!name.starts_with(prefix) || !name.ends_with(".tmp")) continue;
    long pid = 0;
    unsigned n = 0;
    char end = 0;
    const std::string rest(name.substr(prefix.size()));
    if (std::sscanf(rest.c_str(), "%ld-%u.tm%c", &pid, &n, &end) != 3 || pid <= 0) continue;
    std::string path = dirName;
    path += '/';
    path += name;
    if (IsStaleTemp(path, pid)) ::unlink(path.c_str());
  }
  ::closedir(dir);
}

}  // namespace

TextFileWriter::TextFileWriter(std::string path) : path_(std::move(path)) {}

TextFileWriter::~TextFileWriter() {
  if (file_) {
    std::fclose(file_);
    std::remove(tempPath_.c_str());
    UnregisterTemp(slot_);
  }
}

bool TextFileWriter::open() {
  if (IsNonRegularFile(path_)) {
    error_ = kNotRegularFile;
    return false;
  }
  InstallCleanupHandlers();
  const fs::path target(path_);
  const fs::path folder = target.parent_path();
  const std::string prefix = TempPrefix(target.filename().string());
  RemoveStaleTemps(folder, prefix);
  static std::atomic<unsigned> counter{0};
  for (int attempt = 0; attempt < 5 && !file_; ++attempt) {
    std::string name = prefix;
    name += std::to_string(getpid());
    name += '-';
    name += std::to_string(counter++);
    name += ".tmp";
    std::error_code ec;
    fs::path temp = fs::absolute(folder / name, ec);
    tempPath_ = ec ? (folder / name).string() : temp.string();
    file_ = std::fopen(tempPath_.c_str(), "wbx");
    if (!file_ && errno != EEXIST) break;
  }
  if (!file_) {
    error_ = std::strerror(errno);
    return false;
  }
  slot_ = RegisterTemp(tempPath_);
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
  // Something put at the path while the file was written is not replaced.
  if (ok && IsNonRegularFile(path_)) {
    ok = false;
    error_ = kNotRegularFile;
  }
  if (ok) {
    // Keep the permissions of a file that is replaced.
    std::error_code ec;
    auto perms = fs::status(path_, ec).permissions();
    if (!ec) fs::permissions(tempPath_, perms, ec);
    if (std::rename(tempPath_.c_str(), path_.c_str()) != 0) {
      ok = false;
      error_ = std::strerror(errno);
    }
  }
  if (!ok) std::remove(tempPath_.c_str());
  UnregisterTemp(slot_);
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

void StopOnSignals() {
  InstallCleanupHandlers();
  int expected = 0;
  g_stopState.compare_exchange_strong(expected, 1);
}

bool StopRequested() {
  return g_stopState.load() == 2;
}

}  // namespace zv
