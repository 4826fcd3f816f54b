// quillon watch: keeps the project in memory, waits for changes to its files (inotify on their
// directories), parses the changed files again and prints the view (order, tree or check) each
// time its answer changes; with --format json one JSON object a line. A change that leaves every
// changed file's records and parse messages as they were changes no answer and costs no
// elaboration. The -y/-v library search is done again whenever a source changes; a message is
// printed once, and again only after it went away. SIGINT and SIGTERM end it with status 0.
#pragma once

#include <map>
#include <memory>
#include <set>
#include <string>
#include <vector>

#include "DesignModel.h"
#include "IHdlFile.h"
#include "ModuleLoader.h"
#include "Options.h"
#include "Port/MsgMan.h"
#include "ProjectBuilder.h"
#include "ProjectSources.h"

namespace quillon {

class Watcher {
 public:
  explicit Watcher(const Options& options);
  ~Watcher();
  Watcher(const Watcher&) = delete;
  Watcher& operator=(const Watcher&) = delete;

  // The exit status.
  int Run();

 private:
  // What the events since the last refresh ask for.
  struct Changes {
    std::set<std::string> sources;  // sources to parse again
    bool reload = false;            // the file set or the settings may have changed
    bool search = false;            // a -y directory changed
    bool stop = false;
  };

  // What a file's last parse here gave: its records (store keys numbered in order of appearance,
  // as every parse makes new ones) and its messages.
  struct Parsed {
    std::vector<UnitInfo> units;
    std::vector<Port_MsgRecord> messages;
    bool operator==(const Parsed&) const;
  };

  bool Reload();
  // Builds the project of `sources`, after the library search; false after saying why not.
  bool Build(ProjectSources sources);
  // Adds the -y and -v files the sources need.
  static bool SearchLibraries(ProjectSources& sources, std::string& error);
  // Builds the project again when the library search now takes other files; whether it did.
  bool FollowLibrarySearch();
  // Parses the changed files; whether any came out other than before (or was not seen before).
  bool ParseChanged(const std::set<std::string>& paths);
  void Refresh();
  // Writes the messages of a refresh that were not shown by the one before.
  void ShowNewMessages(const std::string& text);
  void WatchPaths();
  void WatchDirectories();
  // Waits for events, then gathers those that follow within a short pause.
  Changes Wait();
  void Take(Changes& changes);
  std::vector<Vad::IHdlFile*> FilesAt(const std::set<std::string>& paths) const;

  Options options_;  // the view as the command
  ModuleLoader module_;
  ProjectSources loaded_;   // as the arguments give them, before the library search
  ProjectSources sources_;  // of the project built
  std::unique_ptr<ProjectBuilder> builder_;
  std::set<std::string> sourcePaths_;
  std::set<std::string> settingPaths_;  // project files and lists
  std::set<std::string> libraryDirectories_;
  std::map<int, std::string> directories_;  // by watch descriptor
  std::map<std::string, Parsed> parsed_;    // by path, of the files parsed here since the build
  std::string lastOutput_;
  std::set<std::string> shownMessages_;
  int inotify_ = -1;
  int signals_ = -1;
};

}  // namespace quillon
