#include "pep/PepSourceFile.h"

#include <filesystem>
#include <fstream>
#include <system_error>

PepSourceFile::Status PepSourceFile::Load(const std::string& path, std::string& text) {
  std::error_code error;
  if (!std::filesystem::is_regular_file(path, error) || error) return Status::kUnreadable;
  std::uintmax_t size = std::filesystem::file_size(path, error);
  if (error) return Status::kUnreadable;
  if (size > kMaxSize) return Status::kTooLarge;
  std::ifstream in(path, std::ios::binary);
  if (!in) return Status::kUnreadable;
  text.assign(static_cast<std::size_t>(size), '\0');
  in.read(text.data(), static_cast<std::streamsize>(size));
  // A file that shrank while it was read keeps what could be read.
  text.resize(static_cast<std::size_t>(in.gcount()));
  if (in.bad()) return Status::kUnreadable;
  return Status::kRead;
}
