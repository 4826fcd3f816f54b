// "Did you mean": the known words closest to a misspelt one, by edit distance (a swap of two
// neighbouring letters counts as one edit; letter case is ignored).
#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace quillon {

class Suggestions {
 public:
  // At most `most` candidates, closest first (ties by name), and only those within a distance of
  // a third of the word's length (at least 1): a far guess helps nobody.
  static std::vector<std::string> Closest(std::string_view word, const std::vector<std::string>& candidates,
                                          std::size_t most = 3);
  // "; did you mean 'a' or 'b'?" for the closest candidates, or "" when none is close.
  static std::string DidYouMean(std::string_view word, const std::vector<std::string>& candidates);
  static std::size_t Distance(std::string_view a, std::string_view b);
};

}  // namespace quillon
