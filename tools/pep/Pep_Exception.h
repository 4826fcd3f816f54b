// The one kind of failure the port extractor reports; callers catch it around every use.
#pragma once

#include <stdexcept>

namespace Pep_Exception {

class Base : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

}  // namespace Pep_Exception
