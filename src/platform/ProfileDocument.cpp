#include "platform/ProfileDocument.h"

#include <algorithm>
#include <fstream>
#include <iterator>
#include <sstream>

#include "platform/Strings.h"
#include "platform/TextIo.h"

namespace zv {

namespace {

const std::string kUtf8Mark = "\xEF\xBB\xBF";

bool IsComment(std::string_view text) {
  std::string_view t = Trim(text);
  return !t.empty() && (t.front() == ';' || t.front() == '#');
}

// A line break inside a key or value would start a line of its own.
std::string OneLine(std::string_view text) {
  std::string out(text);
  std::replace(out.begin(), out.end(), '\r', ' ');
  std::replace(out.begin(), out.end(), '\n', ' ');
  return out;
}

std::string KeyLine(std::string_view key, std::string_view value) {
  std::string line = OneLine(key);
  line += '=';
  line += OneLine(value);
  return line;
}

std::string HeaderLine(std::string_view section) {
  std::string line(1, '[');
  line += OneLine(section);
  line += ']';
  return line;
}

}  // namespace

bool IsValidSectionName(std::string_view name) {
  if (name.empty()) return false;
  if (name.find_first_of("]\r\n") != std::string_view::npos) return false;
  auto blank = [](char c) { return c == ' ' || c == '\t'; };
  return !blank(name.front()) && !blank(name.back());
}

ProfileDocument::Line ProfileDocument::MakeLine(std::string text, std::string eol) {
  Line line;
  line.text = std::move(text);
  line.eol = std::move(eol);
  std::string_view t = Trim(line.text);
  if (t.size() >= 2 && t.front() == '[') {
    size_t close = t.find(']');
    if (close != std::string_view::npos) {
      line.kind = Kind::Section;
      line.name = std::string(Trim(t.substr(1, close - 1)));
      return line;
    }
  }
  size_t eq = line.text.find('=');
  if (eq != std::string::npos) {
    line.kind = Kind::Key;
    line.name = std::string(Trim(std::string_view(line.text).substr(0, eq)));
    line.valueAt = eq + 1;
  }
  return line;
}

std::string_view ProfileDocument::ValueOf(const Line& line) {
  return Trim(std::string_view(line.text).substr(line.valueAt));
}

ProfileDocument::ProfileDocument(std::string_view text) {
  if (text.starts_with(kUtf8Mark)) {
    bom_ = kUtf8Mark;
    text.remove_prefix(kUtf8Mark.size());
  }
  lines_.reserve(static_cast<size_t>(std::count(text.begin(), text.end(), '\n')) + 1);
  bool eolSeen = false;
  size_t pos = 0;
  while (pos < text.size()) {
    size_t end = pos;
    while (end < text.size() && text[end] != '\r' && text[end] != '\n') ++end;
    if (end == text.size()) {
      lines_.push_back(MakeLine(std::string(text.substr(pos)), ""));
      break;
    }
    size_t eolLength = text[end] == '\r' && end + 1 < text.size() && text[end + 1] == '\n' ? 2 : 1;
    std::string eol(text.substr(end, eolLength));
    if (!eolSeen) {
      eol_ = eol;
      eolSeen = true;
    }
    lines_.push_back(MakeLine(std::string(text.substr(pos, end - pos)), std::move(eol)));
    pos = end + eolLength;
  }
  index();
}

ProfileDocument ProfileDocument::Load(const std::string& path) {
  std::ifstream in(path, std::ios::binary);
  if (!in) return ProfileDocument();
  std::ostringstream text;
  text << in.rdbuf();
  return ProfileDocument(text.view());
}

void ProfileDocument::index() {
  sections_.clear();
  first_.clear();
  for (size_t i = 0; i < lines_.size(); ++i) {
    if (lines_[i].kind != Kind::Section) continue;
    if (!sections_.empty()) sections_.back().end = i;
    sections_.push_back({lines_[i].name, i, lines_.size()});
    first_.emplace(ToLower(lines_[i].name), sections_.size() - 1);
  }
}

const ProfileDocument::Section* ProfileDocument::find(std::string_view section) const {
  auto it = first_.find(ToLower(section));
  return it == first_.end() ? nullptr : &sections_[it->second];
}

std::vector<std::string> ProfileDocument::sectionNames() const {
  std::vector<std::string> names;
  size_t used = 0;
  for (const Section& s : sections_) {
    // Each name and its NUL must fit in the buffer with the closing NUL; a
    // name cut by the end of the buffer would name no section.
    if (used + s.name.size() + 2 > kProfileSectionsLimit) break;
    used += s.name.size() + 1;
    names.push_back(s.name);
  }
  return names;
}

bool ProfileDocument::has(std::string_view section) const {
  return find(section) != nullptr;
}

std::string ProfileDocument::spelling(std::string_view section) const {
  const Section* s = find(section);
  return s ? s->name : std::string();
}

std::string ProfileDocument::value(std::string_view section, std::string_view key,
                                   const std::string& defaultValue) const {
  const Section* s = find(section);
  if (!s) return defaultValue;
  for (size_t i = s->header + 1; i < s->end; ++i) {
    const Line& line = lines_[i];
    if (line.kind != Kind::Key || !EqualsNoCase(line.name, key)) continue;
    std::string_view v = ValueOf(line);
    if (v.empty()) return defaultValue;
    return std::string(v.substr(0, kProfileValueLimit));
  }
  return defaultValue;
}

ProfileKeys ProfileDocument::keys(std::string_view section) const {
  ProfileKeys out;
  const Section* s = find(section);
  if (!s) return out;
  for (size_t i = s->header + 1; i < s->end; ++i) {
    if (lines_[i].kind == Kind::Key) out.emplace_back(lines_[i].name, ValueOf(lines_[i]));
  }
  return out;
}

void ProfileDocument::appendSection(std::string_view section, const ProfileKeys& keys) {
  if (!lines_.empty() && !Trim(lines_.back().text).empty()) lines_.push_back(MakeLine("", eol_));
  lines_.push_back(MakeLine(HeaderLine(section), eol_));
  for (const auto& [key, value] : keys) lines_.push_back(MakeLine(KeyLine(key, value), eol_));
  index();
}

void ProfileDocument::setValue(std::string_view section, std::string_view key,
                               std::string_view value) {
  const Section* s = find(section);
  if (!s) {
    appendSection(section, {{std::string(key), std::string(value)}});
    return;
  }
  size_t insertAt = s->header + 1;
  for (size_t i = s->header + 1; i < s->end; ++i) {
    Line& line = lines_[i];
    if (line.kind == Kind::Key && EqualsNoCase(line.name, key)) {
      line = MakeLine(KeyLine(key, value), line.eol);
      index();
      return;
    }
    if (!Trim(line.text).empty()) insertAt = i + 1;
  }
  lines_.insert(lines_.begin() + static_cast<long>(insertAt), MakeLine(KeyLine(key, value), eol_));
  index();
}

void ProfileDocument::writeSection(std::string_view section, const ProfileKeys& keys,
                                   const std::vector<std::string>& managed) {
  const Section* s = find(section);
  if (!s) {
    appendSection(section, keys);
    return;
  }
  auto isManaged = [&](const std::string& name) {
    return std::any_of(managed.begin(), managed.end(),
                       [&](const std::string& m) { return EqualsNoCase(m, name); });
  };
  std::vector<Line> body, old;
  size_t at = std::string::npos, afterLastKey = 0;
  for (size_t i = s->header + 1; i < s->end; ++i) {
    Line& line = lines_[i];
    if (line.kind == Kind::Key && isManaged(line.name)) {
      if (at == std::string::npos) at = body.size();
      old.push_back(std::move(line));
      continue;
    }
    body.push_back(std::move(line));
    if (body.back().kind == Kind::Key) afterLastKey = body.size();
  }
  if (at == std::string::npos) at = afterLastKey;

  std::vector<Line> written;
  for (const auto& [key, value] : keys) {
    auto same = std::find_if(old.begin(), old.end(),
                             [&](const Line& l) { return EqualsNoCase(l.name, key); });
    if (same != old.end() && ValueOf(*same) == value) {
      written.push_back(*same);
    } else {
      written.push_back(MakeLine(KeyLine(key, value), eol_));
    }
  }
  body.insert(body.begin() + static_cast<long>(at), std::make_move_iterator(written.begin()),
              std::make_move_iterator(written.end()));
  const size_t first = s->header + 1;
  lines_.erase(lines_.begin() + static_cast<long>(first),
               lines_.begin() + static_cast<long>(s->end));
  lines_.insert(lines_.begin() + static_cast<long>(first), std::make_move_iterator(body.begin()),
                std::make_move_iterator(body.end()));
  index();
}

bool ProfileDocument::removeSection(std::string_view section) {
  const Section* s = find(section);
  if (!s) return false;
  size_t stop = s->end;
  if (stop < lines_.size()) {
    while (stop > s->header + 1 && lines_[stop - 1].kind == Kind::Other &&
           IsComment(lines_[stop - 1].text)) {
      --stop;
    }
  }
  lines_.erase(lines_.begin() + static_cast<long>(s->header),
               lines_.begin() + static_cast<long>(stop));
  index();
  return true;
}

bool ProfileDocument::renameSection(std::string_view from, std::string_view to) {
  const Section* s = find(from);
  if (!s || !IsValidSectionName(to)) return false;
  const Section* other = find(to);
  if (other && other != s) return false;
  Line& header = lines_[s->header];
  header = MakeLine(HeaderLine(to), header.eol);
  index();
  return true;
}

std::string ProfileDocument::text() const {
  std::string out = bom_;
  for (size_t i = 0; i < lines_.size(); ++i) {
    out += lines_[i].text;
    // A line that was the last one without a line end gets one when others follow.
    out += lines_[i].eol.empty() && i + 1 < lines_.size() ? eol_ : lines_[i].eol;
  }
  return out;
}

bool ProfileDocument::save(const std::string& path, std::string* error) const {
  TextFileWriter writer(path);
  bool ok = writer.open();
  if (ok) {
    writer.raw(text());
    ok = writer.commit();
  }
  if (!ok && error) *error = writer.error();
  return ok;
}

}  // namespace zv
