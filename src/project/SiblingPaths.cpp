#include "SiblingPaths.h"

#include <functional>
#include <unordered_map>
#include <utility>

#include "Port/InitObjects.h"

namespace Vad {

SiblingPaths::SiblingPaths(std::vector<Port::StringBase> paths) : paths_(std::move(paths)) {
  std::size_t bytes = 0;
  for (const Port::StringBase& path : paths_) bytes += path.view().size() + 1;
  block_.reserve(bytes);  // never grows afterwards: the texts and the index point into it
  texts_.reserve(paths_.size());
  firstIndex_.reserve(paths_.size());
  for (std::size_t i = 0; i < paths_.size(); ++i) {
    const char* text = block_.data() + block_.size();
    block_.append(paths_[i].view());
    block_.push_back('\0');
    texts_.push_back(text);
    firstIndex_.try_emplace(std::string_view(text, paths_[i].view().size()), i);
  }
}

std::shared_ptr<const SiblingPaths> SiblingPaths::Shared(std::vector<Port::StringBase> paths) {
  // Living lists by a digest of their paths; lists that died are dropped as they are met.
  static std::unordered_multimap<std::size_t, std::weak_ptr<const SiblingPaths>> living;
  std::size_t digest = paths.size();
  for (const Port::StringBase& path : paths)
    digest = digest * 1000003u ^ std::hash<std::string_view>{}(path.view());
  auto [first, last] = living.equal_range(digest);
  for (auto entry = first; entry != last;) {
    std::shared_ptr<const SiblingPaths> list = entry->second.lock();
    if (!list) {
      entry = living.erase(entry);
      continue;
    }
    if (list->Paths() == paths) return list;
    ++entry;
  }
  auto made = std::make_shared<const SiblingPaths>(std::move(paths));
  living.emplace(digest, made);
  return made;
}

std::size_t SiblingPaths::CountBefore(std::string_view path) const {
  const auto found = firstIndex_.find(path);
  return found != firstIndex_.end() ? found->second : paths_.size();
}

}  // namespace Vad
