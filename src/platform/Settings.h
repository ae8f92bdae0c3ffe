#pragma once
// The per-user settings store: the choices a dialog remembers between runs,
// by section and key. It is kept apart from the application folder (QSettings
// in the user's configuration folder on a desktop); tests use the in-memory
// store, and an unattended run can take its settings from a profile file.

#include <map>
#include <string>
#include <utility>

namespace zv {

class SettingsStore {
 public:
  virtual ~SettingsStore() = default;
  // The stored value, or the default when the key has none.
  virtual std::string get(const std::string& section, const std::string& key,
                          const std::string& defaultValue) const = 0;
  virtual void save(const std::string& section, const std::string& key,
                    const std::string& value) = 0;
};

// Kept for the life of the object only. Names compare exactly.
class MemorySettings : public SettingsStore {
 public:
  std::string get(const std::string& section, const std::string& key,
                  const std::string& defaultValue) const override;
  void save(const std::string& section, const std::string& key, const std::string& value) override;

 private:
  std::map<std::pair<std::string, std::string>, std::string> values_;
};

// The sections and keys of a profile (INI) file, read afresh on every get;
// names compare without regard to letter case. A save writes the file.
class ProfileSettings : public SettingsStore {
 public:
  explicit ProfileSettings(std::string path) : path_(std::move(path)) {}
  std::string get(const std::string& section, const std::string& key,
                  const std::string& defaultValue) const override;
  void save(const std::string& section, const std::string& key, const std::string& value) override;
  const std::string& path() const { return path_; }

 private:
  std::string path_;
};

}  // namespace zv
