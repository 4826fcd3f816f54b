// A whole run's answer as the result cache keeps it: the key it answers, the stamps of the files
// it read, its exit status and what it wrote to standard output and standard error.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "InputStamp.h"
#include "OutputCapture.h"

namespace quillon {

struct StoredRun {
  static constexpr std::uint32_t kFormatVersion = 1;

  std::string key;
  std::vector<InputStamp> inputs;
  std::int32_t status = 0;
  OutputCapture::Captured output;

  std::string Encode() const;
  // False, with the run in an unspecified state, for bytes that are cut, damaged, of another
  // format or version, or longer than the run.
  bool Decode(std::string_view bytes);
};

}  // namespace quillon
