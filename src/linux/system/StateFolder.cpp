#include "linux/system/StateFolder.h"

#include <fcntl.h>
#include <sys/file.h>
#include <sys/stat.h>

#include <array>
#include <cerrno>
#include <optional>
#include <string_view>
#include <utility>

#include "platform/foundation/PosixNames.h"

namespace vantrell::linuxos {
namespace {

constexpr std::chrono::milliseconds kPause{20};

enum class LockAttempt { Taken, HeldByAnother, FileReplaced };

FndError unavailable(std::string message) {
  return FndError::vantrell(VantrellErrorCode::StateUnavailable, std::move(message));
}

FndError unusable(const std::string& path, int osError) {
  return unavailable("The state folder \"" + path +
                     "\" cannot be used: " + posixErrorText(osError) + ".");
}

// Errors are errno values: mkdir says EEXIST for a file too, and stat tells which it is.
int createFolders(const std::string& path) {
  for (std::size_t end = path.find('/', 1);; end = path.find('/', end + 1)) {
    const std::string folder = path.substr(0, end);
    if (::mkdir(folder.c_str(), 0700) != 0 && errno != EEXIST) return errno;
    if (end == std::string::npos) break;
  }
  struct stat found;
  if (::stat(path.c_str(), &found) != 0) return errno;
  return S_ISDIR(found.st_mode) ? 0 : ENOTDIR;
}

// True when `path` still names the locked file: a lock on a file that somebody has removed keeps
// nobody out.
bool isStillThere(const std::string& path, int lock) {
  struct stat byPath;
  struct stat byDescriptor;
  return ::stat(path.c_str(), &byPath) == 0 && ::fstat(lock, &byDescriptor) == 0 &&
         byPath.st_ino == byDescriptor.st_ino && byPath.st_dev == byDescriptor.st_dev;
}

std::string holderOf(int lock) {
  std::array<char, 32> text;
  const ssize_t count = ::pread(lock, text.data(), text.size(), 0);
  const std::string_view written(text.data(), count > 0 ? static_cast<std::size_t>(count) : 0);
  const std::string_view digits = written.substr(0, written.find_first_not_of("0123456789"));
  // The holder writes its number right after taking the lock: for that instant it has no name.
  return digits.empty() ? "Another process" : "Process " + std::string(digits);
}

void nameHolder(int lock) {
  const std::string text = std::to_string(::getpid()) + "\n";
  // Only a message would miss what cannot be written here; the lock holds without it.
  if (::ftruncate(lock, 0) == 0) (void)!::pwrite(lock, text.data(), text.size(), 0);
}

Result<LockAttempt> tryLock(const std::string& path, const std::string& lockPath,
                            FileDescriptor& lock) {
  lock = FileDescriptor(
      ::open(lockPath.c_str(), O_RDWR | O_CREAT | O_CLOEXEC | O_NOFOLLOW | O_NONBLOCK, 0600));
  if (!lock) return std::unexpected(unusable(path, errno));
  if (::flock(lock.get(), LOCK_EX | LOCK_NB) != 0) {
    const int osError = errno;
    if (osError == EWOULDBLOCK || osError == EINTR) return LockAttempt::HeldByAnother;
    return std::unexpected(unusable(path, osError));
  }
  return isStillThere(lockPath, lock.get()) ? LockAttempt::Taken : LockAttempt::FileReplaced;
}

}  // namespace

Result<StateFolder> StateFolder::take(std::string path, Clock& clock) {
  if (const int osError = createFolders(path)) return std::unexpected(unusable(path, osError));
  const std::string lockPath = path + "/lock";
  for (auto waited = kPause.zero();; waited += kPause) {
    FileDescriptor lock;
    const auto attempt = tryLock(path, lockPath, lock);
    if (!attempt) return std::unexpected(attempt.error());
    if (*attempt == LockAttempt::Taken) {
      nameHolder(lock.get());
      return StateFolder(std::move(path), std::move(lock));
    }
    if (waited >= kPatience) {
      return std::unexpected(unavailable(holderOf(lock.get()) + " is using the state folder \"" +
                                         path + "\". Try again when it has finished."));
    }
    clock.rest(kPause);
  }
}

StateFolder::~StateFolder() {
  // A number left behind would be told as the holder's in the instant before the next one's.
  if (_lock) (void)!::ftruncate(_lock.get(), 0);
}

}  // namespace vantrell::linuxos
