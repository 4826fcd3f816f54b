// A fresh temporary directory for one test, removed with everything in it at the end.
#pragma once

#include <gtest/gtest.h>

#include <string>
#include <string_view>

#include "Port/File.h"
#include "Port/StringBase.h"

class ScopedTempDir {
 public:
  ScopedTempDir() {
    Port::StringBase dir;
    EXPECT_TRUE(Port::File::mkdtemp(&dir));
    path_ = dir.str();
  }
  ScopedTempDir(const ScopedTempDir&) = delete;
  ScopedTempDir& operator=(const ScopedTempDir&) = delete;
  ~ScopedTempDir() {
    if (!path_.empty()) Port::File::remove_r(path_.c_str());
  }

  const std::string& path() const { return path_; }
  std::string Path(std::string_view name) const { return path_ + "/" + std::string(name); }

 private:
  std::string path_;
};
