#pragma once
// The error that lower-level routines raise: a number, a description and the
// source ("module.routine"); the dialog that called them shows it.

#include <stdexcept>
#include <string>

namespace zv {

class ZvError : public std::runtime_error {
 public:
  ZvError(int number, std::string description, std::string source)
      : std::runtime_error(description),
        number_(number),
        description_(std::move(description)),
        source_(std::move(source)) {}

  int number() const { return number_; }
  const std::string& description() const { return description_; }
  const std::string& source() const { return source_; }

 private:
  int number_;
  std::string description_;
  std::string source_;
};

}  // namespace zv
