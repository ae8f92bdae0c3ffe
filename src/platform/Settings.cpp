#include "platform/Settings.h"

#include "platform/Profile.h"

namespace zv {

std::string MemorySettings::get(const std::string& section, const std::string& key,
                                const std::string& defaultValue) const {
  auto it = values_.find({section, key});
  return it == values_.end() ? defaultValue : it->second;
}

void MemorySettings::save(const std::string& section, const std::string& key,
                          const std::string& value) {
  values_[{section, key}] = value;
}

std::string ProfileSettings::get(const std::string& section, const std::string& key,
                                 const std::string& defaultValue) const {
  return ReadProfileValue(path_, section, key, defaultValue);
}

void ProfileSettings::save(const std::string& section, const std::string& key,
                           const std::string& value) {
  WriteProfileValue(path_, section, key, value);
}

}  // namespace zv
