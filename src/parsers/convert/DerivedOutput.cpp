#include "DerivedOutput.h"

#include "Port/InitObjects.h"

namespace Vad {

bool DerivedOutput::output(const char* text) {
  if (!text || stopped_) return true;
  if (*stopSignal_ == 0) {
    target_->Append(text);
  } else {
    stopped_ = true;
  }
  return true;
}

}  // namespace Vad
