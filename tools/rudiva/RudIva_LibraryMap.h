// The library mapping file: one "name=directory" line per library. Names compare ignoring ASCII
// letter case, as library names are VHDL identifiers; white space around either side is dropped;
// empty lines, lines starting with '#' or ';' and section lines ("[...]") are ignored, as are
// lines longer than kMaxLineLength. The first line naming a library wins.
#pragma once

#include <cstddef>
#include <istream>
#include <optional>
#include <string>
#include <string_view>

namespace RudIva_LibraryMap {

constexpr std::size_t kMaxLineLength = 8192;

// The directory text of `library` as written, or nothing when no line names it.
std::optional<std::string> FindDirectory(std::istream& in, std::string_view library);

// `text` with every "$NAME" and "${NAME}" replaced by the environment variable's value (NAME made
// of letters, digits and '_'). Nothing when a variable is unset or a "${" is not closed; a '$'
// that starts no reference stays as written.
std::optional<std::string> ExpandVariables(std::string_view text);

}  // namespace RudIva_LibraryMap
