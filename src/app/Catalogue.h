#pragma once
// Translation definitions (UTIFiles/*.uti), the catalogue the Translate
// window queries, and the last-used file Quorvane.cfg.

#include <string>
#include <vector>

namespace zv {

struct TranslationDefinition {
  std::string Program;
  std::string Action;
  std::string Input;
  std::string Output;
  std::string ConfigFile;
  std::string DefinitionPath;
};

// Reads a definition file as written (ConfigFile taken as it stands).
// False when the file cannot be read or has fewer than four lines.
bool ReadDefinitionFile(const std::string& path, TranslationDefinition& def);

// True when a stored path names a folder (holds "/" or "\").
bool HasSeparator(const std::string& path);

// The ".EXT" part of a type name such as "VORN Project Files (*.PRJ)".
std::string TypeExtension(const std::string& typeName);

class Catalogue {
 public:
  // Loads every UTIFiles/*.uti of the application folder, in file-name
  // order; files with fewer than four lines are skipped. True when at least
  // one definition was loaded.
  bool load(const std::string& appFolder);

  // Keywords "Input", "Output", "Action", "ConfigFile", "Program".
  std::string query(const std::string& keyword, const std::string& input = "",
                    const std::string& output = "", const std::string& action = "");

  // Makes the definition named in Quorvane.cfg current; returns
  // Input|Output|Action, or "" when there is none.
  std::string readLastUsed(const std::string& appFolder);
  bool writeLastUsed(const std::string& appFolder) const;

  // Stores a new default configuration file in the current definition and
  // rewrites its file with five lines.
  bool updateDefaultConfiguration(const std::string& path);

  const std::vector<TranslationDefinition>& definitions() const { return defs_; }
  int currentIndex() const { return current_; }
  const TranslationDefinition* current() const;

 private:
  std::vector<TranslationDefinition> defs_;
  int current_ = 0;
};

// The path proposed for a type: folder + stem + extension when that file
// exists, else the folder alone.
std::string DefaultPath(const std::string& folder, const std::string& stem,
                        const std::string& typeName);

}  // namespace zv
