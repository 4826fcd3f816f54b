#include "Suggestions.h"

#include <algorithm>
#include <cctype>
#include <utility>

namespace quillon {

namespace {

char Folded(char c) { return static_cast<char>(std::tolower(static_cast<unsigned char>(c))); }

}  // namespace

// Optimal string alignment over three rolling rows: linear memory in the shorter word.
std::size_t Suggestions::Distance(std::string_view a, std::string_view b) {
  if (a.size() < b.size()) std::swap(a, b);
  std::vector<std::size_t> twoBack(b.size() + 1), previous(b.size() + 1), current(b.size() + 1);
  for (std::size_t j = 0; j <= b.size(); ++j) previous[j] = j;
  for (std::size_t i = 1; i <= a.size(); ++i) {
    current[0] = i;
    for (std::size_t j = 1; j <= b.size(); ++j) {
      bool same = Folded(a[i - 1]) == Folded(b[j - 1]);
      current[j] = std::min({previous[j] + 1, current[j - 1] + 1, previous[j - 1] + (same ? 0 : 1)});
      bool swapped =
          i > 1 && j > 1 && Folded(a[i - 1]) == Folded(b[j - 2]) && Folded(a[i - 2]) == Folded(b[j - 1]);
      if (swapped) current[j] = std::min(current[j], twoBack[j - 2] + 1);
    }
    std::swap(twoBack, previous);
    std::swap(previous, current);
  }
  return previous[b.size()];
}

std::vector<std::string> Suggestions::Closest(std::string_view word,
                                              const std::vector<std::string>& candidates, std::size_t most) {
  const std::size_t limit = std::max<std::size_t>(1, word.size() / 3);
  std::vector<std::pair<std::size_t, std::string>> near;
  for (const std::string& candidate : candidates) {
    std::size_t distance = Distance(word, candidate);
    if (distance > 0 && distance <= limit) near.emplace_back(distance, candidate);
  }
  std::sort(near.begin(), near.end());
  near.erase(std::unique(near.begin(), near.end()), near.end());
  std::vector<std::string> closest;
  for (auto& [distance, candidate] : near) {
    if (closest.size() == most) break;
    if (std::find(closest.begin(), closest.end(), candidate) == closest.end()) closest.push_back(candidate);
  }
  return closest;
}

std::string Suggestions::DidYouMean(std::string_view word, const std::vector<std::string>& candidates) {
  std::vector<std::string> closest = Closest(word, candidates);
  if (closest.empty()) return {};
  std::string text = "; did you mean ";
  for (std::size_t i = 0; i < closest.size(); ++i) {
    if (i > 0) text += i + 1 == closest.size() ? " or " : ", ";
    text += "'" + closest[i] + "'";
  }
  return text + "?";
}

}  // namespace quillon
