#pragma once
// A text field of eight bytes for records held by the million: up to seven
// bytes are stored in place; a longer text lives in a shared, reference
// counted block that a copy shares and a change to a shared copy
// duplicates. It reads like a const std::string and converts to
// std::string_view and std::string.

#include <atomic>
#include <bit>
#include <cstdint>
#include <cstring>
#include <ostream>
#include <string>
#include <string_view>

namespace zv {

static_assert(std::endian::native == std::endian::little, "CompactText keeps its tag in byte 0");

class CompactText {
 public:
  static constexpr size_t npos = std::string_view::npos;
  static constexpr size_t kInline = 7;

  // Implicit, so that the fields take texts as std::string fields do.
  CompactText() noexcept = default;
  CompactText(std::string_view s) { set(s); }
  CompactText(const char* s) { set(s); }
  CompactText(const std::string& s) { set(s); }
  CompactText(const CompactText& o) noexcept : word_(o.word_) { retain(); }
  CompactText(CompactText&& o) noexcept : word_(o.word_) { o.word_ = 0; }
  ~CompactText() { release(); }

  CompactText& operator=(const CompactText& o) noexcept {
    if (word_ != o.word_) {
      o.retain();
      release();
      word_ = o.word_;
    }
    return *this;
  }
  CompactText& operator=(CompactText&& o) noexcept {
    if (this != &o) {
      release();
      word_ = o.word_;
      o.word_ = 0;
    }
    return *this;
  }
  CompactText& operator=(std::string_view s) { return assign(s); }
  CompactText& operator=(const char* s) { return assign(s); }
  CompactText& operator=(const std::string& s) { return assign(s); }
  CompactText& assign(std::string_view s);

  // Reading, as std::string.
  std::string_view view() const noexcept {
    if (isInline()) return {bytes() + 1, static_cast<size_t>((word_ >> 1) & 7)};
    if (word_ == 0) return {};
    const Block* b = block();
    return {b->chars(), b->size};
  }
  operator std::string_view() const noexcept { return view(); }
  // Beware: binding a const std::string& to a field makes a temporary copy.
  operator std::string() const { return std::string(view()); }
  std::string str() const { return std::string(view()); }
  const char* data() const noexcept { return view().data(); }
  size_t size() const noexcept { return view().size(); }
  size_t length() const noexcept { return size(); }
  bool empty() const noexcept { return word_ == 0; }
  char operator[](size_t i) const noexcept { return view()[i]; }
  char front() const noexcept { return view().front(); }
  char back() const noexcept { return view().back(); }
  const char* begin() const noexcept { return view().data(); }
  const char* end() const noexcept {
    std::string_view v = view();
    return v.data() + v.size();
  }
  std::string substr(size_t pos, size_t n = npos) const {
    return std::string(view().substr(pos, n));
  }
  size_t find(std::string_view s, size_t pos = 0) const noexcept { return view().find(s, pos); }
  size_t find(char c, size_t pos = 0) const noexcept { return view().find(c, pos); }
  size_t rfind(std::string_view s, size_t pos = npos) const noexcept {
    return view().rfind(s, pos);
  }
  size_t rfind(char c, size_t pos = npos) const noexcept { return view().rfind(c, pos); }
  bool starts_with(std::string_view s) const noexcept { return view().starts_with(s); }
  bool ends_with(std::string_view s) const noexcept { return view().ends_with(s); }
  int compare(std::string_view s) const noexcept { return view().compare(s); }

  // Changing.
  void clear() noexcept {
    release();
    word_ = 0;
  }
  CompactText& append(std::string_view s) { return append(s, {}); }
  // Appends a, then b, in one step.
  CompactText& append(std::string_view a, std::string_view b);
  CompactText& operator+=(std::string_view s) { return append(s); }
  CompactText& operator+=(const char* s) { return append(s); }
  CompactText& operator+=(const std::string& s) { return append(s); }
  CompactText& operator+=(const CompactText& s) { return append(s.view()); }
  CompactText& operator+=(char c) { return append(std::string_view(&c, 1)); }
  void push_back(char c) { append(std::string_view(&c, 1)); }

