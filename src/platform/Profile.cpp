#include "platform/Profile.h"

namespace zv {

std::vector<std::string> ReadProfileSections(const std::string& path) {
  return ProfileDocument::Load(path).sectionNames();
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
  return ProfileDocument::Load(path).value(section, key, defaultValue);
}

bool WriteProfileValue(const std::string& path, const std::string& section, const std::string& key,
                       const std::string& value) {
  ProfileDocument doc = ProfileDocument::Load(path);
  doc.setValue(section, key, value);
  return doc.save(path);
}

bool DeleteProfileSection(const std::string& path, const std::string& section) {
  ProfileDocument doc = ProfileDocument::Load(path);
  if (!doc.removeSection(section)) return true;
  return doc.save(path);
}

}  // namespace zv
