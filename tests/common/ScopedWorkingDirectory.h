// Makes `dir` the current directory for one scope and returns to the previous one at its end.
#pragma once

#include <gtest/gtest.h>

#include <string>

#include "Port/File.h"
#include "Port/StringBase.h"

class ScopedWorkingDirectory {
 public:
  explicit ScopedWorkingDirectory(const std::string& dir) {
    EXPECT_TRUE(Port::File::getcwd(&saved_));
    EXPECT_TRUE(Port::File::chdir(dir.c_str())) << dir;
  }
  ScopedWorkingDirectory(const ScopedWorkingDirectory&) = delete;
  ScopedWorkingDirectory& operator=(const ScopedWorkingDirectory&) = delete;
  ~ScopedWorkingDirectory() { Port::File::chdir(saved_.c_str()); }

 private:
  Port::StringBase saved_;
};
