#include "Port/FileName.h"

#include <string>
#include <vector>

#include "Port/File.h"

namespace Port {

namespace {

std::string_view TailOf(std::string_view path) {
  std::size_t slash = path.rfind('/');
  return slash == std::string_view::npos ? path : path.substr(slash + 1);
}

// Position of the dot that starts the extension of `tail`, or npos.
std::size_t ExtensionDot(std::string_view tail) {
  std::size_t dot = tail.rfind('.');
  if (dot == std::string_view::npos || dot == 0 || dot + 1 == tail.size()) return std::string_view::npos;
  return dot;
}

// Resolves "." and ".." of an absolute path by text.
std::string Normalised(std::string_view absolute) {
  std::vector<std::string_view> parts;
  std::size_t position = 0;
  while (position <= absolute.size()) {
    std::size_t slash = absolute.find('/', position);
    if (slash == std::string_view::npos) slash = absolute.size();
    std::string_view part = absolute.substr(position, slash - position);
    if (part == "..") {
      if (!parts.empty()) parts.pop_back();
    } else if (!part.empty() && part != ".") {
      parts.push_back(part);
    }
    position = slash + 1;
  }
  std::string result;
  for (std::string_view part : parts) {
    result += '/';
    result += part;
  }
  return result.empty() ? "/" : result;
}

bool AbsoluteBase(const char* baseDirectory, std::string* base) {
  if (baseDirectory && FileName::IsAbsolute(baseDirectory)) {
    *base = baseDirectory;
    return true;
  }
  StringBase current;
  if (!File::getcwd(&current)) return false;
  *base = baseDirectory ? FileName::Join(current.view(), baseDirectory).str() : current.str();
  return true;
}

}  // namespace

bool FileName::MakeCanonical(StringBase* path, const char* baseDirectory) {
  if (!path) return false;
  if (IsAbsolute(path->view())) {
    *path = StringBase(Normalised(path->view()));
    return true;
  }
  std::string base;
  if (!AbsoluteBase(baseDirectory, &base)) return false;
  *path = StringBase(Normalised(Join(base, path->view()).view()));
  return true;
}

StringBase FileName::GetBase(std::string_view path) {
  std::string_view tail = TailOf(path);
  return StringBase(tail.substr(0, ExtensionDot(tail)));
}

StringBase FileName::GetExtension(std::string_view path) {
  std::string_view tail = TailOf(path);
  std::size_t dot = ExtensionDot(tail);
  return dot == std::string_view::npos ? StringBase() : StringBase(tail.substr(dot + 1));
}

StringBase FileName::GetHead(std::string_view path) {
  std::size_t slash = path.rfind('/');
  return slash == std::string_view::npos ? StringBase() : StringBase(path.substr(0, slash + 1));
}

StringBase FileName::GetTail(std::string_view path) { return StringBase(TailOf(path)); }

bool FileName::IsAbsolute(std::string_view path) { return !path.empty() && path.front() == '/'; }

StringBase FileName::Join(std::string_view directory, std::string_view name) {
  if (directory.empty() || IsAbsolute(name)) return StringBase(name);
  std::string joined(directory);
  if (joined.back() != '/') joined += '/';
  joined += name;
  return StringBase(std::move(joined));
}

}  // namespace Port
