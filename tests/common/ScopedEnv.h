// Sets (or, with a null value, removes) an environment variable for one scope.
#pragma once

#include <optional>
#include <string>

#include "Port/Env.h"

class ScopedEnv {
 public:
  ScopedEnv(const char* name, const char* value) : name_(name) {
    if (const char* old = Port_Env::GetEnv(name)) saved_ = old;
    Apply(value);
  }
  ~ScopedEnv() { Apply(saved_ ? saved_->c_str() : nullptr); }
  ScopedEnv(const ScopedEnv&) = delete;
  ScopedEnv& operator=(const ScopedEnv&) = delete;

 private:
  void Apply(const char* value) const {
    if (value) {
      Port_Env::SetEnv(name_.c_str(), value);
    } else {
      Port_Env::UnsetEnv(name_.c_str());
    }
  }

  std::string name_;
  std::optional<std::string> saved_;
};
