// What is wrong with one value of a netlist database file, before it is known where the value
// sits. The reader that knows the place turns it into the Xdm_Exception::Base that callers see;
// it never leaves the reader itself.
#pragma once

#include <stdexcept>
#include <string>

#include "xdm/Xdm_Exception.h"

class Xdm_FormatProblem : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;

  // The message callers see: `netlist database "<file>": <problem>`, or with a non-empty
  // `location` (a JSON pointer such as "/designs/0/views/1") `netlist database "<file>" at
  // <location>: <problem>`.
  static Xdm_Exception::Base Error(const std::string& file, const std::string& location,
                                   const std::string& problem);

  Xdm_Exception::Base At(const std::string& file, const std::string& location) const {
    return Error(file, location, what());
  }
};
