// A source of tokens for the port extractor's token stream: one implementation per language.
#pragma once

#include "pep/PepToken.h"

class PepLexer {
 public:
  virtual ~PepLexer() = default;
  // The next token; a kEnd token at the end of the text and on every later call.
  virtual PepToken Next() = 0;
};
