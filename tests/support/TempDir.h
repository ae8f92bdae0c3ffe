#pragma once
// A temporary folder removed at the end of a test, with helpers to write and
// read text files in it.

#include <string>
#include <vector>

namespace zv::test {

class TempDir {
 public:
  TempDir();
  ~TempDir();
  TempDir(const TempDir&) = delete;
  TempDir& operator=(const TempDir&) = delete;

  const std::string& path() const { return path_; }
  // path() + "/" + name
  std::string file(const std::string& name) const;
  // Writes the text as is (no line-end translation); returns the full path.
  std::string write(const std::string& name, const std::string& text) const;

 private:
  std::string path_;
};

// The whole content of a file ("" when missing).
std::string ReadFile(const std::string& path);
// Lines joined with CR LF, with a final CR LF.
std::string CrLf(const std::vector<std::string>& lines);

}  // namespace zv::test
