#pragma once
// The file-type table: each type name with its reader, its writer in a plain
// conversion and its writer after a reprojection. Both dispatchers and the
// Translate window use this one table.

#include <span>
#include <string>
#include <string_view>

namespace zv {

struct AppContext;

using FileReader = bool (*)(AppContext&, const std::string& path);
using FileWriter = bool (*)(AppContext&, const std::string& path);

struct FileType {
  std::string_view name;
  FileReader reader;           // fills the input side; null when none
  FileWriter writer;           // writes the output side in "ConvertFile"; null when none
  FileWriter reprojectWriter;  // writes a reprojected file; null when none
};

inline constexpr std::string_view kUserDefinedType = "User-Defined ASCII Files (*.*)";

std::span<const FileType> FileTypes();
const FileType* FindFileType(std::string_view name);

// The filter pattern of a type name: the text between "(" and ")".
std::string TypePattern(std::string_view name);

}  // namespace zv
