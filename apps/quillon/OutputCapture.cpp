#include "OutputCapture.h"

#include <fcntl.h>
#include <sys/mman.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstdio>
#include <iostream>

#include "Progress.h"

namespace quillon {

namespace {

bool WriteAll(int descriptor, const std::string& bytes) {
  std::size_t written = 0;
  while (written < bytes.size()) {
    ssize_t count = ::write(descriptor, bytes.data() + written, bytes.size() - written);
    if (count < 0 && errno == EINTR) continue;
    if (count <= 0) return false;
    written += static_cast<std::size_t>(count);
  }
  return true;
}

void CloseIfOpen(int& descriptor) {
  if (descriptor >= 0) ::close(descriptor);
  descriptor = -1;
}

}  // namespace

void OutputCapture::FlushStreams() {
  std::cout.flush();
  std::cerr.flush();
  std::fflush(stdout);
  std::fflush(stderr);
}

bool OutputCapture::OutputsShared() {
  struct stat out {
  }, err{};
  return ::fstat(STDOUT_FILENO, &out) == 0 && ::fstat(STDERR_FILENO, &err) == 0 && out.st_dev == err.st_dev &&
         out.st_ino == err.st_ino;
}

bool OutputCapture::Begin() {
  FlushStreams();
  bool shared = OutputsShared();
  savedOut_ = ::fcntl(STDOUT_FILENO, F_DUPFD_CLOEXEC, 3);
  savedErr_ = ::fcntl(STDERR_FILENO, F_DUPFD_CLOEXEC, 3);
  memoryOut_ = ::memfd_create("quillon-stdout", MFD_CLOEXEC);
  memoryErr_ = shared ? -1 : ::memfd_create("quillon-stderr", MFD_CLOEXEC);
  if (savedOut_ < 0 || savedErr_ < 0 || memoryOut_ < 0 || (!shared && memoryErr_ < 0) ||
      ::dup2(memoryOut_, STDOUT_FILENO) < 0 || ::dup2(shared ? memoryOut_ : memoryErr_, STDERR_FILENO) < 0) {
    End();
    return false;
  }
  // The progress line belongs to the terminal, not to the answer.
  Progress::ShowOn(savedErr_);
  return true;
}

std::string OutputCapture::Drain(int descriptor) {
  std::string bytes;
  if (descriptor < 0 || ::lseek(descriptor, 0, SEEK_SET) != 0) return bytes;
  char buffer[64 * 1024];
  for (;;) {
    ssize_t count = ::read(descriptor, buffer, sizeof buffer);
    if (count < 0 && errno == EINTR) continue;
    if (count <= 0) break;
    bytes.append(buffer, static_cast<std::size_t>(count));
  }
  return bytes;
}

OutputCapture::Captured OutputCapture::End() {
  Captured captured;
  if (savedOut_ < 0 && savedErr_ < 0) return captured;
  FlushStreams();
  Progress::ShowOn(STDERR_FILENO);
  if (savedOut_ >= 0) ::dup2(savedOut_, STDOUT_FILENO);
  if (savedErr_ >= 0) ::dup2(savedErr_, STDERR_FILENO);
  captured.shared = memoryErr_ < 0;
  captured.out = Drain(memoryOut_);
  captured.err = Drain(memoryErr_);
  for (int* descriptor : {&savedOut_, &savedErr_, &memoryOut_, &memoryErr_}) CloseIfOpen(*descriptor);
  return captured;
}

OutputCapture::~OutputCapture() { End(); }

bool OutputCapture::Emit(const Captured& captured) {
  // A message that standard error cannot take has nowhere else to go.
  if (!captured.shared) WriteAll(STDERR_FILENO, captured.err);
  return WriteAll(STDOUT_FILENO, captured.out);
}

}  // namespace quillon
