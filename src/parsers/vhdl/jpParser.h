// The driver of one VHDL parse: owns the open input file for as long as the grammar reads it.
#pragma once

#include <memory>
#include <optional>
#include <string>

#include "Port/Stream.h"
#include "VhdlStructure.h"

namespace Port {
class StringBase;
}

namespace Vad {

class CParserConfigHolder;

class jpParser {
 public:
  // Opens `path` for reading; IsOpen tells whether that succeeded.
  explicit jpParser(const Port::StringBase& path);
  // Closes the file if it was opened.
  ~jpParser();
  jpParser(const jpParser&) = delete;
  jpParser& operator=(const jpParser&) = delete;

  bool IsOpen() const { return input_ != nullptr; }
  // The system's reason why the open failed; empty when it succeeded or no reason was given.
  const std::string& OpenFailureReason() const { return openFailureReason_; }

  // Runs the grammar over the whole file, recording into `holder`. Does nothing when the file is
  // not open. False when the scanner ran out of memory and the parse stopped early.
  bool Run(CParserConfigHolder& holder, bool synthesisTarget);
  // The first syntax error that the last Run met, if any.
  const std::optional<VhdlStructure::Fault>& SyntaxError() const { return syntaxError_; }

 private:
  std::unique_ptr<Port::Stream> input_;
  std::string openFailureReason_;
  std::optional<VhdlStructure::Fault> syntaxError_;
};

}  // namespace Vad
