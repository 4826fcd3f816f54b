#include "ParseCache.h"

#include <sys/stat.h>

#include <algorithm>
#include <cinttypes>
#include <cstdio>
#include <fstream>
#include <iterator>

#include "CacheFiles.h"
#include "FileFacts.h"
#include "IHdlParseResults.h"
#include "Port/FileArchive.h"
#include "Port/MsgDispatcher.h"
#include "Prjrep/Casts.h"

namespace quillon {

namespace {

bool IsPlugin(const std::string& plugin, std::string_view name) {
  return plugin.size() == name.size() &&
         std::equal(plugin.begin(), plugin.end(), name.begin(), [](char a, char b) {
           return std::tolower(static_cast<unsigned char>(a)) == std::tolower(static_cast<unsigned char>(b));
         });
}

std::string Number(std::uint64_t value) { return std::to_string(value); }

}  // namespace

bool ParseCache::IsVerilog(const std::string& plugin) { return IsPlugin(plugin, "PLUGIN_Verilog"); }
bool ParseCache::Keeps(const std::string& plugin) {
  return IsVerilog(plugin) || IsPlugin(plugin, "PLUGIN_Vhdl");
}

// ---- keys --------------------------------------------------------------------------------------

std::optional<ParseCache::Facts> ParseCache::FactsOf(const std::string& path) {
  if (auto known = facts_.find(path); known != facts_.end()) return known->second;
  struct stat status {};
  if (::stat(path.c_str(), &status) != 0 || !S_ISREG(status.st_mode)) return std::nullopt;
  std::ifstream in(path, std::ios::binary);
  std::string text((std::istreambuf_iterator<char>(in)), std::istreambuf_iterator<char>());
  if (in.bad()) return std::nullopt;
  Facts facts;
  facts.size = static_cast<std::uint64_t>(status.st_size);
  facts.modified = static_cast<std::int64_t>(status.st_mtim.tv_sec) * 1000000000 + status.st_mtim.tv_nsec;
  facts.hash = CacheEntry::Hash(text);
  facts.includes = text.find("`include") != std::string::npos;
  // The text read must be the text stat described; a file being written is not kept.
  if (text.size() != facts.size) return std::nullopt;
  return facts_[path] = facts;
}

std::optional<std::string> ParseCache::KeyOf(Vad::IHdlFile* file) {
  OrderEntry described = FileFacts::Describe(file);
  if (!Keeps(described.plugin) || described.path.empty()) return std::nullopt;
  std::optional<Facts> facts = FactsOf(described.path);
  if (!facts) return std::nullopt;
  std::string key = described.path + '\n' + described.plugin + '\n' + described.library + '\n' +
                    Number(facts->size) + ' ' + Number(static_cast<std::uint64_t>(facts->modified)) + ' ' +
                    Number(facts->hash) + '\n' + inputs_;
  if (IsVerilog(described.plugin)) {
    if (!verilogChain_) return std::nullopt;
    key += '\n' + *verilogChain_;
  }
  return key;
}

// Every Verilog file's facts in project order: a change anywhere in the chain changes what the
// later files mean (macros), and the module parses them together.
std::optional<std::string> ParseCache::VerilogChain(const std::vector<Vad::IHdlFile*>& files) {
  std::string chain;
  for (Vad::IHdlFile* file : files) {
    std::string path = FileFacts::PathOf(file);
    std::optional<Facts> facts = FactsOf(path);
    if (!facts || facts->includes) return std::nullopt;
    chain += path + ' ' + Number(facts->size) + ' ' + Number(static_cast<std::uint64_t>(facts->modified)) +
             ' ' + Number(facts->hash) + '\n';
  }
  return chain;
}

std::string ParseCache::EntryPath(const std::string& sourcePath) const {
  char name[32];
  std::snprintf(name, sizeof name, "%016" PRIx64 ".qpc", CacheEntry::Hash(sourcePath));
  return directory_ + '/' + name;
}

// ---- reading -----------------------------------------------------------------------------------

bool ParseCache::ReadEntry(Vad::IHdlFile* file, const std::string& key, CacheEntry& entry) {
  std::string bytes;
  return CacheFiles::Read(EntryPath(FileFacts::PathOf(file)), bytes) && entry.Decode(bytes) &&
         entry.key == key;
}

bool ParseCache::Load(Vad::IHdlFile* file, const CacheEntry& entry) {
  auto* results = Prjrep::QueryAs<Vad::IHdlParseResults>(file);
  if (!results) return false;
  Port::StringBase error;
  Prjrep::AutoPtr<Prjrep::IArchive> archive = Port::FileArchive::OpenFromBytes(entry.records, &error);
  if (!archive) return false;
  bool loaded = results->loadParseResults(archive.Get()) == CitI::kOk;
  auto* reader = Prjrep::ObjectCast<Port::FileArchive>(archive.Get());
  if (!reader || reader->Close() != CitI::kOk) loaded = false;
  // Whatever came in half-way is replaced by the parse this forces.
  if (!loaded) file->setNeedsParse(true);
  return loaded;
}

void ParseCache::Replay(const CacheEntry& entry) {
  for (const Port_MsgRecord& message : entry.messages) Port_MsgDispatcher::dispatch(message);
}

void ParseCache::ParseOrRestore(Vad::IHdlFile* file) {
  std::optional<std::string> key = KeyOf(file);
  CacheEntry entry;
  if (key && ReadEntry(file, *key, entry) && Load(file, entry)) {
    ++hits_;
    Replay(entry);
    return;
  }
  std::size_t mark = log_.received().size();
  if (file->parseIfNeeded() != CitI::kOk || !key) return;
  ++misses_;
  Store(file, *key, ReceivedSince(mark));
}

void ParseCache::RestoreVerilog(const std::vector<Vad::IHdlFile*>& files) {
  verilogChain_ = VerilogChain(files);
  std::vector<CacheEntry> entries(files.size());
  for (std::size_t i = 0; i < files.size(); ++i) {
    std::optional<std::string> key = KeyOf(files[i]);
    if (!key || !ReadEntry(files[i], *key, entries[i])) return;
  }
  bool loaded = true;
  for (std::size_t i = 0; i < files.size(); ++i) loaded = Load(files[i], entries[i]) && loaded;
  if (!loaded) {
    for (Vad::IHdlFile* file : files) file->setNeedsParse(true);
    return;
  }
  for (const CacheEntry& entry : entries) Replay(entry);
  hits_ += files.size();
  restoredVerilog_ = files;
}

// ---- writing -----------------------------------------------------------------------------------

std::vector<Port_MsgRecord> ParseCache::ReceivedSince(std::size_t mark) const {
  const std::vector<Port_MsgRecord>& all = log_.received();
  return {all.begin() + static_cast<std::ptrdiff_t>(std::min(mark, all.size())), all.end()};
}

// The messages of the joint parse go with the first file, so that they are given once.
void ParseCache::StoreVerilog(const std::vector<Vad::IHdlFile*>& files) {
  if (files.empty() || restoredVerilog_ == files) return;
  std::vector<Port_MsgRecord> messages = ReceivedSince(verilogMark_);
  for (Vad::IHdlFile* file : files) {
    bool needsParse = true;
    file->getNeedsParse(&needsParse);
    std::optional<std::string> key = KeyOf(file);
    if (needsParse || !key) return;
  }
  for (Vad::IHdlFile* file : files) {
    ++misses_;
    Store(file, *KeyOf(file), std::move(messages));
    messages.clear();
  }
}

bool ParseCache::RecordsOf(Vad::IHdlFile* file, std::string& records) {
  auto* results = Prjrep::QueryAs<Vad::IHdlParseResults>(file);
  Prjrep::AutoPtr<Prjrep::IArchive> archive = Port::FileArchive::CreateInMemory();
  auto* writer = Prjrep::ObjectCast<Port::FileArchive>(archive.Get());
  if (!results || !writer || results->saveParseResults(archive.Get()) != CitI::kOk) return false;
  if (writer->Close() != CitI::kOk) return false;
  records.assign(writer->Bytes());
  return true;
}

void ParseCache::Store(Vad::IHdlFile* file, const std::string& key, std::vector<Port_MsgRecord> messages) {
  CacheEntry entry{key, std::move(messages), {}};
  if (!RecordsOf(file, entry.records)) return;
  CacheFiles::Write(directory_, EntryPath(FileFacts::PathOf(file)), entry.Encode());
}

}  // namespace quillon
