#include "linux/filesystem/EntryInHand.h"

#include <utility>

namespace vantrell::linuxos {
namespace {

thread_local std::weak_ptr<const EntryInHand> inHand;

}  // namespace

EntryInHand::EntryInHand(FndURL url, std::shared_ptr<const FileDescriptor> folder)
    : _url(std::move(url)), _folder(std::move(folder)) {}

void EntryInHand::take(const std::shared_ptr<const EntryInHand>& entry) { inHand = entry; }

std::shared_ptr<const EntryInHand> EntryInHand::find(const FndURL& url) {
  std::shared_ptr<const EntryInHand> entry = inHand.lock();
  // The same object, not an equal path: an entry is held for those who were given it.
  if (entry != nullptr && &entry->_url.path() != &url.path()) entry.reset();
  return entry;
}

}  // namespace vantrell::linuxos
