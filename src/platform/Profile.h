#pragma once
// Profile (INI) files: sections of key=value lines. Section and key names
// compare without regard to letter case; values are kept exactly. Every call
// reads the file afresh (once); a write changes the lines it must, keeps every
// other byte and goes through a temporary file (see ProfileDocument).

#include <string>
#include <string_view>
#include <vector>

#include "platform/ProfileDocument.h"

namespace zv {

// One read of a profile file for the many lookups of a single operation,
// with the rules of ReadProfileValue.
class ProfileSnapshot {
 public:
  explicit ProfileSnapshot(const std::string& path) : doc_(ProfileDocument::Load(path)) {}
  bool has(std::string_view section) const { return doc_.has(section); }
  // The value (at most 25000 characters), or the default when the key is
  // missing or its value is empty.
  std::string value(std::string_view section, std::string_view key,
                    const std::string& defaultValue) const {
    return doc_.value(section, key, defaultValue);
  }

 private:
  ProfileDocument doc_;
};

// The section names in file order (as the 30000-character NUL-separated
// buffer holds them). A missing file has no sections.
std::vector<std::string> ReadProfileSections(const std::string& path);
// The same list as one NUL-separated text.
std::string ReadProfileSectionsText(const std::string& path);

// The value (at most 25000 characters), or the default when the key is
// missing or its value is empty.
std::string ReadProfileValue(const std::string& path, const std::string& section,
                             const std::string& key, const std::string& defaultValue);

// Replaces the value in place, or appends the key to its section, or appends
// the section at the end of the file. False when the file cannot be written.
bool WriteProfileValue(const std::string& path, const std::string& section, const std::string& key,
                       const std::string& value);

// Removes a whole section with its keys. True also when there was none.
bool DeleteProfileSection(const std::string& path, const std::string& section);

}  // namespace zv
