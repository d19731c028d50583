// What a guess and a question of conformance cost, on the machine's own database.

#include <benchmark/benchmark.h>

#include "linux/types/SharedMimeTypes.h"

namespace vantrell::linuxos {
namespace {

const SharedMimeTypes& types() {
  static const SharedMimeTypes kTypes({.dataFolders = {"/usr/share"}, .packageTypeFolders = {}});
  return kTypes;
}

void guess(benchmark::State& state, const char* name, FileKind kind) {
  for (auto _ : state) benchmark::DoNotOptimize(types().typeIdentifierForName(name, kind));
}
BENCHMARK_CAPTURE(guess, suffix, "Quarterly report.pdf", FileKind::RegularFile);
BENCHMARK_CAPTURE(guess, upperCaseSuffix, "IMG_20260101.JPG", FileKind::RegularFile);
BENCHMARK_CAPTURE(guess, twoSuffixes, "backup-2026.tar.gz", FileKind::RegularFile);
BENCHMARK_CAPTURE(guess, literal, "Makefile", FileKind::RegularFile);
BENCHMARK_CAPTURE(guess, nothingKnown, "a name without any suffix", FileKind::RegularFile);
BENCHMARK_CAPTURE(guess, manyDots, "a.b.c.d.e.f.g.h.i.j.k", FileKind::RegularFile);
BENCHMARK_CAPTURE(guess, folder, "Pictures 2026", FileKind::Directory);

void conforms(benchmark::State& state, const char* type, std::string_view supertype) {
  for (auto _ : state) benchmark::DoNotOptimize(types().typeConformsTo(type, supertype));
}
BENCHMARK_CAPTURE(conforms, fileToFolder, "application/pdf", kFolderTypeIdentifier);
BENCHMARK_CAPTURE(conforms, fileToPackage, "application/pdf", kPackageTypeIdentifier);
BENCHMARK_CAPTURE(conforms, folderToFolder, "inode/directory", kFolderTypeIdentifier);
BENCHMARK_CAPTURE(conforms, folderToPackage, "inode/directory", kPackageTypeIdentifier);
BENCHMARK_CAPTURE(conforms, sourceToText, "text/x-c++src", "text/plain");

void load(benchmark::State& state) {
  for (auto _ : state) {
    const SharedMimeTypes loaded({.dataFolders = {"/usr/share"}, .packageTypeFolders = {}});
    benchmark::DoNotOptimize(loaded.databaseFolders().size());
  }
}
BENCHMARK(load)->Unit(benchmark::kMillisecond);

}  // namespace
}  // namespace vantrell::linuxos

BENCHMARK_MAIN();
