#pragma once

#include <memory>

#include "linux/filesystem/EntryInHand.h"
#include "linux/filesystem/Places.h"
#include "platform/foundation/FndURL.h"

namespace vantrell::linuxos {

/// Where a URL's object is to be asked for: an opened folder and a name in it.
///
/// Lifetime: the URL must outlive it.
class ObjectSpot {
 public:
  /// Opens the URL's folder without following links, unless the URL is the entry in hand.
  static OsResult<ObjectSpot> of(const FndURL& url);

  int folder() const { return _entry != nullptr ? _entry->folder() : _place.folder.get(); }
  /// Ends in NUL.
  const char* name() const { return _entry != nullptr ? _entry->name() : _place.name.data(); }

 private:
  Place _place;
  std::shared_ptr<const EntryInHand> _entry;
};

}  // namespace vantrell::linuxos
