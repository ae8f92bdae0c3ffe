#include "platform/CompactText.h"

#include <cstdlib>
#include <new>
#include <stdexcept>

namespace zv {

namespace {

// memmove that takes the null data of an empty view.
void Move(char* to, std::string_view from) {
  if (!from.empty()) std::memmove(to, from.data(), from.size());
}

}  // namespace

CompactText::Block* CompactText::NewBlock(size_t capacity) {
  if (capacity > UINT32_MAX) throw std::length_error("text field too long");
  void* memory = std::malloc(sizeof(Block) + capacity);
  if (!memory) throw std::bad_alloc();
  Block* b = new (memory) Block;
  b->refs.store(1, std::memory_order_relaxed);
  b->size = 0;
  b->capacity = static_cast<std::uint32_t>(capacity);
  return b;
}

void CompactText::Release(Block* b) noexcept {
  if (b->refs.fetch_sub(1, std::memory_order_acq_rel) == 1) {
    b->~Block();
    std::free(b);
  }
}

void CompactText::set(std::string_view s) {
  if (s.size() <= kInline) {
    setInline(s);
    return;
  }
  Block* b = NewBlock(s.size());
  std::memcpy(b->chars(), s.data(), s.size());
  b->size = static_cast<std::uint32_t>(s.size());
  word_ = reinterpret_cast<uintptr_t>(b);
}

CompactText& CompactText::assign(std::string_view s) {
  // s may lie in this text: it is copied before the old value goes.
  CompactText fresh(s);
  return *this = std::move(fresh);
}

CompactText& CompactText::append(std::string_view a, std::string_view b) {
  std::string_view now = view();
  size_t size = now.size() + a.size() + b.size();
  if (size == now.size()) return *this;
  if (size <= kInline) {
    char joined[kInline];
    Move(joined, now);
    Move(joined + now.size(), a);
    Move(joined + now.size() + a.size(), b);
    setInline(std::string_view(joined, size));
    return *this;
  }
  // A text filled once gets a block of its size; one that grows, room to grow.
  Block* grown = nullptr;
  if (!isInline() && word_ != 0) {
    Block* old = block();
    if (old->refs.load(std::memory_order_acquire) == 1 && size <= old->capacity) grown = old;
  }
  if (!grown) grown = NewBlock(now.empty() ? size : size + size / 2);
  // a or b may lie in the old block, before its end: nothing is overwritten
  // before it is copied.
  char* out = grown->chars();
  if (grown != block()) Move(out, now);
  Move(out + now.size(), a);
  Move(out + now.size() + a.size(), b);
  grown->size = static_cast<std::uint32_t>(size);
  if (grown != block()) {
    release();
    word_ = reinterpret_cast<uintptr_t>(grown);
  }
  return *this;
}

void AppendLine(CompactText& field, std::string_view line) {
  if (field.empty()) {
    field.assign(line);
  } else {
    field.append("\r\n", line);
  }
}

}  // namespace zv
