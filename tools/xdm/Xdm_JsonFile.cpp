#include "xdm/Xdm_JsonFile.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>

#include "xdm/Xdm_FileFormat.h"
#include "xdm/Xdm_FormatProblem.h"

namespace {

class OpenFile {
 public:
  // Non-blocking, so that opening a FIFO without a writer returns at once instead of waiting.
  explicit OpenFile(const std::string& path) : fd_(::open(path.c_str(), O_RDONLY | O_CLOEXEC | O_NONBLOCK)) {}
  OpenFile(const OpenFile&) = delete;
  OpenFile& operator=(const OpenFile&) = delete;
  ~OpenFile() {
    if (fd_ >= 0) ::close(fd_);
  }
  int fd() const { return fd_; }

 private:
  int fd_;
};

std::string CannotRead(int error) {
  return std::string(Xdm_JsonFile::kCannotReadMessage) + " (" + std::strerror(error) + ")";
}

}  // namespace

nlohmann::json Xdm_JsonFile::Load(const std::string& file) { return Parse(ReadText(file), file); }

std::string Xdm_JsonFile::ReadText(const std::string& file) {
  OpenFile input(file);
  struct stat status {};
  if (input.fd() < 0 || ::fstat(input.fd(), &status) != 0) {
    throw Xdm_FormatProblem::Error(file, "", CannotRead(errno));
  }
  if (!S_ISREG(status.st_mode)) {
    throw Xdm_FormatProblem::Error(file, "", kNotRegularFileMessage);
  }
  if (static_cast<std::uint64_t>(status.st_size) > Xdm_FileFormat::kMaxFileBytes) {
    throw Xdm_FormatProblem::Error(file, "", kTooLargeMessage);
  }
  std::string text(static_cast<std::size_t>(status.st_size), '\0');
  std::size_t length = 0;
  for (;;) {
    // A file that grows while it is read is still held to the limit: read one byte past it.
    if (length == text.size()) {
      if (text.size() > Xdm_FileFormat::kMaxFileBytes) {
        throw Xdm_FormatProblem::Error(file, "", kTooLargeMessage);
      }
      text.resize(text.size() + 64 * 1024);
    }
    ssize_t got = ::read(input.fd(), text.data() + length, text.size() - length);
    if (got < 0 && errno == EINTR) continue;
    if (got < 0) throw Xdm_FormatProblem::Error(file, "", CannotRead(errno));
    if (got == 0) break;
    length += static_cast<std::size_t>(got);
  }
  text.resize(length);
  return text;
}

namespace {

// Whether containers nest deeper than `limit` outside the strings of the text.
bool NestsDeeperThan(const std::string& text, int limit) {
  int depth = 0;
  bool inString = false;
  for (std::size_t at = 0; at < text.size(); ++at) {
    const char c = text[at];
    if (inString) {
      if (c == '\\') {
        ++at;
      } else if (c == '"') {
        inString = false;
      }
    } else if (c == '"') {
      inString = true;
    } else if (c == '{' || c == '[') {
      if (++depth > limit) return true;
    } else if ((c == '}' || c == ']') && depth > 0) {
      --depth;
    }
  }
  return false;
}

}  // namespace

nlohmann::json Xdm_JsonFile::Parse(const std::string& text, const std::string& file) {
  // The parser takes a NUL byte for the end of its input and would ignore whatever follows.
  if (text.find('\0') != std::string::npos) {
    throw Xdm_FormatProblem::Error(file, "", std::string(kNotJsonMessage) + " (it holds a NUL byte)");
  }
  // Checked in one pass ahead of the parser: a parse callback would make the parser rescan the
  // parent container at the end of every child, quadratic in the number of siblings.
  if (NestsDeeperThan(text, Xdm_FileFormat::kMaxJsonDepth))
    throw Xdm_FormatProblem::Error(file, "", kTooDeepMessage);
  try {
    return nlohmann::json::parse(text);
  } catch (const Xdm_FormatProblem& problem) {
    throw problem.At(file, "");
  } catch (const nlohmann::json::exception& error) {
    throw Xdm_FormatProblem::Error(file, "", std::string(kNotJsonMessage) + " (" + error.what() + ")");
  }
}
