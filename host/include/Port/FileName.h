// Path text helpers. They work on the text alone ('/' separates, as on this host); only
// MakeCanonical may ask for the current directory.
#pragma once

#include <string_view>

#include "Port/StringBase.h"

namespace Port {

class FileName {
 public:
  // Makes `path` absolute against `baseDirectory` (itself made absolute against the current
  // directory when relative; the current directory when null), resolves "." and ".." by text
  // (".." at the root stays at the root) and removes duplicate and trailing slashes. An empty
  // path gives the base directory. False for a null path or when the current directory is
  // needed and cannot be had; the path is then unchanged.
  static bool MakeCanonical(StringBase* path, const char* baseDirectory = nullptr);

  // "dir/top.v" -> "top". The file name without its directory and its last extension.
  static StringBase GetBase(std::string_view path);
  // "dir/top.v" -> "v". After the last dot of the file name; empty when there is none, and for
  // the leading dot of a hidden file (".cfg") or a dot that ends the name ("top.").
  static StringBase GetExtension(std::string_view path);
  // "dir/top.v" -> "dir/". The directory part with its trailing '/', empty when there is none.
  static StringBase GetHead(std::string_view path);
  // "dir/top.v" -> "top.v". The file name with its extension.
  static StringBase GetTail(std::string_view path);

  static bool IsAbsolute(std::string_view path);
  // `name` when it is absolute or `directory` is empty, else `directory` + '/' + `name` with
  // one slash between them.
  static StringBase Join(std::string_view directory, std::string_view name);
};

}  // namespace Port
