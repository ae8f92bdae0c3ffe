#include "survey/Listing.h"

#include <string_view>

#include "platform/TextIo.h"

namespace zv {

namespace {

constexpr std::string_view kIndent = "       ";  // continuation lines
constexpr size_t kWrapAt = 80;                   // record lines stay below this
constexpr size_t kPointListWrapAt = 81;
constexpr size_t kPointListCutWithin = 79;
constexpr size_t kSplitAt = 78;  // point lists this long are split again
constexpr size_t kSplitWithin = 77;

struct Item {
  std::string_view tag;
  std::string_view value;
};

class RecordBuilder {
 public:
  explicit RecordBuilder(const std::vector<Item>& items) : items_(items) {}

  std::vector<std::string> build() {
    for (i_ = 0; i_ < items_.size(); ++i_) {
      const Item& item = items_[i_];
      if (item.tag == "AC") {
        emit();
        if (item.value == "OS" && !out_.empty()) out_.emplace_back();
        start("AC", item.value);
      } else if (item.tag == "BG") {
        emit();
        start("BG", item.value);
      } else if (item.tag == "EG") {
        emit();
        start("EG", item.value);
        emit();
      } else if (item.tag == "PL") {
        pointList();
      } else if (item.tag.size() + pending_.size() + item.value.size() + 3 >= kWrapAt) {
        emit();
        pending_ = kIndent;
        append(item.tag, item.value);
      } else {
        if (!pending_.empty()) pending_ += "  ";
        append(item.tag, item.value);
      }
    }
    emit();
    return std::move(out_);
  }

 private:
  // Writes the pending line; an empty one (at the start, after EG) is not
  // written.
  void emit() {
    if (!pending_.empty()) out_.push_back(std::move(pending_));
    pending_.clear();
  }
  void start(std::string_view tag, std::string_view value) {
    pending_.clear();
    append(tag, value);
  }
  void append(std::string_view tag, std::string_view value) {
    pending_ += tag;
    pending_ += ':';
    pending_ += value;
  }

  // A PL item: appended to the pending line; a line that grows too long
  // takes in the directly following PL items and is wrapped after commas
  // onto continuation lines "       PL:".
  void pointList() {
    pending_ += "  PL:";
    size_t listStart = pending_.size();
    pending_ += items_[i_].value;
    if (pending_.size() < kPointListWrapAt) return;
    while (i_ + 1 < items_.size() && items_[i_ + 1].tag == "PL") {
      ++i_;
      if (pending_.back() != ',') pending_ += ',';
      pending_ += items_[i_].value;
    }
    const size_t continuationStart = kIndent.size() + 3;
    while (pending_.size() >= kPointListWrapAt) {
      // Cut only inside the point list: a comma in an earlier item on the
      // line would move that item's text into the list.
      size_t cut = pending_.rfind(',', kPointListCutWithin - 1);
      if (cut == std::string::npos || cut < listStart) {
        if (listStart > continuationStart) {
          // The list starts far to the right: give it a line of its own.
          std::string list = pending_.substr(listStart);
          pending_.resize(listStart - 5);
          emit();
          pending_ = std::string(kIndent) + "PL:" + list;
          listStart = continuationStart;
          continue;
        }
        // No comma early enough: cut at the first one, or not at all.
        cut = pending_.find(',', listStart);
        if (cut == std::string::npos || cut + 1 == pending_.size()) break;
      }
      out_.push_back(pending_.substr(0, cut + 1));
      pending_ = std::string(kIndent) + "PL:" + pending_.substr(cut + 1);
      listStart = continuationStart;
    }
  }

