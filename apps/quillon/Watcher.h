// quillon watch: keeps the project in memory, waits for changes to its files (inotify on their
// directories), parses the changed files again and prints the view (order, tree or check) each
// time its answer changes; with --format json one JSON object a line. SIGINT and SIGTERM end it
// with status 0.
#pragma once

#include <map>
#include <memory>
#include <set>
#include <string>

#include "IHdlFile.h"
#include "ModuleLoader.h"
#include "Options.h"
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
    bool stop = false;
  };

  bool Reload();
  void Refresh();
  void WatchDirectories();
  // Waits for events, then gathers those that follow within a short pause.
  Changes Wait();
  void Take(Changes& changes);
  void MarkChanged(const std::set<std::string>& paths);

  Options options_;  // the view as the command
  ModuleLoader module_;
  ProjectSources sources_;
  std::unique_ptr<ProjectBuilder> builder_;
  std::set<std::string> sourcePaths_;
  std::set<std::string> settingPaths_;      // project files and lists
  std::map<int, std::string> directories_;  // by watch descriptor
  std::string lastOutput_;
  int inotify_ = -1;
  int signals_ = -1;
};

}  // namespace quillon
