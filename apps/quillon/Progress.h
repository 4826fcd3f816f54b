// Progress of long runs on standard error: one line, rewritten in place, shown only when standard
// error is a terminal and the project is large.
#pragma once

#include <cstddef>
#include <string_view>

namespace quillon {

class Progress {
 public:
  // Projects with at least this many files count as large.
  static constexpr std::size_t kLargeProject = 50;

  Progress(bool quiet, std::size_t fileCount);
  ~Progress() { Clear(); }
  Progress(const Progress&) = delete;
  Progress& operator=(const Progress&) = delete;

  bool enabled() const { return enabled_; }
  // The descriptor of the terminal the line goes to (standard error unless its output is being
  // kept elsewhere).
  static void ShowOn(int descriptor) { terminal_ = descriptor; }
  // "quillon: parsing 12/340"
  void Step(std::string_view what, std::size_t done, std::size_t total);
  // "quillon: elaborating"
  void Phase(std::string_view what);
  // Removes the line, so that messages and output start on a clean line.
  void Clear();

 private:
  static inline int terminal_ = 2;

  bool enabled_;
  bool lineShown_ = false;
};

}  // namespace quillon
