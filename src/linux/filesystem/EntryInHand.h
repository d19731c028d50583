#pragma once

#include <memory>
#include <string>

#include "linux/FileDescriptor.h"
#include "platform/foundation/FndURL.h"

namespace vantrell::linuxos {

/// The entry that an enumeration has just given, with the folder it was read from. Whoever asks
/// about that very URL object on the same thread, before the next entry is taken, is answered
/// through the folder: the entry is what stood there, and nothing needs to be resolved again.
/// Without this, one record of a listing would resolve the same folder five times.
///
/// Threads: an entry is in the hand of the thread that took it.
class EntryInHand {
 public:
  EntryInHand(FndURL url, std::shared_ptr<const FileDescriptor> folder);

  /// The folder's descriptor.
  int folder() const { return _folder->get(); }
  /// Ends in NUL.
  const char* name() const { return _url.lastPathComponent().data(); }

  /// Puts `entry` into the calling thread's hand; it stays there while its owner keeps it.
  static void take(const std::shared_ptr<const EntryInHand>& entry);
  /// The entry when it is the one that `url` was made for, else null.
  static std::shared_ptr<const EntryInHand> find(const FndURL& url);

 private:
  FndURL _url;
  // Shared with the enumeration: an answer may be under way on one thread while another goes on.
  std::shared_ptr<const FileDescriptor> _folder;
};

}  // namespace vantrell::linuxos
