// One port of a design unit as the port extractor reports it.
#pragma once

#include <string>

struct PepPort {
  static constexpr int kDirectionIn = 0;
  static constexpr int kDirectionOut = 1;
  static constexpr int kDirectionInOut = 2;

  std::string name;
  std::string typeName;
  int direction = kDirectionIn;
  // The bounds as the range is written (7 and 0 for "7 downto 0" or [7:0]); readers order them.
  int left = 0;
  int right = 0;
  bool hasRange = false;
};
