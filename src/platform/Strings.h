#pragma once
// Small text helpers shared by every layer: trimming and letter case.

#include <string>
#include <string_view>

namespace zv {

// The text without leading and trailing blanks and tabs.
std::string_view Trim(std::string_view s);

// ASCII letter case; other bytes are kept as they are.
std::string ToLower(std::string_view s);
std::string ToUpper(std::string_view s);
bool EqualsNoCase(std::string_view a, std::string_view b);

// A name derived from the text that stays the same from run to run: its
// 64-bit FNV-1a hash as 16 lower-case hex digits.
std::string StableHashHex(std::string_view s);

}  // namespace zv
