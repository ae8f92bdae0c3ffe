#include "app/Catalogue.h"

#include <algorithm>
#include <cctype>
#include <filesystem>

#include "platform/Strings.h"
#include "platform/TextIo.h"

namespace zv {

bool HasSeparator(const std::string& path) {
  return path.find('/') != std::string::npos || path.find('\\') != std::string::npos;
}

bool ReadDefinitionFile(const std::string& path, TranslationDefinition& def) {
  std::vector<std::string> lines;
  if (!ReadTextLines(path, lines) || lines.size() < 4) return false;
  def.Program = lines[0];
  def.Action = lines[1];
  def.Input = lines[2];
  def.Output = lines[3];
  def.ConfigFile = lines.size() > 4 ? lines[4] : std::string();
  def.DefinitionPath = path;
  return true;
}

std::string TypeExtension(const std::string& typeName) {
  size_t open = typeName.find('(');
  if (open == std::string::npos || open + 2 >= typeName.size()) return {};
  return typeName.substr(open + 2, 4);
}

bool Catalogue::load(const std::string& appFolder) {
  defs_.clear();
  current_ = 0;
  namespace fs = std::filesystem;
  std::error_code ec;
  std::vector<fs::path> files;
  for (fs::directory_iterator it(fs::path(appFolder) / "UTIFiles", ec), end; !ec && it != end;
       it.increment(ec)) {
    const fs::path& p = it->path();
    if (EqualsNoCase(p.extension().string(), ".uti") && it->is_regular_file(ec)) files.push_back(p);
  }
  std::sort(files.begin(), files.end(), [&](const fs::path& a, const fs::path& b) {
    return ToLower(a.filename().string()) < ToLower(b.filename().string());
  });
  for (const auto& file : files) {
    TranslationDefinition def;
    if (!ReadDefinitionFile(file.string(), def)) continue;
    if (!def.ConfigFile.empty() && !HasSeparator(def.ConfigFile)) {
      def.ConfigFile = appFolder + "/TRNFiles/" + def.ConfigFile;
    }
    defs_.push_back(std::move(def));
  }
  return !defs_.empty();
}

std::string Catalogue::query(const std::string& keyword, const std::string& input,
                             const std::string& output, const std::string& action) {
  std::string result;
  if (keyword == "Input") {
    for (const auto& d : defs_) result += d.Input + "|";
  } else if (keyword == "Output") {
    for (const auto& d : defs_)
      if (d.Input == input) result += d.Output + "|";
  } else if (keyword == "Action") {
    for (const auto& d : defs_)
      if (d.Input == input && d.Output == output) result += d.Action + "|";
  } else if (keyword == "ConfigFile" || keyword == "Program") {
    for (size_t i = 0; i < defs_.size(); ++i) {
      const auto& d = defs_[i];
      if (d.Input != input || d.Output != output || d.Action != action) continue;
      if (keyword == "ConfigFile") {
        result = d.ConfigFile;
      } else {
        result = d.Program;
        current_ = static_cast<int>(i);
      }
    }
  }
  return result;
}

const TranslationDefinition* Catalogue::current() const {
  if (current_ < 0 || static_cast<size_t>(current_) >= defs_.size()) return nullptr;
  return &defs_[static_cast<size_t>(current_)];
}

std::string Catalogue::readLastUsed(const std::string& appFolder) {
  std::vector<std::string> lines;
  if (!ReadTextLines(appFolder + "/Quorvane.cfg", lines) || lines.empty()) return {};
  for (size_t i = 0; i < defs_.size(); ++i) {
    if (defs_[i].DefinitionPath == lines[0]) {
      current_ = static_cast<int>(i);
      return defs_[i].Input + "|" + defs_[i].Output + "|" + defs_[i].Action;
    }
  }
  return {};
}

bool Catalogue::writeLastUsed(const std::string& appFolder) const {
  const TranslationDefinition* def = current();
  return WriteTextLines(appFolder + "/Quorvane.cfg", {def ? def->DefinitionPath : std::string()});
}

bool Catalogue::updateDefaultConfiguration(const std::string& path) {
  if (current_ < 0 || static_cast<size_t>(current_) >= defs_.size()) return false;
  auto& def = defs_[static_cast<size_t>(current_)];
  def.ConfigFile = path;
  return WriteTextLines(def.DefinitionPath,
                        {def.Program, def.Action, def.Input, def.Output, def.ConfigFile});
}

std::string DefaultPath(const std::string& folder, const std::string& stem,
                        const std::string& typeName) {
  const std::string name = stem + TypeExtension(typeName);
  if (FileExists(folder + name)) return folder + name;
  // The stem as given; the extension in any letter case (JOB7.ctl).
  namespace fs = std::filesystem;
  std::error_code ec;
  for (fs::directory_iterator it(folder.empty() ? "." : folder, ec), end; !ec && it != end;
       it.increment(ec)) {
    const std::string found = it->path().filename().string();
    if (found.size() == name.size() && found.compare(0, stem.size(), stem) == 0 &&
        EqualsNoCase(found.substr(stem.size()), name.substr(stem.size())) &&
        it->is_regular_file(ec))
      return folder + found;
  }
  return folder;
}

}  // namespace zv
