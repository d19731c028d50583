#include "linux/catalog/Generations.h"

#include <fcntl.h>

#include <array>
#include <cerrno>
#include <cstddef>
#include <cstring>
#include <span>

namespace vantrell::linuxos::catalog {

namespace {

std::uint64_t fnv1a(std::uint64_t hash, std::span<const unsigned char> bytes) {
  for (const unsigned char byte : bytes) hash = (hash ^ byte) * 0x100000001B3ULL;
  return hash;
}

std::optional<std::uint64_t> birthTimeOf(int folder, const char* name) {
  struct statx status {};
  const int flags = AT_SYMLINK_NOFOLLOW | AT_NO_AUTOMOUNT | AT_EMPTY_PATH;
  if (::statx(folder, name, flags, STATX_BTIME, &status) != 0) return std::nullopt;
  // Without a birth time every object of one number counts as the same: better than telling
  // one object from itself.
  if ((status.stx_mask & STATX_BTIME) == 0) return 0;
  return static_cast<std::uint64_t>(status.stx_btime.tv_sec) * 1'000'000'000U +
         status.stx_btime.tv_nsec;
}

}  // namespace

std::optional<std::uint64_t> generationOf(int folder, const char* name) {
  alignas(struct file_handle) std::array<unsigned char, sizeof(file_handle) + MAX_HANDLE_SZ> room;
  auto* const handle = reinterpret_cast<struct file_handle*>(room.data());
  handle->handle_bytes = MAX_HANDLE_SZ;
  int mountID = 0;
  const int failed = ::name_to_handle_at(folder, name, handle, &mountID, AT_EMPTY_PATH);
  const int osError = errno;
  if (failed == 0) {
    const auto type = static_cast<unsigned char>(handle->handle_type);
    const std::uint64_t start = fnv1a(0xCBF29CE484222325ULL, std::span(&type, 1));
    return fnv1a(start, std::span(room).subspan(sizeof(file_handle), handle->handle_bytes));
  }
  if (osError == ENOENT || osError == ENOTDIR) return std::nullopt;
  return birthTimeOf(folder, name);
}

}  // namespace vantrell::linuxos::catalog
