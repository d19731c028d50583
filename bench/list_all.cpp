// Every item below a storage folder as a full record: list_all STORAGE STATE-FOLDER
//
// Starts the host as a program that serves one command does, then lists every folder through the
// extension's module. Prints one line of JSON: items, milliseconds for the start and for listing
// alone, memory.

#include <cstdio>
#include <deque>
#include <string>

#include "bench/Measuring.h"
#include "host/EmbeddedHost.h"

using namespace vantrell;

namespace {

/// Lists folder after folder, and reads every field of every record.
class Listing {
 public:
  explicit Listing(DochostExtension& extension) : _extension(extension) {}

  Result<void> run() {
    _folders.emplace_back(DochostRootContainerItemIdentifier);
    for (; !_folders.empty(); _folders.pop_front()) {
      const auto take = [this](const std::vector<DochostItemRef>& items) {
        for (const DochostItemRef& item : items) read(*item);
        return true;
      };
      const auto listed = _extension._listItemsInContainer_pageHandler(_folders.front(), take);
      if (!listed) return listed;
    }
    return {};
  }

  std::uint64_t items() const { return _items; }
  /// Depends on every field, so that none can be left out.
  std::uint64_t sum() const { return _sum; }

 private:
  void read(const DochostItem& item) {
    ++_items;
    if (item.childItemCount()) _folders.push_back(item.itemIdentifier());
    _sum += item.itemIdentifier().size() + item.parentItemIdentifier().size() +
            item.filename().size() + item.typeIdentifier().size() +
            item.documentSize().value_or(0) + item.childItemCount().value_or(0) +
            item.capabilities() + static_cast<std::uint64_t>(item.isTrashed());
    for (const auto& date :
         {item.creationDate(), item.contentModificationDate(), item.lastUsedDate()}) {
      if (date) _sum += date->nanoseconds();
    }
    if (item.versionIdentifier()) _sum += item.versionIdentifier()->size();
    if (item.tagData()) _sum += item.tagData()->size();
    _sum += item.favoriteRank().value_or(0);
  }

  DochostExtension& _extension;
  std::deque<std::string> _folders;
  std::uint64_t _items = 0;
  std::uint64_t _sum = 0;
};

int measure(const std::string& storage, const std::string& stateFolder) {
  const auto folders = linuxos::XdgFolders::ofThisProcess();
  auto places = host::EmbeddedHost::places(storage, folders);
  if (!places) return bench::failed(places.error());
  places->stateFolder = stateFolder;

  const auto start = bench::Clock::now();
  const auto embedded = host::EmbeddedHost::start(std::move(*places), false);
  if (!embedded) return bench::failed(embedded.error());
  const double startMilliseconds = bench::millisecondsSince(start);

  Listing listing((*embedded)->extension());
  const auto listingStart = bench::Clock::now();
  const auto listed = listing.run();
  const double milliseconds = bench::millisecondsSince(listingStart);
  if (!listed) return bench::failed(listed.error());
  std::printf(
      "{\"items\": %lu, \"milliseconds\": %.3f, \"startMilliseconds\": %.3f, "
      "\"residentBytes\": %lu, \"peakBytes\": %lu, \"sum\": %lu}\n",
      listing.items(), milliseconds, startMilliseconds, bench::residentBytes(), bench::peakBytes(),
      listing.sum());
  return 0;
}

}  // namespace

int main(int argc, char** argv) {
  if (argc != 3) {
    std::fputs("usage: list_all STORAGE STATE-FOLDER\n", stderr);
    return 2;
  }
  return measure(argv[1], argv[2]);
}
