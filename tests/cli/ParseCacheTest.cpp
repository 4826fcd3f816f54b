// The parse cache and the stored runs: runs that load files from the cache, or answer from a stored
// run, answer exactly as runs that parse everything.
#include <gtest/gtest.h>
#include <sys/stat.h>

#include <chrono>
#include <filesystem>
#include <fstream>
#include <map>
#include <string>
#include <thread>
#include <vector>

#include "CacheEntry.h"
#include "CliRun.h"
#include "InputStamp.h"
#include "SeededRandom.h"
#include "StoredRun.h"

namespace cli_test {
namespace {

namespace fs = std::filesystem;
using quillon::CacheEntry;
using quillon::InputStamp;
using quillon::StoredRun;

void WriteText(const std::string& path, const std::string& text) {
  std::ofstream(path, std::ios::binary) << text;
}

std::string ReadText(const std::string& path) {
  std::ifstream in(path, std::ios::binary);
  return std::string((std::istreambuf_iterator<char>(in)), std::istreambuf_iterator<char>());
}

// A VHDL file with a package, an entity that uses it and an architecture that instantiates the
// entity of another file; or a Verilog module that instantiates another and is kept only when a
// macro is (or is not) defined.
std::string VhdlSource(int id, int other, int version) {
  std::string n = std::to_string(id), o = std::to_string(other);
  return "package p" + n + " is\n  constant c : integer := " + std::to_string(version) + ";\nend p" + n +
         ";\nuse work.p" + n + ".all;\nentity e" + n + " is\nend e" + n + ";\narchitecture a of e" + n +
         " is\nbegin\n  u" + o + ": entity work.e" + o + ";\n  v: comp" + std::to_string(version) +
         ";\nend a;\n" + (version % 3 == 0 ? "entity broken is port(\n" : "");
}

std::string VerilogSource(int id, int other, int version) {
  std::string n = std::to_string(id);
  std::string guard = version % 2 ? "`ifdef FAST\n" : "`ifndef FAST\n";
  return guard + "module m" + n + "(input a);\n  m" + std::to_string(other) + " u(a);\nendmodule\n`endif\n" +
         (version % 4 == 1 ? "`define FAST\n" : "") + (version % 5 == 2 ? "`undefined_macro\n" : "");
}

class EditedProject {
 public:
  explicit EditedProject(std::uint64_t seed) : random_(seed) {}

  void Edit() {
    int choice = random_.Below(5);
    if (files_.empty() || choice == 0) return Add();
    auto victim = std::next(files_.begin(), random_.Below(static_cast<int>(files_.size())));
    if (choice == 1) {
      fs::remove(victim->first);
      files_.erase(victim);
    } else if (choice == 2) {
      std::string renamed =
          dir_.Path("r" + std::to_string(next_++) + fs::path(victim->first).extension().string());
      fs::rename(victim->first, renamed);
      files_[renamed] = victim->second;
      files_.erase(victim);
    } else if (choice == 3) {
      Write(victim->first, victim->second, random_.Below(12));
    } else {
      fast_ = !fast_;
    }
  }

  std::vector<std::string> Arguments(const std::string& command) const {
    std::vector<std::string> args{"--format", "json"};
    if (fast_) args.push_back("-DFAST");
    args.push_back(command);
    for (const auto& [path, id] : files_) args.push_back(path);
    return args;
  }
  const std::string& root() const { return dir_.path(); }

 private:
  void Add() {
    int id = next_++;
    std::string path = dir_.Path("f" + std::to_string(id) + (random_.Chance(60) ? ".vhd" : ".v"));
    files_[path] = id;
    Write(path, id, random_.Below(12));
  }
  void Write(const std::string& path, int id, int version) {
    int other = random_.Below(next_);
    WriteText(path,
              path.ends_with(".v") ? VerilogSource(id, other, version) : VhdlSource(id, other, version));
  }

