#include "platform/Profile.h"

#include <algorithm>
#include <cctype>
#include <optional>

#include "platform/TextIo.h"

namespace zv {

namespace {

std::string Trim(const std::string& s) {
  size_t b = s.find_first_not_of(" \t");
  if (b == std::string::npos) return {};
  size_t e = s.find_last_not_of(" \t");
  return s.substr(b, e - b + 1);
}

bool SameName(const std::string& a, const std::string& b) {
  return a.size() == b.size() &&
         std::equal(a.begin(), a.end(), b.begin(), [](unsigned char x, unsigned char y) {
           return std::tolower(x) == std::tolower(y);
         });
}

// The section name of a "[name]" line.
std::optional<std::string> SectionName(const std::string& line) {
  std::string t = Trim(line);
  if (t.size() < 2 || t.front() != '[') return std::nullopt;
  size_t close = t.find(']');
  if (close == std::string::npos) return std::nullopt;
  return Trim(t.substr(1, close - 1));
}

// The key of a "key=value" line.
std::optional<std::string> KeyName(const std::string& line) {
  size_t eq = line.find('=');
  if (eq == std::string::npos) return std::nullopt;
  return Trim(line.substr(0, eq));
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
    if (SameName(*name, section)) loc.sectionLine = i;
  }
  loc.sectionEnd = loc.lines.size();
  return loc;
}

}  // namespace

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
  Located loc = Locate(path, section);
  if (!loc.sectionLine) return defaultValue;
  for (size_t i = *loc.sectionLine + 1; i < loc.sectionEnd; ++i) {
    auto name = KeyName(loc.lines[i]);
    if (!name || !SameName(*name, key)) continue;
    std::string value = Trim(loc.lines[i].substr(loc.lines[i].find('=') + 1));
    if (value.empty()) return defaultValue;
    if (value.size() > kProfileValueLimit) value.resize(kProfileValueLimit);
    return value;
  }
  return defaultValue;
}

bool WriteProfileValue(const std::string& path, const std::string& section,
                       const std::string& key, const std::string& value) {
  Located loc = Locate(path, section);
  std::string newLine = key + "=" + value;
  if (!loc.sectionLine) {
    if (!loc.lines.empty() && !Trim(loc.lines.back()).empty()) loc.lines.emplace_back();
    loc.lines.push_back("[" + section + "]");
    loc.lines.push_back(newLine);
    return WriteTextLines(path, loc.lines);
  }
  size_t insertAt = *loc.sectionLine + 1;
  for (size_t i = *loc.sectionLine + 1; i < loc.sectionEnd; ++i) {
    auto name = KeyName(loc.lines[i]);
    if (name && SameName(*name, key)) {
      loc.lines[i] = newLine;
      return WriteTextLines(path, loc.lines);
    }
    if (!Trim(loc.lines[i]).empty()) insertAt = i + 1;
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