  friend bool operator==(const CompactText& a, const CompactText& b) noexcept {
    return a.word_ == b.word_ || a.view() == b.view();
  }
  friend bool operator==(const CompactText& a, std::string_view b) noexcept {
    return a.view() == b;
  }
  friend bool operator==(const CompactText& a, const char* b) noexcept { return a.view() == b; }
  friend bool operator==(const CompactText& a, const std::string& b) noexcept {
    return a.view() == b;
  }
  friend auto operator<=>(const CompactText& a, const CompactText& b) noexcept {
    return a.view() <=> b.view();
  }
  friend auto operator<=>(const CompactText& a, std::string_view b) noexcept {
    return a.view() <=> b;
  }
  friend auto operator<=>(const CompactText& a, const char* b) noexcept {
    return a.view() <=> std::string_view(b);
  }
  friend auto operator<=>(const CompactText& a, const std::string& b) noexcept {
    return a.view() <=> std::string_view(b);
  }

  friend std::string operator+(const CompactText& a, const CompactText& b) {
    return Join(a.view(), b.view());
  }
  friend std::string operator+(const CompactText& a, std::string_view b) {
    return Join(a.view(), b);
  }
  friend std::string operator+(std::string_view a, const CompactText& b) {
    return Join(a, b.view());
  }
  friend std::string operator+(const CompactText& a, const char* b) { return Join(a.view(), b); }
  friend std::string operator+(const char* a, const CompactText& b) { return Join(a, b.view()); }
  friend std::string operator+(const CompactText& a, const std::string& b) {
    return Join(a.view(), b);
  }
  friend std::string operator+(const std::string& a, const CompactText& b) {
    return Join(a, b.view());
  }
  friend std::string operator+(std::string&& a, const CompactText& b) {
    a.append(b.view());
    return std::move(a);
  }
  friend std::string operator+(const CompactText& a, char b) {
    return Join(a.view(), std::string_view(&b, 1));
  }
  friend std::string operator+(char a, const CompactText& b) {
    return Join(std::string_view(&a, 1), b.view());
  }

  friend std::ostream& operator<<(std::ostream& out, const CompactText& t) {
    return out << t.view();
  }

 private:
  // A long text: its header, then its bytes.
  struct Block {
    std::atomic<std::uint32_t> refs;
    std::uint32_t size;
    std::uint32_t capacity;
    char* chars() { return reinterpret_cast<char*>(this + 1); }
    const char* chars() const { return reinterpret_cast<const char*>(this + 1); }
  };
  static std::string Join(std::string_view a, std::string_view b) {
    std::string s;
    s.reserve(a.size() + b.size());
    s.append(a);
    s.append(b);
    return s;
  }
  static Block* NewBlock(size_t capacity);

  bool isInline() const noexcept { return word_ & 1; }
  const char* bytes() const noexcept { return reinterpret_cast<const char*>(&word_); }
  Block* block() const noexcept { return reinterpret_cast<Block*>(static_cast<uintptr_t>(word_)); }
  void retain() const noexcept {
    if (word_ != 0 && !isInline()) block()->refs.fetch_add(1, std::memory_order_relaxed);
  }
  void release() noexcept {
    if (word_ != 0 && !isInline()) Release(block());
  }
  static void Release(Block* b) noexcept;
  void setInline(std::string_view s) noexcept {
    if (s.empty()) {
      word_ = 0;
      return;
    }
    std::uint64_t w = (s.size() << 1) | 1;
    std::memcpy(reinterpret_cast<char*>(&w) + 1, s.data(), s.size());
    word_ = w;
  }
  // Stores s into a text that holds nothing.
  void set(std::string_view s);

  std::uint64_t word_ = 0;  // 0: empty; bit 0 set: in place (length in bits 1-3); else a Block*
};

// Appends a line to a CR LF-joined text field.
void AppendLine(CompactText& field, std::string_view line);

}  // namespace zv
