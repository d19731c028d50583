#include <benchmark/benchmark.h>

#include <string>
#include <vector>

#include "platform/archive/KeyedArchive.h"
#include "platform/archive/PropertyList.h"
#include "platform/dochost/DhURLOperations.h"

namespace {

using namespace vantrell;

// What a document with three tags carries in its attribute.
FndData labelsArchive() {
  return *archivedDataWithRootObject(ArchiveValue(ArchiveValue::List{
      ArchiveValue(std::string("Important")), ArchiveValue(std::string("Taxes 2026")),
      ArchiveValue(std::string("grün"))}));
}

FndData dateArchive() {
  return *archivedDataWithRootObject(ArchiveValue(FndDate::fromUnixTime(1795287195, 250000000)));
}

// About a megabyte of dictionaries, strings, dates and numbers, each of its own.
FndData largeList() {
  PropertyListValue::Array records;
  for (std::uint64_t i = 0; i < 13000; ++i) {
    records.emplace_back(PropertyListValue::Dictionary{
        {"bundle", PropertyListValue("com.quillon.example.application." + std::to_string(i))},
        {"date", PropertyListValue(FndDate::fromUnixTime(static_cast<std::int64_t>(i)))},
        {"flags", PropertyListValue(FndNumber(i))},
        {"name", PropertyListValue("Größe " + std::to_string(i))}});
  }
  return *binaryPropertyListFromValue(PropertyListValue(std::move(records)));
}

void countBytes(benchmark::State& state, const FndData& bytes) {
  state.SetBytesProcessed(static_cast<std::int64_t>(state.iterations() * bytes.size()));
  state.counters["file_bytes"] = static_cast<double>(bytes.size());
}

void decodeLabels(benchmark::State& state) {
  const FndData bytes = labelsArchive();
  for ([[maybe_unused]] const auto turn : state) {
    benchmark::DoNotOptimize(
        unarchivedObjectOfClasses(bytes, {ArchiveClass::List, ArchiveClass::String}));
  }
  countBytes(state, bytes);
}
BENCHMARK(decodeLabels);

void decodeDate(benchmark::State& state) {
  const FndData bytes = dateArchive();
  for ([[maybe_unused]] const auto turn : state) {
    benchmark::DoNotOptimize(unarchivedObjectOfClasses(bytes, {ArchiveClass::Date}));
  }
  countBytes(state, bytes);
}
BENCHMARK(decodeDate);

void decodeLargeList(benchmark::State& state) {
  const FndData bytes = largeList();
  for ([[maybe_unused]] const auto turn : state) {
    benchmark::DoNotOptimize(valueFromBinaryPropertyList(bytes));
  }
  countBytes(state, bytes);
}
BENCHMARK(decodeLargeList)->Unit(benchmark::kMillisecond);

void encodeLargeList(benchmark::State& state) {
  const FndData bytes = largeList();
  const auto value = valueFromBinaryPropertyList(bytes);
  for ([[maybe_unused]] const auto turn : state) {
    benchmark::DoNotOptimize(binaryPropertyListFromValue(*value));
  }
  countBytes(state, bytes);
}
BENCHMARK(encodeLargeList)->Unit(benchmark::kMillisecond);

// One item against the roots of 200 app libraries, as the provider asks for each item.
void relationshipTo200Roots(benchmark::State& state) {
  std::vector<FndURL> roots;
  for (int i = 0; i < 200; ++i) {
    roots.push_back(FndURL::fileURLWithPath("/home/user/.var/app/com.quillon.example" +
                                            std::to_string(1000 + i) + "/Documents"));
  }
  const FndURL item = FndURL::fileURLWithPath(
      "/home/user/.var/app/com.quillon.example1199/Documents/Letters/2026/To the editor.txt");
  for ([[maybe_unused]] const auto turn : state) {
    int contained = 0;
    for (const FndURL& root : roots) {
      if (dh_relationshipToItemAtURL(root, item) == DhURLRelationship::Contains) ++contained;
    }
    benchmark::DoNotOptimize(contained);
  }
}
BENCHMARK(relationshipTo200Roots);

}  // namespace

BENCHMARK_MAIN();
