// Results of compiled files, kept so that a file compiled again unchanged, with the same incoming
// macro state and include directories, is not read again. Compiling each file of a project after
// all the files before it (what the Verilog parser does) thereby reads every file once.
//
// A result is current while its file and every file it included have the stamp they had when it
// was made. Stamps are read again only for files that the file watch reports changed (or cannot
// watch), and always for the last file of a compile. Besides, the cache remembers the last chain
// of files it resolved: while no file changed and no result was dropped since, a compile whose
// files begin like that chain takes the common part at the cost of comparing the paths.
//
// Thread-safe; compiles run without the lock held. Bounded in memory (least recently used results
// go first).
#pragma once

#include <cstddef>
#include <cstdint>
#include <functional>
#include <memory>
#include <mutex>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "vci/VerilogDesignInfo.h"
#include "vci/VerilogFileCompiler.h"
#include "vci/VerilogFileResult.h"
#include "vci/VerilogFileStamp.h"
#include "vci/VerilogFileWatch.h"
#include "vci/VerilogMacroTable.h"

namespace Hx_Vci {

class VerilogFileCache {
 public:
  struct Limits {
    std::size_t maxBytes = std::size_t{256} << 20;
    std::size_t maxFiles = 100000;
    std::size_t contextsPerFile = 4;
    bool watchFiles = true;  // false: read the stamp of every file at every use
  };

  // The user-defined primitives declared by the files of a chain up to one of them.
  using PrimitiveNames = VerilogNameSet;
  struct ChainResult {
    std::shared_ptr<const VerilogFileResult> result;
    std::shared_ptr<const PrimitiveNames> primitives;  // never null
  };

  // Compiles files[index] (at `path`) starting with `macros`; called without the cache's lock.
  using CompileFile = std::function<VerilogFileCompiler::Compiled(
      std::size_t index, const std::string& path, const std::shared_ptr<const VerilogMacroTable>& macros)>;

  VerilogFileCache() : VerilogFileCache(Limits()) {}
  explicit VerilogFileCache(Limits limits);
  VerilogFileCache(const VerilogFileCache&) = delete;
  VerilogFileCache& operator=(const VerilogFileCache&) = delete;
  ~VerilogFileCache();

  // The cache of the process, shared by the compilers that do not get one of their own.
  static std::shared_ptr<VerilogFileCache> Shared();

  // The result of the last of `files` (not empty) and the primitives of all, each file starting with the
  // macro state that the one before left, the first with `macros` (not null); `includeDirs` identifies the
  // include directory list. Files without a current result are compiled by `compile` and kept.
  ChainResult CompileChain(const std::vector<std::string_view>& files,
                           std::shared_ptr<const VerilogMacroTable> macros, std::uint64_t includeDirs,
                           const CompileFile& compile);

  // Forgets every result, so that the next compiles read every file again.
  void Clear();

  // Files compiled into the cache since construction; lets tests see the work done.
  std::uint64_t ScannedFileCount() const;
  bool WatchesFiles() const { return watch_ != nullptr; }

 private:
  // Everything besides the file itself that a file's result depends on.
  struct Context {
    VerilogMacroFingerprint macros;
    std::uint64_t includeDirs = 0;
    bool operator==(const Context&) const = default;
  };
  struct Entry {
    Context context;
    std::shared_ptr<const VerilogFileResult> result;
    std::uint64_t lastUse = 0;
    std::size_t bytes = 0;
  };
  struct Node {
    VerilogFileStamp stamp;  // as last read from disk
    bool known = false;      // the stamp was read at least once
    bool trusted = false;    // the watch vouches that the stamp is still current
    std::vector<Entry> entries;
  };
  struct PathHash {
    using is_transparent = void;
    std::size_t operator()(std::string_view path) const { return std::hash<std::string_view>()(path); }
  };
  using Nodes = std::unordered_map<std::string, Node, PathHash, std::equal_to<>>;
  using Links = std::vector<ChainResult>;
  // Every compile of a project compares its files with the chain, so the paths are kept one
  // after the other in one text, read in one sweep.
  struct Chain {
    bool valid = false;
    std::uint64_t version = 0;  // counts the chains remembered
    std::uint64_t generation = 0;
    Context start;
    std::string paths;
    std::vector<std::size_t> pathEnds;
    Links links;

    std::size_t Length() const { return links.size(); }
    std::string_view Path(std::size_t index) const;
    void Truncate(std::size_t length);
    void Append(std::string_view path, ChainResult link);
  };
  // What a lookup or a store found out about one file of a chain.
  struct Found {
    std::shared_ptr<const VerilogFileResult> result;
    bool trusted = false;
  };

  void TakeWatchedChanges();
  std::size_t MatchRememberedChain(const std::vector<std::string_view>& files, const Context& start) const;
  // The files from `matched` on have `links`, as many of them.
  void RememberChain(const Context& start, const std::vector<std::string_view>& files, std::size_t matched,
                     Links links);
  Found Find(std::string_view path, const Context& context, bool checkDisk);
  Found Store(std::string_view path, const VerilogFileStamp& stamp, const Context& context,
              std::shared_ptr<const VerilogFileResult> result);
  Node& NodeFor(std::string_view path);
  void Refresh(std::string_view path, Node& node);
  bool DependenciesCurrent(const VerilogFileResult& result, bool* trusted);
  void DropEntries(Node& node);
  void EvictIfNeeded();

  mutable std::mutex mutex_;
  Limits limits_;
  std::unique_ptr<VerilogFileWatch> watch_;
  Nodes nodes_;
  // Grows whenever a file is seen changed or a kept result is dropped; a remembered chain is
  // good while it stays the same.
  std::uint64_t generation_ = 0;
  Chain chain_;
  std::uint64_t tick_ = 0;
  std::uint64_t scanned_ = 0;
  std::size_t bytes_ = 0;
};

}  // namespace Hx_Vci
