#include "linux/log/FileLogSink.h"

#include <fcntl.h>
#include <sys/stat.h>

#include <cstdio>
#include <utility>

#include "linux/log/LogText.h"
#include "linux/log/WriteWhole.h"

namespace vantrell::linuxos {

FileLogSink::FileLogSink(std::string path, Clock& clock, std::uint64_t largestSize)
    : _path(std::move(path)), _clock(clock), _largestSize(largestSize) {}

void FileLogSink::write(const LogLine& line) {
  const std::string text = logFileLine(line, _clock.now());
  const MutexLock lock(_mutex);
  // Another process may have rotated the file away, or a person may have removed it.
  if (!_file || !isStillAtItsPath()) {
    if (!openForAppending()) return;
  }
  rotateIfFull(text.size());
  if (!_file || !writeWhole(_file.get(), text)) _file = FileDescriptor();
}

bool FileLogSink::openForAppending() {
  // Not through a link that somebody may have put there, and never waiting for a FIFO's reader.
  constexpr int kAppend = O_WRONLY | O_CREAT | O_APPEND | O_NOFOLLOW | O_NONBLOCK | O_CLOEXEC;
  _file = FileDescriptor(::open(_path.c_str(), kAppend, 0600));
  return static_cast<bool>(_file);
}

void FileLogSink::rotateIfFull(std::uint64_t lineSize) {
  struct stat status;
  if (::fstat(_file.get(), &status) != 0 || !S_ISREG(status.st_mode)) {
    _file = FileDescriptor();
    return;
  }
  const auto size = static_cast<std::uint64_t>(status.st_size);
  if (size == 0 || size + lineSize <= _largestSize) return;
  if (std::rename(_path.c_str(), (_path + ".1").c_str()) != 0) {
    // A file that cannot be moved away must not grow for ever either.
    if (::ftruncate(_file.get(), 0) != 0) _file = FileDescriptor();
    return;
  }
  openForAppending();
}

bool FileLogSink::isStillAtItsPath() const {
  struct stat mine;
  struct stat there;
  return ::fstat(_file.get(), &mine) == 0 && ::lstat(_path.c_str(), &there) == 0 &&
         mine.st_ino == there.st_ino && mine.st_dev == there.st_dev;
}

}  // namespace vantrell::linuxos
