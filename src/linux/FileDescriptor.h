#pragma once

#include <unistd.h>

#include <utility>

namespace vantrell::linuxos {

/// Owns an open file descriptor; -1 owns none.
class FileDescriptor {
 public:
  FileDescriptor() = default;
  explicit FileDescriptor(int fd) : _fd(fd) {}
  FileDescriptor(FileDescriptor&& other) noexcept : _fd(std::exchange(other._fd, -1)) {}
  FileDescriptor& operator=(FileDescriptor&& other) noexcept {
    if (this != &other) reset(std::exchange(other._fd, -1));
    return *this;
  }
  ~FileDescriptor() { reset(-1); }

  int get() const { return _fd; }
  explicit operator bool() const { return _fd >= 0; }
  int release() { return std::exchange(_fd, -1); }

 private:
  void reset(int fd) {
    if (_fd >= 0) ::close(_fd);
    _fd = fd;
  }

  int _fd = -1;
};

}  // namespace vantrell::linuxos
