#include "tests/fakes/FakeExtendedAttributes.h"

#include <algorithm>
#include <cerrno>

namespace vantrell {

Result<FndData> FakeExtendedAttributes::valueOf(const FndURL& url, std::string_view name) {
  const auto node = _tree.find(url.path());
  if (!node) return std::unexpected(node.error());
  const auto& attributes = (*node)->attributes;
  const bool isKind =
      (*node)->kind == FileKind::RegularFile || (*node)->kind == FileKind::Directory;
  if (isKind && !(*node)->isReadable()) return std::unexpected(FndError::posix(EACCES));
  const auto found = attributes.find(name);
  if (found == attributes.end()) return std::unexpected(FndError::posix(ENODATA));
  return found->second;
}

Result<std::size_t> FakeExtendedAttributes::sizeOfAttribute(const FndURL& url,
                                                            std::string_view name) {
  const std::lock_guard lock(_tree.mutex);
  if (auto error = _tree.faults.next(FakeCall::SizeOfAttribute, url.path())) {
    return std::unexpected(*error);
  }
  const auto value = valueOf(url, name);
  if (!value) return std::unexpected(value.error());
  return value->size();
}

Result<std::size_t> FakeExtendedAttributes::copyAttribute(const FndURL& url, std::string_view name,
                                                          std::span<std::uint8_t> buffer) {
  const std::lock_guard lock(_tree.mutex);
  if (auto error = _tree.faults.next(FakeCall::CopyAttribute, url.path())) {
    return std::unexpected(*error);
  }
  const auto value = valueOf(url, name);
  if (!value) return std::unexpected(value.error());
  if (value->size() > buffer.size()) return std::unexpected(FndError::posix(ERANGE));
  std::ranges::copy(*value, buffer.begin());
  return value->size();
}

}  // namespace vantrell
