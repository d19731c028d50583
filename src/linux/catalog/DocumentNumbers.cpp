#include "linux/catalog/DocumentNumbers.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <sys/xattr.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <cerrno>
#include <charconv>
#include <chrono>
#include <limits>
#include <optional>
#include <string_view>

#include "linux/FileDescriptor.h"
#include "linux/PosixError.h"

namespace vantrell::linuxos::catalog {

namespace {

constexpr std::uint64_t kBlock = 4096;
constexpr std::uint64_t kEnd = std::uint64_t{std::numeric_limits<std::uint32_t>::max()} + 1;
constexpr const char* kAttribute = "user.com.quillon.vantrell.document-ids";

// Both places hold the same text: the first number that is not reserved, in decimal, and a newline.
std::optional<std::uint64_t> parse(std::string_view text) {
  if (!text.ends_with('\n')) return std::nullopt;
  text.remove_suffix(1);
  std::uint64_t end = 0;
  const auto [rest, failure] = std::from_chars(text.data(), text.data() + text.size(), end);
  const bool isWhole = failure == std::errc() && rest == text.data() + text.size();
  return isWhole && end <= kEnd ? std::optional(end) : std::nullopt;
}

std::uint64_t secondsSince2024() {
  using namespace std::chrono;
  const auto start = sys_days(January / 1 / 2024);
  const auto now = duration_cast<seconds>(system_clock::now() - start).count();
  return now < 1 ? 1 : static_cast<std::uint64_t>(now);
}

FndError lastError() { return posixError(errno); }

}  // namespace

DocumentNumbers::DocumentNumbers(Database& database, std::string file, std::string storageRoot,
                                 LogLine log)
    : _file(std::move(file)),
      _storageRoot(std::move(storageRoot)),
      _log(std::move(log)),
      _read(database, "SELECT nextDocumentID, reservedDocumentID FROM state"),
      _write(database, "UPDATE state SET nextDocumentID = ?1, reservedDocumentID = ?2") {}

Result<DocumentID> DocumentNumbers::next() {
  auto stored = read();
  if (!stored) return std::unexpected(stored.error());
  const std::uint64_t number = firstFree(*stored);
  if (number >= kEnd) return std::unexpected(posixError(EOVERFLOW));
  if (number >= stored->reserved) {
    stored->reserved = std::min(number + kBlock, kEnd);
    if (auto done = reserve(stored->reserved); !done) return std::unexpected(done.error());
  }
  _isUsed = true;
  if (auto done = _write.with(number + 1, stored->reserved).run(); !done) {
    return std::unexpected(done.error());
  }
  return DocumentID{static_cast<std::uint32_t>(number)};
}

// A database from a backup may know of the same block and of fewer numbers used in it. So every
// process begins behind what is reserved, and who stops in good order leaves nothing reserved.
std::uint64_t DocumentNumbers::firstFree(const Stored& stored) const {
  if (_isUsed && stored.next < stored.reserved) return stored.next;
  const std::uint64_t elsewhere = std::max(readFile(), readAttribute());
  const std::uint64_t known = _isUsed ? stored.next : std::max(stored.next, stored.reserved);
  return std::max({known, elsewhere > stored.reserved ? elsewhere : 0, secondsSince2024()});
}

Result<void> DocumentNumbers::release() {
  if (!_isUsed) return {};
  const auto stored = read();
  if (!stored) return std::unexpected(stored.error());
  if (auto done = reserve(stored->next); !done) return done;
  return _write.with(stored->next, stored->next).run();
}

Result<DocumentNumbers::Stored> DocumentNumbers::read() {
  const auto row = _read.with().step();
  if (!row) return std::unexpected(row.error());
  const Stored stored{_read.bits(0), _read.bits(1)};
  _read.reset();
  return stored;
}

Result<void> DocumentNumbers::reserve(std::uint64_t end) {
  if (auto written = writeFile(end); !written) return written;
  writeAttribute(end);
  return {};
}

Result<void> DocumentNumbers::writeFile(std::uint64_t end) const {
  const std::string text = std::to_string(end) + "\n";
  const std::string temporary = _file + ".new";
  {
    FileDescriptor file(::open(temporary.c_str(), O_WRONLY | O_CREAT | O_TRUNC | O_CLOEXEC, 0600));
    if (!file) return std::unexpected(lastError());
    const ssize_t count = ::write(file.get(), text.data(), text.size());
    if (count < 0) return std::unexpected(lastError());
    if (static_cast<std::size_t>(count) != text.size()) return std::unexpected(posixError(ENOSPC));
    if (::fsync(file.get()) != 0) return std::unexpected(lastError());
    if (::close(file.release()) != 0) return std::unexpected(lastError());
  }
  if (::rename(temporary.c_str(), _file.c_str()) != 0) return std::unexpected(lastError());
  const std::string folder = _file.substr(0, _file.rfind('/') + 1);
  const FileDescriptor directory(::open(folder.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC));
  if (!directory || ::fsync(directory.get()) != 0) return std::unexpected(lastError());
  return {};
}

void DocumentNumbers::writeAttribute(std::uint64_t end) const {
  const std::string text = std::to_string(end) + "\n";
  const FileDescriptor root(
      ::open(_storageRoot.c_str(), O_RDONLY | O_DIRECTORY | O_NOFOLLOW | O_CLOEXEC));
  if (root && ::fsetxattr(root.get(), kAttribute, text.data(), text.size(), 0) == 0 &&
      ::fsync(root.get()) == 0) {
    return;
  }
  const int osError = errno;
  _log(LogLevel::Debug, "can't keep the reserved document IDs at \"" + _storageRoot + "\"; " +
                            posixError(osError).message());
}

std::uint64_t DocumentNumbers::readFile() const {
  const FileDescriptor file(::open(_file.c_str(), O_RDONLY | O_NOFOLLOW | O_NONBLOCK | O_CLOEXEC));
  const int osError = errno;
  if (!file && osError == ENOENT) return 0;
  std::array<char, 64> text{};
  const ssize_t count = file ? ::read(file.get(), text.data(), text.size()) : -1;
  const auto end = count < 0 ? std::nullopt : parse({text.data(), static_cast<std::size_t>(count)});
  if (!end) {
    _log(LogLevel::Error, "can't read the reserved document IDs in \"" + _file +
                              "\"; the attribute of the storage folder and the clock decide");
  }
  return end.value_or(0);
}

std::uint64_t DocumentNumbers::readAttribute() const {
  std::array<char, 64> text{};
  const ssize_t count = ::lgetxattr(_storageRoot.c_str(), kAttribute, text.data(), text.size());
  if (count < 0) return 0;
  return parse({text.data(), static_cast<std::size_t>(count)}).value_or(0);
}

}  // namespace vantrell::linuxos::catalog
