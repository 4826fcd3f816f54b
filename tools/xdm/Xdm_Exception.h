// The one kind of failure the netlist database reports; callers catch it around every use.
#pragma once

#include <stdexcept>

namespace Xdm_Exception {

class Base : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

}  // namespace Xdm_Exception
