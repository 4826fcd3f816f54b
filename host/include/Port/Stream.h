// A buffered stream on an open file. Streams come from Port::File::open; the destructor closes.
#pragma once

#include <cstddef>
#include <cstdio>
#include <string_view>

namespace Port {

class StringBase;
class File;

class Stream {
 public:
  ~Stream();
  Stream(const Stream&) = delete;
  Stream& operator=(const Stream&) = delete;

  // Reads up to `size` bytes; returns the number read, 0 at end of file, on error or for a null
  // buffer.
  std::size_t read(void* buffer, std::size_t size);

  // Reads the next line, of any length, into `line` without its line end ("\n" or "\r\n").
  // Returns 0 at end of file when nothing was read (or on a read error), else 1; a last line
  // without a line end still gives 1.
  int readline(StringBase& line);

  // True once a read has reached the end of the file.
  bool geteof() const;

  // Writes the bytes as they are; false when not all of them could be written.
  bool write(const void* data, std::size_t size);
  bool write(std::string_view text);
  // Writes the text without adding a line end; false for null or when the write fails.
  bool puts(const char* text);

  // True once a read or write has failed.
  bool error() const;

  // Flushes and closes at once; false when pending output could not be written. Later
  // operations fail quietly.
  bool close();

 private:
  friend class File;
  explicit Stream(std::FILE* adopted) : file_(adopted) {}

  std::FILE* file_ = nullptr;
  bool writeFailed_ = false;
  char* lineBuffer_ = nullptr;  // getline's buffer, kept between calls
  std::size_t lineCapacity_ = 0;
};

}  // namespace Port
