#include "vci/VerilogFileCache.h"

#include <algorithm>
#include <utility>

#include "vci/VerilogSourceFile.h"

namespace Hx_Vci {

namespace {

using PrimitiveNames = VerilogFileCache::PrimitiveNames;

std::shared_ptr<const PrimitiveNames> WithPrimitivesOf(std::shared_ptr<const PrimitiveNames> before,
                                                       const VerilogFileResult& result) {
  if (result.primitives.empty()) {
    return before;
  }
  auto names = std::make_shared<PrimitiveNames>(*before);
  names->insert(result.primitives.begin(), result.primitives.end());
  return names;
}

}  // namespace

VerilogFileCache::VerilogFileCache(Limits limits) : limits_(limits) {
  if (limits_.watchFiles) {
    watch_ = std::make_unique<VerilogFileWatch>();
    if (!watch_->Available()) {
      watch_.reset();
    }
  }
}

VerilogFileCache::~VerilogFileCache() = default;

std::shared_ptr<VerilogFileCache> VerilogFileCache::Shared() {
  static const std::shared_ptr<VerilogFileCache> shared = std::make_shared<VerilogFileCache>();
  return shared;
}

VerilogFileCache::ChainResult VerilogFileCache::CompileChain(const std::vector<std::string_view>& files,
                                                             std::shared_ptr<const VerilogMacroTable> macros,
                                                             std::uint64_t includeDirs,
                                                             const CompileFile& compile) {
  std::unique_lock<std::mutex> lock(mutex_);
  TakeWatchedChanges();
  const std::uint64_t generationAtStart = generation_;
  const Context start{macros->fingerprint(), includeDirs};
  Context context = start;
  static const auto kNoPrimitives = std::make_shared<const PrimitiveNames>();
  ChainResult last{nullptr, kNoPrimitives};
  const std::size_t matched = MatchRememberedChain(files, start);
  if (matched > 0) {
    last = chain_.links[matched - 1];
    macros = last.result->macrosAfter;
    context.macros = macros->fingerprint();
  }
  const std::uint64_t chainVersion = chain_.version;
  Links linked;
  bool remember = watch_ != nullptr;
  for (std::size_t i = matched; i < files.size(); ++i) {
    Found found = Find(files[i], context, i + 1 == files.size());
    if (!found.result) {
      const std::string path(files[i]);
      lock.unlock();
      VerilogFileCompiler::Compiled compiled = compile(i, path, macros);
      lock.lock();
      found = Store(files[i], compiled.stamp, context, std::move(compiled.result));
    }
    last.primitives = WithPrimitivesOf(std::move(last.primitives), *found.result);
    last.result = std::move(found.result);
    macros = last.result->macrosAfter;
    context.macros = macros->fingerprint();
    remember = remember && found.trusted;
    if (remember) {
      linked.push_back(last);
    }
  }
  // Another compile may have remembered a chain of its own meanwhile; ours then extends nothing.
  const bool sameChain = matched == 0 || chain_.version == chainVersion;
  if (remember && generation_ == generationAtStart && sameChain) {
    RememberChain(start, files, matched, std::move(linked));
  } else if (!chain_.valid || chain_.generation != generation_) {
    chain_.valid = false;
    chain_.Truncate(0);  // lets go of results that may be dropped from the cache
  }
  return last;
}

void VerilogFileCache::Clear() {
  std::lock_guard<std::mutex> lock(mutex_);
  if (watch_) {
    for (const auto& [path, node] : nodes_) watch_->Forget(path);
  }
  nodes_.clear();
  bytes_ = 0;
  ++generation_;
  chain_.valid = false;
  chain_.Truncate(0);
}

std::uint64_t VerilogFileCache::ScannedFileCount() const {
  std::lock_guard<std::mutex> lock(mutex_);
  return scanned_;
}

void VerilogFileCache::TakeWatchedChanges() {
  if (!watch_) {
    return;
  }
  const VerilogFileWatch::Changes changes = watch_->Collect();
  if (changes.all) {
    for (auto& [path, node] : nodes_) node.trusted = false;
    ++generation_;
  }
  for (const std::string& path : changes.paths) {
    auto found = nodes_.find(path);
    if (found != nodes_.end()) {
      found->second.trusted = false;
      ++generation_;
    }
  }
}

// How many files at the start of `files` the remembered chain covers; never the last file, whose
// stamp a compile always reads.
std::size_t VerilogFileCache::MatchRememberedChain(const std::vector<std::string_view>& files,
                                                   const Context& start) const {
  if (!chain_.valid || chain_.generation != generation_ || !(chain_.start == start)) {
    return 0;
  }
  const std::size_t limit = std::min(chain_.Length(), files.size() - 1);
  std::size_t matched = 0;
  while (matched < limit && chain_.Path(matched) == files[matched]) ++matched;
  return matched;
}

// A project's files are not always compiled in project order, so a compile of fewer files keeps
// the links of a longer chain that goes on the same way.
void VerilogFileCache::RememberChain(const Context& start, const std::vector<std::string_view>& files,
                                     std::size_t matched, Links links) {
  const bool extends = chain_.valid && chain_.generation == generation_ && chain_.start == start;
  std::size_t length = extends ? matched : 0;
  std::size_t next = 0;
  while (extends && next < links.size() && length < chain_.Length() &&
         chain_.links[length].result == links[next].result && chain_.Path(length) == files[matched + next]) {
    ++length;
    ++next;
  }
  if (next < links.size()) {
    chain_.Truncate(length);
    for (; next < links.size(); ++next) chain_.Append(files[matched + next], std::move(links[next]));
  }
  chain_.start = start;
  chain_.generation = generation_;
  chain_.valid = true;
  ++chain_.version;
}

std::string_view VerilogFileCache::Chain::Path(std::size_t index) const {
  const std::size_t begin = index == 0 ? 0 : pathEnds[index - 1];
  return std::string_view(paths).substr(begin, pathEnds[index] - begin);
}

void VerilogFileCache::Chain::Truncate(std::size_t length) {
  if (length >= Length()) {
    return;
  }
  paths.resize(length == 0 ? 0 : pathEnds[length - 1]);
  pathEnds.resize(length);
  links.resize(length);
}

void VerilogFileCache::Chain::Append(std::string_view path, ChainResult link) {
  paths.append(path);
  pathEnds.push_back(paths.size());
  links.push_back(std::move(link));
}

VerilogFileCache::Found VerilogFileCache::Find(std::string_view path, const Context& context,
                                               bool checkDisk) {
  auto found = nodes_.find(path);
  if (found == nodes_.end()) {
    return {};
  }
  Node& node = found->second;
  if (checkDisk || !node.trusted) {
    Refresh(path, node);
  }
  auto matches = [&](const Entry& entry) { return entry.context == context; };
  auto entry = std::find_if(node.entries.begin(), node.entries.end(), matches);
  if (entry == node.entries.end()) {
    return {};
  }
  // Checking the includes may read stamps and drop entries, this one too: hold on to the result.
  std::shared_ptr<const VerilogFileResult> result = entry->result;
  bool trusted = node.trusted;
  if (!DependenciesCurrent(*result, &trusted)) {
    std::erase_if(node.entries, [&](const Entry& stale) {
      if (!matches(stale)) return false;
      bytes_ -= stale.bytes;
      return true;
    });
    ++generation_;
    return {};
  }
  entry = std::find_if(node.entries.begin(), node.entries.end(), matches);
  if (entry == node.entries.end()) {
    return {};
  }
  entry->lastUse = ++tick_;
  return {std::move(result), trusted};
}

// Keeps the result of a scan that read the file with `stamp`, unless the file or an include
// changed meanwhile. Reading the stamp again now that the file is watched closes the window
// between the read and the start of the watch, in which a change would go unnoticed.
VerilogFileCache::Found VerilogFileCache::Store(std::string_view path, const VerilogFileStamp& stamp,
                                                const Context& context,
                                                std::shared_ptr<const VerilogFileResult> result) {
  ++scanned_;
  Node& node = NodeFor(path);
  Refresh(path, node);
  bool trusted = node.trusted;
  if (node.stamp != stamp || !DependenciesCurrent(*result, &trusted)) {
    return {std::move(result), false};
  }
  Entry fresh{context, result, ++tick_, result->ApproximateBytes()};
  const std::size_t before = node.entries.size();
  std::erase_if(node.entries, [&](const Entry& entry) {
    if (!(entry.context == context)) return false;
    bytes_ -= entry.bytes;
    return true;
  });
  if (node.entries.size() >= limits_.contextsPerFile && !node.entries.empty()) {
    auto oldest = std::min_element(node.entries.begin(), node.entries.end(),
                                   [](const Entry& a, const Entry& b) { return a.lastUse < b.lastUse; });
    bytes_ -= oldest->bytes;
    node.entries.erase(oldest);
  }
  if (node.entries.size() < before) {
    ++generation_;
  }
  bytes_ += fresh.bytes;
  node.entries.push_back(std::move(fresh));
  EvictIfNeeded();
  return {std::move(result), trusted};
}

VerilogFileCache::Node& VerilogFileCache::NodeFor(std::string_view path) {
  auto found = nodes_.find(path);
  return found != nodes_.end() ? found->second : nodes_.try_emplace(std::string(path)).first->second;
}

// The watch starts before the stamp is read, so a change after the read is always reported.
void VerilogFileCache::Refresh(std::string_view path, Node& node) {
  const std::string text(path);
  const bool watched = watch_ && watch_->Watch(text);
  bool isLink = false;
  const VerilogFileStamp now = VerilogSourceFile::Stat(text, &isLink);
  if (now != node.stamp) {
    if (node.known) {
      ++generation_;
    }
    DropEntries(node);
    node.stamp = now;
  }
  node.known = true;
  // A symbolic link's target may change where no watch sees it.
  node.trusted = watched && !isLink;
}

bool VerilogFileCache::DependenciesCurrent(const VerilogFileResult& result, bool* trusted) {
  for (const VerilogDependency& dependency : result.dependencies) {
    Node& node = NodeFor(dependency.path);
    if (!node.trusted) {
      Refresh(dependency.path, node);
    }
    *trusted = *trusted && node.trusted;
    if (node.stamp != dependency.stamp) {
      return false;
    }
  }
  return true;
}

void VerilogFileCache::DropEntries(Node& node) {
  if (node.entries.empty()) {
    return;
  }
  for (const Entry& entry : node.entries) bytes_ -= entry.bytes;
  node.entries.clear();
  ++generation_;
}

// Drops the least recently used quarter of the results, more if memory is still short, and then
// every file without results; a pass frees enough that passes stay rare.
void VerilogFileCache::EvictIfNeeded() {
  if (bytes_ <= limits_.maxBytes && nodes_.size() <= limits_.maxFiles) {
    return;
  }
  ++generation_;
  std::vector<std::pair<std::uint64_t, std::size_t>> uses;  // last use, bytes
  for (const auto& [path, node] : nodes_) {
    for (const Entry& entry : node.entries) uses.emplace_back(entry.lastUse, entry.bytes);
  }
  std::sort(uses.begin(), uses.end());
  std::size_t freed = 0;
  std::size_t dropped = 0;
  std::uint64_t newestDropped = 0;
  for (const auto& [lastUse, bytes] : uses) {
    if (dropped >= uses.size() / 4 && bytes_ - freed <= limits_.maxBytes / 4 * 3) break;
    freed += bytes;
    ++dropped;
    newestDropped = lastUse;
  }
  for (auto it = nodes_.begin(); it != nodes_.end();) {
    std::erase_if(it->second.entries, [&](const Entry& entry) {
      if (entry.lastUse > newestDropped) return false;
      bytes_ -= entry.bytes;
      return true;
    });
    if (!it->second.entries.empty()) {
      ++it;
      continue;
    }
    if (watch_) watch_->Forget(it->first);
    it = nodes_.erase(it);
  }
}

}  // namespace Hx_Vci
