// Tells which files changed on disk since it was last asked, so that the cache need not look at
// every file of a long compile line each time. It watches the directories of the files it is given
// (through the kernel's file notification); files it cannot watch it never vouches for, and the
// cache then reads their stamp every time.
#pragma once

#include <string>
#include <unordered_map>
#include <vector>

namespace Hx_Vci {

class VerilogFileWatch {
 public:
  struct Changes {
    bool all = false;  // changes may have been missed: take every watched file as changed
    std::vector<std::string> paths;
  };

  VerilogFileWatch();
  VerilogFileWatch(const VerilogFileWatch&) = delete;
  VerilogFileWatch& operator=(const VerilogFileWatch&) = delete;
  ~VerilogFileWatch();

  bool Available() const { return descriptor_ >= 0; }

  // Reports changes of `path` (which need not exist) from now on, until it is reported changed or
  // forgotten; true when it is watched. A path reported changed must be watched again.
  bool Watch(const std::string& path);
  void Forget(const std::string& path);
  // The watched paths changed since the last call; each is no longer watched.
  Changes Collect();

 private:
  struct Directory {
    std::string path;
    // entry name -> the watched paths that name it
    std::unordered_map<std::string, std::vector<std::string>> entries;
  };

  void Unwatch(const std::string& path, int watch);
  void DropDirectory(int watch, Changes* changes);
  void ReportEntry(int watch, const std::string& name, Changes* changes);

  int descriptor_ = -1;
  std::unordered_map<int, Directory> directories_;  // by watch
  std::unordered_map<std::string, int> watchOfDirectory_;
  std::unordered_map<std::string, int> watchOfPath_;
};

}  // namespace Hx_Vci
