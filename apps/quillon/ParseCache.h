// A directory of parse results kept between runs: one entry per source file, holding the file's
// design-unit records (in the module's archive format) and the messages its parse issued, keyed by
// the file's path, size, modification time and content hash and by everything else the parse
// read (plug-in, library, project properties, cell-library root, module; for Verilog the whole
// chain of Verilog files). An entry that does not match in every point, or whose header, length
// or checksum is wrong, is ignored and rewritten after the parse. Entries are written under a
// temporary name and renamed, so runs sharing a directory never see half an entry.
#pragma once

#include <cstdint>
#include <map>
#include <optional>
#include <string>
#include <vector>

#include "CacheEntry.h"
#include "IHdlFile.h"
#include "MessageLog.h"
#include "Port/MsgMan.h"

namespace quillon {

class ParseCache {
 public:
  // `inputs` stands for what every parse depends on besides the file itself.
  ParseCache(std::string directory, std::string inputs, MessageLog& log)
      : directory_(std::move(directory)), inputs_(std::move(inputs)), log_(log) {}

  // Loads the file's entry when it matches, else parses the file and writes its entry. For
  // files parsed on their own (not Verilog).
  void ParseOrRestore(Vad::IHdlFile* file);
  // Loads the entries of all the project's Verilog files when every one matches; otherwise none
  // (one changed Verilog file makes the module parse them all again).
  void RestoreVerilog(const std::vector<Vad::IHdlFile*>& files);
  // Before and after the project parses what is left (its Verilog files).
  void BeginVerilogParse() { verilogMark_ = log_.received().size(); }
  void StoreVerilog(const std::vector<Vad::IHdlFile*>& files);

  // The parsers whose inputs the key covers: the source alone and the project's settings.
  static bool Keeps(const std::string& plugin);
  static bool IsVerilog(const std::string& plugin);

  std::size_t hits() const { return hits_; }
  std::size_t misses() const { return misses_; }

 private:
  struct Facts {
    std::uint64_t size = 0;
    std::int64_t modified = 0;  // nanoseconds
    std::uint64_t hash = 0;
    bool includes = false;  // a Verilog `include names a file the key does not cover
  };
  // The key of the file's entry; nothing for a file the cache does not keep.
  std::optional<std::string> KeyOf(Vad::IHdlFile* file);
  std::optional<Facts> FactsOf(const std::string& path);
  std::optional<std::string> VerilogChain(const std::vector<Vad::IHdlFile*>& files);
  std::string EntryPath(const std::string& sourcePath) const;
  bool ReadEntry(Vad::IHdlFile* file, const std::string& key, CacheEntry& entry);
  static bool Load(Vad::IHdlFile* file, const CacheEntry& entry);
  // The file's design-unit records in the module's archive format; false when it has none to give.
  static bool RecordsOf(Vad::IHdlFile* file, std::string& records);
  void Replay(const CacheEntry& entry);
  void Store(Vad::IHdlFile* file, const std::string& key, std::vector<Port_MsgRecord> messages);
  std::vector<Port_MsgRecord> ReceivedSince(std::size_t mark) const;

  std::string directory_;
  std::string inputs_;
  MessageLog& log_;
  std::map<std::string, Facts> facts_;
  std::optional<std::string> verilogChain_;
  std::vector<Vad::IHdlFile*> restoredVerilog_;
  std::size_t verilogMark_ = 0;
  std::size_t hits_ = 0;
  std::size_t misses_ = 0;
};

}  // namespace quillon