  SeededRandom random_;
  ScopedTempDir dir_;
  std::map<std::string, int> files_;
  int next_ = 0;
  bool fast_ = false;
};

CliResult RunCached(const std::string& cacheDir, std::vector<std::string> args) {
  args.insert(args.begin(), {"--cache", cacheDir});
  return RunQuillon(args);
}

void ExpectSameRun(const CliResult& cold, const CliResult& cached, const std::string& what) {
  EXPECT_EQ(cold.status, cached.status) << what;
  EXPECT_EQ(cold.out, cached.out) << what;
  EXPECT_EQ(cold.err, cached.err) << what;
}

TEST(ParseCache, GivesTheOutputOfAColdRunOverRandomEdits) {
  EditedProject project(20261206);
  ScopedTempDir cache;
  for (int i = 0; i < 4; ++i) project.Edit();
  for (int round = 0; round < 6; ++round) {
    project.Edit();
    for (const char* command : {"units", "order"}) {
      std::vector<std::string> args = project.Arguments(command);
      CliResult cold = RunQuillon(args);
      std::string what = "round " + std::to_string(round) + " " + command;
      ExpectSameRun(cold, RunCached(cache.path(), args), what);
      // Nothing changed since: the stored run answers.
      if (command == std::string("order"))
        ExpectSameRun(cold, RunCached(cache.path(), args), what + " again");
    }
  }
  // Nothing changed since: every file comes from the cache, with the messages of its parse.
  std::vector<std::string> args = project.Arguments("tree");
  args.insert(args.begin(), "-v");
  CliResult cached = RunCached(cache.path(), args);
  EXPECT_NE(cached.err.find("files loaded, 0 parsed"), std::string::npos) << cached.err;
}

std::vector<std::string> StoredRuns(const std::string& cacheDir) {
  std::vector<std::string> paths;
  for (const auto& file : fs::directory_iterator(cacheDir))
    if (file.path().filename().string().starts_with("run-")) paths.push_back(file.path().string());
  return paths;
}

// The entry of a one-file project, and the cold run's answer.
struct OneFile {
  ScopedTempDir dir;
  ScopedTempDir cache;
  std::string source = dir.Path("one.v");
  std::vector<std::string> args{"--format", "json", "units", source};
  CliResult cold;
  std::string entryPath;
  std::string entry;

