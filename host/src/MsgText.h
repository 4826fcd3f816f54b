// Text helpers shared by the message sources of the host library.
#pragma once

#include <cstdarg>
#include <string>
#include <string_view>
#include <vector>

namespace Port::MsgText {

// The printf-style result, of any length. When the arguments cannot be formatted the format text
// itself is returned, so that the message is not lost.
std::string FormatV(const char* format, std::va_list args);

// The lines of a message as wide strings: split at '\n' (a final '\n' ends the last line, so ""
// and "\n" are one empty line), then wrapped at `maxWidth` characters when it is positive, at the
// last blank inside the width (which is dropped) or, without one, right at the width. Bytes the
// current locale cannot convert become '?'; null characters are dropped.
std::vector<std::wstring> SplitLines(std::string_view text, int maxWidth);

// The multibyte form of `line` in the current locale; characters it cannot express become '?'.
std::string Narrow(std::wstring_view line);

}  // namespace Port::MsgText
