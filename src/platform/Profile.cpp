#include "platform/Profile.h"

#include <algorithm>
#include <cctype>
#include <optional>

#include "platform/Strings.h"
#include "platform/TextIo.h"

namespace zv {

namespace {

std::string Trimmed(std::string_view s) {
  return std::string(Trim(s));
}

// The section name of a "[name]" line.
std::optional<std::string> SectionName(const std::string& line) {
  std::string t = Trimmed(line);
  if (t.size() < 2 || t.front() != '[') return std::nullopt;
  size_t close = t.find(']');
  if (close == std::string::npos) return std::nullopt;
  return Trimmed(t.substr(1, close - 1));
}

// The key of a "key=value" line.
std::optional<std::string> KeyName(const std::string& line) {
  size_t eq = line.find('=');
  if (eq == std::string::npos) return std::nullopt;
  return Trimmed(line.substr(0, eq));
}

struct Located {
  std::vector<std::string> lines;
  std::optional<size_t> sectionLine;  // the "[name]" line
  size_t sectionEnd = 0;              // one past its last line
};

Located Locate(const std::string& path, const std::string& section) {
  Located loc;
  ReadTextLines(path, loc.lines);
  for (size_t i = 0; i < loc.lines.size(); ++i) {
    auto name = SectionName(loc.lines[i]);
    if (!name) continue;
    if (loc.sectionLine) {
      loc.sectionEnd = i;
      return loc;
    }
    if (EqualsNoCase(*name, section)) loc.sectionLine = i;
  }
  loc.sectionEnd = loc.lines.size();
  return loc;
}

}  // namespace

ProfileSnapshot::ProfileSnapshot(const std::string& path) {
  std::vector<std::string> lines;
  ReadTextLines(path, lines);
  for (const std::string& line : lines) {
    if (auto name = SectionName(line)) {
      sections_.push_back({*name, {}});
    } else if (auto key = KeyName(line); key && !sections_.empty()) {
      sections_.back().keys.emplace_back(
          *key, Trimmed(std::string_view(line).substr(line.find('=') + 1)));
    }
  }
}

bool ProfileSnapshot::has(std::string_view section) const {
  return find(section) != nullptr;
}

std::string ProfileSnapshot::value(std::string_view section, std::string_view key,
                                   const std::string& defaultValue) const {
  const Section* s = find(section);
  if (!s) return defaultValue;
  for (const auto& [name, value] : s->keys) {
    if (!EqualsNoCase(name, key)) continue;
    if (value.empty()) return defaultValue;
    return value.substr(0, kProfileValueLimit);
  }
  return defaultValue;
}

const ProfileSnapshot::Section* ProfileSnapshot::find(std::string_view section) const {
  for (const Section& s : sections_) {
    if (EqualsNoCase(s.name, section)) return &s;
  }
  return nullptr;
}

std::vector<std::string> ReadProfileSections(const std::string& path) {
  std::vector<std::string> lines;
  std::vector<std::string> names;
  if (!ReadTextLines(path, lines)) return names;
  size_t used = 0;
  for (const auto& line : lines) {
    auto name = SectionName(line);
    if (!name) continue;
    // Each name and its NUL must fit in the buffer with the closing NUL.
    // A name cut by the end of the buffer would name no section: drop it.
    if (used + name->size() + 2 > kProfileSectionsLimit) break;
    used += name->size() + 1;
    names.push_back(*name);
  }
  return names;
}

std::string ReadProfileSectionsText(const std::string& path) {
  std::string text;
  for (const auto& name : ReadProfileSections(path)) {
    text += name;
    text += '\0';
  }
  return text;
}

std::string ReadProfileValue(const std::string& path, const std::string& section,
                             const std::string& key, const std::string& defaultValue) {
  return ProfileSnapshot(path).value(section, key, defaultValue);
}

bool WriteProfileValue(const std::string& path, const std::string& section, const std::string& key,
                       const std::string& value) {
  Located loc = Locate(path, section);
  std::string newLine = key + "=" + value;
  if (!loc.sectionLine) {
    if (!loc.lines.empty() && !Trimmed(loc.lines.back()).empty()) loc.lines.emplace_back();
    loc.lines.push_back("[" + section + "]");
    loc.lines.push_back(newLine);
    return WriteTextLines(path, loc.lines);
  }
  size_t insertAt = *loc.sectionLine + 1;
  for (size_t i = *loc.sectionLine + 1; i < loc.sectionEnd; ++i) {
    auto name = KeyName(loc.lines[i]);
    if (name && EqualsNoCase(*name, key)) {
      loc.lines[i] = newLine;
      return WriteTextLines(path, loc.lines);
    }
    if (!Trimmed(loc.lines[i]).empty()) insertAt = i + 1;
  }
  loc.lines.insert(loc.lines.begin() + static_cast<long>(insertAt), newLine);
  return WriteTextLines(path, loc.lines);
}

bool DeleteProfileSection(const std::string& path, const std::string& section) {
  Located loc = Locate(path, section);
  if (!loc.sectionLine) return true;
  loc.lines.erase(loc.lines.begin() + static_cast<long>(*loc.sectionLine),
                  loc.lines.begin() + static_cast<long>(loc.sectionEnd));
  return WriteTextLines(path, loc.lines);
}

}  // namespace zv
