#include "Port/Stream.h"

#include <sys/types.h>

#include <cstdlib>

#include "Port/StringBase.h"

namespace Port {

namespace {

// Removes "\n" or "\r\n" from the end of the first `length` bytes; returns the new length.
std::size_t WithoutLineEnd(const char* text, std::size_t length) {
  if (length == 0 || text[length - 1] != '\n') return length;
  --length;
  if (length > 0 && text[length - 1] == '\r') --length;
  return length;
}

}  // namespace

Stream::~Stream() {
  close();
  std::free(lineBuffer_);
}

std::size_t Stream::read(void* buffer, std::size_t size) {
  if (!file_ || !buffer || size == 0) return 0;
  return std::fread(buffer, 1, size, file_);
}

int Stream::readline(StringBase& line) {
  line.Empty();
  if (!file_) return 0;
  ssize_t length = ::getline(&lineBuffer_, &lineCapacity_, file_);
  if (length <= 0) return 0;
  line = std::string_view(lineBuffer_, WithoutLineEnd(lineBuffer_, static_cast<std::size_t>(length)));
  return 1;
}

bool Stream::geteof() const { return file_ && std::feof(file_) != 0; }

bool Stream::write(const void* data, std::size_t size) {
  if (!file_ || (!data && size > 0)) return false;
  if (size == 0) return true;
  if (std::fwrite(data, 1, size, file_) != size) {
    writeFailed_ = true;
    return false;
  }
  return true;
}

bool Stream::write(std::string_view text) { return write(text.data(), text.size()); }

bool Stream::puts(const char* text) { return text && write(std::string_view(text)); }

bool Stream::error() const { return writeFailed_ || (file_ && std::ferror(file_) != 0); }

bool Stream::close() {
  if (!file_) return false;
  bool written = std::fclose(file_) == 0 && !writeFailed_;
  file_ = nullptr;
  return written;
}

}  // namespace Port
