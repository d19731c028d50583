// One start of the system: look STORAGE STATE-FOLDER
//
// The first one with an empty state folder builds the catalog; later ones find what changed.
// Prints one line of JSON: milliseconds until all is durable, entries seen, differences, memory.

#include <cstdio>

#include "bench/Measuring.h"
#include "linux/system/LinuxSystem.h"
#include "linux/system/XdgFolders.h"

using namespace vantrell;

int main(int argc, char** argv) {
  if (argc != 3) {
    std::fputs("usage: look STORAGE STATE-FOLDER\n", stderr);
    return 2;
  }
  linuxos::LinuxSystemOptions options;
  options.storageRoot = argv[1];
  options.stateFolder = argv[2];
  options.dataFolders = linuxos::XdgFolders::ofThisProcess().dataFolders();

  const auto start = bench::Clock::now();
  auto system = linuxos::LinuxSystem::open(options);
  if (!system) return bench::failed(system.error());
  const auto look = (*system)->look();
  if (!look) return bench::failed(look.error());
  const double milliseconds = bench::millisecondsSince(start);
  std::printf(
      "{\"milliseconds\": %.3f, \"lookMilliseconds\": %.3f, \"entries\": %lu, "
      "\"differences\": %lu, \"peakBytes\": %lu}\n",
      milliseconds, std::chrono::duration<double, std::milli>(look->duration).count(),
      look->entriesSeen, look->created + look->gone + look->moved + look->changed + look->replaced,
      bench::peakBytes());
  return 0;
}
