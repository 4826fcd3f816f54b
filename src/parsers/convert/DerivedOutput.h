// Gathers what a child process prints into a caller's string.
#pragma once

#include <cstdint>

#include "Port/ChildOutput.h"
#include "Port/StringBase.h"

namespace Vad {

// Text is taken while the caller's stop signal is 0; once the signal was seen non-zero, every
// later text is dropped, even if the signal returns to 0.
class DerivedOutput final : public Port::ChildOutput {
 public:
  DerivedOutput(Port::StringBase* target, const std::int32_t* stopSignal)
      : target_(target), stopSignal_(stopSignal) {}

  bool output(const char* text) override;
  void done() override {}

 private:
  Port::StringBase* target_;
  const std::int32_t* stopSignal_;
  bool stopped_ = false;
};

}  // namespace Vad
