#pragma once
// The list and record views of a VORN tagged file. The list view is the file
// itself, one "TG:value" item per line; the record view packs the items of a
// record onto lines shorter than 80 characters, separated by two blanks, with
// continuation lines indented by 7 blanks.

#include <string>
#include <vector>

#include "platform/Progress.h"

namespace zv {

std::vector<std::string> ListToRecord(const std::vector<std::string>& listLines);
std::vector<std::string> RecordToList(const std::vector<std::string>& recordLines);

// File forms: read one file and write the other (temporary file and rename).
// False with `error` set when a file cannot be read or written. Reading
// reports to `progress`, which may stop it (RunCancelled; nothing written).
bool ConvertListToRecord(const std::string& listPath, const std::string& recordPath,
                         std::string& error, RunProgress* progress = nullptr);
bool ConvertRecordToList(const std::string& recordPath, const std::string& listPath,
                         std::string& error, RunProgress* progress = nullptr);

// The stem N of an editor file (its name without a trailing ".lst"); the
// list file is N + ".lst" and the record file N + ".rec".
std::string ListingStem(const std::string& fileName);

}  // namespace zv
