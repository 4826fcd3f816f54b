#include "DeveloperTextCapture.h"

#include <utility>

namespace quillon {

DeveloperTextCapture::DeveloperTextCapture()
    : previous_(Port_MsgManData::setDebugSink([this](std::string_view text) {
        text_.append(text);
        if (previous_) previous_(text);
      })) {}

DeveloperTextCapture::~DeveloperTextCapture() { Port_MsgManData::setDebugSink(std::move(previous_)); }

std::string DeveloperTextCapture::LastLineStartingWith(const std::string& lead) const {
  std::string found;
  for (std::size_t start = 0; start < text_.size();) {
    std::size_t end = text_.find('\n', start);
    if (end == std::string::npos) end = text_.size();
    if (text_.compare(start, lead.size(), lead) == 0) found = text_.substr(start, end - start);
    start = end + 1;
  }
  return found;
}

}  // namespace quillon
