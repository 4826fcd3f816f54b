// Reads the tool suite's netlist databases; type slot 1 names the database format.
#pragma once

#include "Parser.h"

class Xdm_Model;

namespace Vad {

class PlxParser : public Parser {
 public:
  // Records one module named after the top block of the database's first view, with the type of
  // slot 1; a database that cannot be read is reported and gives a module named after the file
  // instead. Always 1.
  int Parse(CParserConfigHolder& holder) override;

 private:
  // True when the database was read and its module recorded.
  bool ReadDatabase(const char* path, CParserConfigHolder& holder) const;
  void RecordTopBlock(Xdm_Model& model, CParserConfigHolder& holder) const;
};

}  // namespace Vad
