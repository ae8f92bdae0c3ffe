#pragma once
// The per-user settings store on QSettings: an INI file in the user's
// configuration folder (XDG_CONFIG_HOME), never in the application folder.

#include "platform/Settings.h"

namespace zv {

class QtSettings : public SettingsStore {
 public:
  std::string get(const std::string& section, const std::string& key,
                  const std::string& defaultValue) const override;
  void save(const std::string& section, const std::string& key, const std::string& value) override;
};

}  // namespace zv
