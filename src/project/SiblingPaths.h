// The full paths of a project's files of one plug-in, in project order, as every file of that
// plug-in is handed them for its parse. A Verilog parse names every file before its own, so the
// list also answers where a path stands and its texts ready to be passed on, without comparing
// or copying the paths of a project for each of its files. The texts lie one after the other, so
// that whoever reads them all reads one block of memory.
#pragma once

#include <cstddef>
#include <memory>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "Port/StringBase.h"

namespace Vad {

class SiblingPaths {
 public:
  SiblingPaths() = default;
  explicit SiblingPaths(std::vector<Port::StringBase> paths);
  SiblingPaths(const SiblingPaths&) = delete;
  SiblingPaths& operator=(const SiblingPaths&) = delete;

  // The one living list with exactly these paths, made when there is none. Every file of a
  // project asks whether the list it was parsed with is still the project's; one shared object
  // answers that by identity instead of a comparison of every path for every file.
  static std::shared_ptr<const SiblingPaths> Shared(std::vector<Port::StringBase> paths);

  const std::vector<Port::StringBase>& Paths() const { return paths_; }
  // The paths as C texts, in the same order.
  const std::vector<const char*>& Texts() const { return texts_; }
  // How many paths come before the first one equal to `path` (compared exactly); all of them
  // when none is.
  std::size_t CountBefore(std::string_view path) const;

 private:
  std::vector<Port::StringBase> paths_;
  std::string block_;  // every path, each followed by a null character
  std::vector<const char*> texts_;
  std::unordered_map<std::string_view, std::size_t> firstIndex_;
};

}  // namespace Vad