  OneFile() {
    WriteText(source, VerilogSource(1, 2, 7));
    cold = RunQuillon(args);
    RunCached(cache.path(), args);
    for (const auto& file : fs::directory_iterator(cache.path()))
      if (file.path().extension() == ".qpc") entryPath = file.path().string();
    entry = ReadText(entryPath);
  }
};

TEST(ParseCache, RefusesEveryDamagedEntryAndRewritesIt) {
  OneFile one;
  ASSERT_FALSE(one.entry.empty());
  CacheEntry decoded;
  ASSERT_TRUE(decoded.Decode(one.entry));
  EXPECT_EQ(decoded.messages.size(), 1u);  // the undefined macro, given again on every load

  for (std::size_t length = 0; length < one.entry.size(); ++length)
    EXPECT_FALSE(CacheEntry().Decode(std::string_view(one.entry).substr(0, length))) << length;
  EXPECT_FALSE(CacheEntry().Decode(one.entry + '\0'));
  for (std::size_t at = 0; at < one.entry.size(); ++at) {
    std::string flipped = one.entry;
    flipped[at] = static_cast<char>(flipped[at] ^ 0x10);
    EXPECT_FALSE(CacheEntry().Decode(flipped)) << at;
  }
  std::string otherVersion = one.entry;
  otherVersion[8] = static_cast<char>(CacheEntry::kFormatVersion + 1);
  EXPECT_FALSE(CacheEntry().Decode(otherVersion));

  // Through the program: a cut entry is parsed around and replaced by a whole one.
  for (std::size_t length : {std::size_t{0}, std::size_t{11}, one.entry.size() / 2, one.entry.size() - 1}) {
    WriteText(one.entryPath, one.entry.substr(0, length));
    // The stored run would answer without reading the parse cache.
    for (const std::string& run : StoredRuns(one.cache.path())) fs::remove(run);
    ExpectSameRun(one.cold, RunCached(one.cache.path(), one.args), "cut at " + std::to_string(length));
    EXPECT_EQ(ReadText(one.entryPath), one.entry) << length;
  }
}

TEST(ParseCache, IsOffWithoutAProjectFileUnlessAskedAndNoCacheTurnsItOff) {
  ScopedTempDir dir;
  WriteText(dir.Path("a.vhd"), VhdlSource(1, 1, 1));
  WriteText(dir.Path("p.json"), R"({"files": [{"path": "a.vhd"}]})");
  EXPECT_EQ(RunQuillon({"units", dir.Path("a.vhd")}).status, 0);
  EXPECT_FALSE(fs::exists(dir.Path(".quillon")));
  EXPECT_EQ(RunQuillon({"--no-cache", "units", "-P", dir.Path("p.json")}).status, 0);
  EXPECT_FALSE(fs::exists(dir.Path(".quillon")));
  EXPECT_EQ(RunQuillon({"units", "-P", dir.Path("p.json")}).status, 0);
  EXPECT_FALSE(fs::is_empty(dir.Path(".quillon")));
}

// The stored run is what answers: an answer planted in it comes out, until a source, an argument
// or the environment differs.
TEST(ResultCache, AnswersFromTheStoredRunUntilAnInputDiffers) {
  ScopedTempDir dir, cache;
  std::string source = dir.Path("a.vhd");
  WriteText(source, VhdlSource(1, 1, 1));
  // Old enough that the run may store its answer.
  std::this_thread::sleep_for(std::chrono::milliseconds(50));
  std::vector<std::string> args{"order", source};
  CliResult cold = RunCached(cache.path(), args);
  std::vector<std::string> runs = StoredRuns(cache.path());
  ASSERT_EQ(runs.size(), 1u);
  StoredRun run;
  ASSERT_TRUE(run.Decode(ReadText(runs[0])));
  EXPECT_EQ(run.output.out, cold.out);
  EXPECT_EQ(run.status, cold.status);
  ASSERT_EQ(run.inputs.size(), 1u);

  run.output.out = "planted\n";
  run.output.err = "planted message\n";
  run.status = 3;
  WriteText(runs[0], run.Encode());
  CliResult planted = RunCached(cache.path(), args);
  EXPECT_EQ(planted.out, "planted\n");
  EXPECT_EQ(planted.err, "planted message\n");
  EXPECT_EQ(planted.status, 3);

  EXPECT_EQ(RunCached(cache.path(), {"--absolute", "order", source}).out,
            RunQuillon({"--absolute", "order", source}).out);
  EXPECT_EQ(
      RunQuillon(CliRun{{"--cache", cache.path(), "order", source}, {}, {{"QUILLON_TEST_VALUE", "1"}}}).out,
      cold.out);
  std::ofstream(source, std::ios::app) << "\n";
  ExpectSameRun(RunQuillon(args), RunCached(cache.path(), args), "after an edit");
}

// A file modified close to the run may change again within one tick of the file system's clock
// with every stat field as it was: its content is compared instead.
TEST(ResultCache, DoesNotTrustTheStatOfARecentlyModifiedFile) {
  ScopedTempDir dir;
  std::string path = dir.Path("a.vhd");
  WriteText(path, "entity a is end;\n");
  struct stat before {};
  ASSERT_EQ(::stat(path.c_str(), &before), 0);
  std::int64_t modified = before.st_mtim.tv_sec * 1'000'000'000LL + before.st_mtim.tv_nsec;

  std::optional<InputStamp> racy = InputStamp::Take(path, modified + InputStamp::kRacyNanoseconds / 2);
  std::optional<InputStamp> settled = InputStamp::Take(path, modified + 2 * InputStamp::kRacyNanoseconds);
  ASSERT_TRUE(racy && settled);
  EXPECT_TRUE(racy->racy);
  EXPECT_FALSE(settled->racy);
  EXPECT_TRUE(racy->Holds(before));
  EXPECT_TRUE(racy->Holds());

  WriteText(path, "entity b is end;\n");
  EXPECT_FALSE(racy->Holds(before)) << "same stat, other content";
  EXPECT_TRUE(settled->Holds(before)) << "an old file's stat is trusted";
  EXPECT_FALSE(settled->Holds()) << "the real stat moved";

  // Modified since the run started: what the run read is not known, nothing is stamped.
  EXPECT_FALSE(InputStamp::Take(path, modified));

  // A directory's content is its names.
  struct stat listed {};
  ASSERT_EQ(::stat(dir.path().c_str(), &listed), 0);
  std::int64_t changed = listed.st_ctim.tv_sec * 1'000'000'000LL + listed.st_ctim.tv_nsec;
  std::optional<InputStamp> folder = InputStamp::Take(dir.path(), changed + InputStamp::kRacyNanoseconds / 2);
  ASSERT_TRUE(folder && folder->directory && folder->racy);
  EXPECT_TRUE(folder->Holds(listed));
  WriteText(dir.Path("b.vhd"), "");
  EXPECT_FALSE(folder->Holds(listed));
}

}  // namespace
}  // namespace cli_test