  const std::vector<Item>& items_;
  size_t i_ = 0;
  std::string pending_;
  std::vector<std::string> out_;
};

// True when an item (a tag without blanks, then ":") starts at `at`.
bool ItemStartsAt(std::string_view line, size_t at) {
  size_t colon = line.find(':', at);
  if (colon == std::string_view::npos || colon == at) return false;
  return line.substr(at, colon - at).find(' ') == std::string_view::npos;
}

// The end of the value that begins at `from`: the two blanks before the
// next item, or the end of the line. `next` is where the next item starts
// (npos when the value runs to the end of the line). Two blanks that are not
// followed by an item belong to the value.
size_t ValueEnd(std::string_view line, size_t from, size_t& next) {
  size_t at = from;
  while ((at = line.find("  ", at)) != std::string_view::npos) {
    size_t run = line.find_first_not_of(' ', at);
    if (run == std::string_view::npos) break;
    if (ItemStartsAt(line, run)) {
      next = run;
      return run - 2;
    }
    at = run;
  }
  next = std::string_view::npos;
  return line.size();
}

bool IsPointListContinuation(std::string_view line) {
  return line.size() >= kIndent.size() + 3 && line.substr(0, kIndent.size()) == kIndent &&
         line.substr(kIndent.size(), 3) == "PL:";
}

// One PL item per piece of fewer than 78 characters, cut after commas.
void SplitPointList(std::string_view list, std::vector<std::string>& out) {
  while (list.size() >= kSplitAt) {
    size_t cut = list.rfind(',', kSplitWithin - 1);
    if (cut == std::string_view::npos) break;
    out.push_back("PL:" + std::string(list.substr(0, cut)));
    list.remove_prefix(cut + 1);
  }
  out.push_back("PL:" + std::string(list));
}

}  // namespace

std::vector<std::string> ListToRecord(const std::vector<std::string>& listLines) {
  std::vector<Item> items;
  items.reserve(listLines.size());
  for (const std::string& line : listLines) {
    size_t colon = line.find(':');
    if (colon == std::string::npos) continue;
    std::string_view l(line);
    items.push_back({l.substr(0, colon), l.substr(colon + 1)});
  }
  return RecordBuilder(items).build();
}

std::vector<std::string> RecordToList(const std::vector<std::string>& recordLines) {
  std::vector<std::string> out;
  for (size_t li = 0; li < recordLines.size(); ++li) {
    std::string_view line = recordLines[li];
    size_t pos = line.find_first_not_of(' ');
    while (pos != std::string_view::npos) {
      size_t colon = line.find(':', pos);
      if (colon == std::string_view::npos) break;
      std::string_view tag = line.substr(pos, colon - pos);
      size_t next = 0;
      size_t end = ValueEnd(line, colon + 1, next);
      std::string value(line.substr(colon + 1, end - colon - 1));
      if (tag != "PL") {
        out.push_back(std::string(tag) + ":" + value);
        pos = next;
        continue;
      }
      // A point list ending in "," at the end of its line goes on in the
      // continuation lines that follow.
      while (next == std::string_view::npos && !value.empty() && value.back() == ',' &&
             li + 1 < recordLines.size() && IsPointListContinuation(recordLines[li + 1])) {
        line = recordLines[++li];
        size_t from = kIndent.size() + 3;
        end = ValueEnd(line, from, next);
        value.append(line.substr(from, end - from));
      }
      SplitPointList(value, out);
      pos = next;
    }
  }
  return out;
}

bool ConvertListToRecord(const std::string& listPath, const std::string& recordPath,
                         std::string& error, RunProgress* progress) {
  std::vector<std::string> lines;
  if (!ReadTextLines(listPath, lines, progress)) {
    error = "The file '" + listPath + "' could not be read.";
    return false;
  }
  return WriteTextLines(recordPath, ListToRecord(lines), &error);
}

bool ConvertRecordToList(const std::string& recordPath, const std::string& listPath,
                         std::string& error, RunProgress* progress) {
  std::vector<std::string> lines;
  if (!ReadTextLines(recordPath, lines, progress)) {
    error = "The file '" + recordPath + "' could not be read.";
    return false;
  }
  return WriteTextLines(listPath, RecordToList(lines), &error);
}

std::string ListingStem(const std::string& fileName) {
  std::string_view name(fileName);
  if (name.ends_with(".lst")) name.remove_suffix(4);
  return std::string(name);
}

}  // namespace zv
