#pragma once
// A profile (INI) file held as its lines for the reads and edits of one
// operation: read once, changed section by section, written once through a
// temporary file renamed into place. Lines an edit does not touch keep their
// bytes, line ends included; lines it adds take the file's first line end
// (CR LF in a file that has none). Section and key names compare without
// regard to letter case; the first section (and key) of a name wins.

#include <cstddef>
#include <string>
#include <string_view>
#include <unordered_map>
#include <utility>
#include <vector>

namespace zv {

inline constexpr size_t kProfileValueLimit = 25000;
inline constexpr size_t kProfileSectionsLimit = 30000;

// A name that reads back as the same section: not empty, no "]", no line
// break, no blanks at either end.
bool IsValidSectionName(std::string_view name);

// Key and value pairs in the order they are written.
using ProfileKeys = std::vector<std::pair<std::string, std::string>>;

class ProfileDocument {
 public:
  ProfileDocument() = default;
  // Lines end in CR LF, LF or CR alone; a leading UTF-8 byte-order mark is
  // kept but is not part of the first line.
  explicit ProfileDocument(std::string_view text);
  // The file's content; a missing or unreadable file is an empty document.
  static ProfileDocument Load(const std::string& path);

  // The section names in file order, as many as the 30000-character
  // NUL-separated list holds.
  std::vector<std::string> sectionNames() const;
  bool has(std::string_view section) const;
  // The name as the file spells it; empty when there is no such section.
  std::string spelling(std::string_view section) const;
  // The value (at most 25000 characters, blanks around it trimmed), or the
  // default when the key is missing or its value is empty.
  std::string value(std::string_view section, std::string_view key,
                    const std::string& defaultValue) const;
  // Every key of the section with its value (trimmed, not cut), in file
  // order; repeated keys appear as often as they are written.
  ProfileKeys keys(std::string_view section) const;

  // Replaces the value in place, or adds the key after the last non-blank
  // line of its section, or appends the section at the end of the file.
  void setValue(std::string_view section, std::string_view key, std::string_view value);
  // Writes one record into its section: every line of a `managed` key is
  // replaced by `keys`, in their order, at the place of the first managed key
  // (or after the section's last key). A key whose value is unchanged keeps
  // its line as it was; comments, blank lines and other keys stay. A missing
  // section is appended at the end of the file.
  void writeSection(std::string_view section, const ProfileKeys& keys,
                    const std::vector<std::string>& managed);
  // Removes the section with its lines up to the next section; comment
  // lines right above the next section stay with it. False when none.
  bool removeSection(std::string_view section);
  // Renames the section in its place. False when `from` is missing, or `to`
  // names another section or is not a valid section name.
  bool renameSection(std::string_view from, std::string_view to);

  std::string text() const;
  // Writes the whole document once, through a temporary file in the same
  // folder renamed over the old one.
  bool save(const std::string& path, std::string* error = nullptr) const;

 private:
  enum class Kind { Other, Section, Key };
  struct Line {
    std::string text;
    std::string eol;  // "\r\n", "\n", "\r", or "" on an unterminated last line
    Kind kind = Kind::Other;
    std::string name;    // section or key name, trimmed
    size_t valueAt = 0;  // where a key's value starts in text
  };
  struct Section {
    std::string name;
    size_t header;  // index of the "[name]" line
    size_t end;     // one past its last line
  };

  static Line MakeLine(std::string text, std::string eol);
  static std::string_view ValueOf(const Line& line);
  void index();
  const Section* find(std::string_view section) const;
  void appendSection(std::string_view section, const ProfileKeys& keys);

  std::string bom_;
  std::vector<Line> lines_;
  std::vector<Section> sections_;
  std::unordered_map<std::string, size_t> first_;  // lower-case name -> sections_ index
  std::string eol_ = "\r\n";
};

}  // namespace zv
