// The driver of one parse of a hierarchy description by its grammar: owns the open input file
// for as long as the grammar reads it. The caller chooses the holder's type slots beforehand.
#pragma once

#include <memory>
#include <string>

#include "Port/Stream.h"

namespace Port {
class StringBase;
}

namespace Vad {

class CParserConfigHolder;

class qhParser {
 public:
  // Written to standard output when the file cannot be opened.
  static constexpr const char* kFileNotFound = "ERROR: Quillon.dll: HrfParser: File not found\n";

  // Opens `path` for reading; the parse records into `holder`.
  qhParser(const Port::StringBase& path, CParserConfigHolder& holder);
  // Closes the file if it was opened.
  ~qhParser();
  qhParser(const qhParser&) = delete;
  qhParser& operator=(const qhParser&) = delete;

  // 0 after the message above when the file is not open; otherwise the grammar's result: 0 when
  // the file was read to its end, 1 when the parse was abandoned, 2 when its stack overflowed.
  int Parse();

 private:
  std::unique_ptr<Port::Stream> input_;
  std::string path_;
  CParserConfigHolder& holder_;
};

}  // namespace Vad
