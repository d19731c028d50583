// make_corpus FOLDER: writes the files that the fuzzers begin with below FOLDER.

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iostream>

#include "platform/archive/KeyedArchive.h"
#include "platform/archive/PropertyList.h"
#include "tests/support/RawPropertyList.h"

namespace {

using namespace vantrell;
using Archived = ArchiveValue;
using Listed = PropertyListValue;

const FndDate kDate = FndDate::fromUnixTime(1795287195, 250000000);

void write(const std::filesystem::path& file, const Result<FndData>& bytes) {
  std::filesystem::create_directories(file.parent_path());
  std::ofstream stream(file, std::ios::binary);
  if (bytes) {
    stream.write(reinterpret_cast<const char*>(bytes->data()),
                 static_cast<std::streamsize>(bytes->size()));
  }
  if (!bytes || !stream.flush()) {
    std::cerr << "cannot write " << file << "\n";
    std::exit(1);
  }
}

FndData strangersList(std::size_t referenceSize, std::size_t offsetSize) {
  RawPropertyList list(referenceSize, offsetSize);
  list.addString("key");
  list.add(bytesFromHex("14 0000000000000000 ffffffffffffffff"));
  list.add(bytesFromHex("62 d83d de00"));
  list.add(bytesFromHex("22 3fc00000"));
  list.add(bytesFromHex("87 00000000 00000001"));
  list.addArray({1, 2, 3, 4, 2});
  list.setTop(list.addDictionary({0, 2}, {5, 5}));
  return list.bytes();
}

void writePropertyLists(const std::filesystem::path& folder) {
  const Listed all(Listed::Array{
      Listed(FndNumber(true)), Listed(FndNumber(1UL)), Listed(FndNumber(UINT64_MAX)),
      Listed(FndNumber(-1L)), Listed(FndNumber(2.5)), Listed(kDate), Listed(std::string("text")),
      Listed(std::string("grün 😀")), Listed(FndData{1, 2, 3}), Listed(PropertyListUID{7}),
      Listed(Listed::Array{}), Listed(Listed::Dictionary{})});
  write(folder / "all-types", binaryPropertyListFromValue(all));
  write(folder / "dictionary",
        binaryPropertyListFromValue(Listed(Listed::Dictionary{
            {"a", Listed(FndNumber(65536UL))}, {"d", Listed(std::string(36, '0'))}, {"l", all}})));
  write(folder / "long", binaryPropertyListFromValue(Listed(Listed::Array{
                             Listed(std::string(300, 'x')), Listed(FndData(20, 0))})));
  write(folder / "wide-1-1", strangersList(1, 1));
  write(folder / "wide-3-5", strangersList(3, 5));
  write(folder / "wide-8-8", strangersList(8, 8));
  RawPropertyList doubling;
  for (std::uint64_t i = 0; i < 8; ++i) doubling.addArray({i + 1, i + 1});
  doubling.addArray({});
  write(folder / "doubling", doubling.bytes());
}

void writeArchives(const std::filesystem::path& folder) {
  const Archived record(Archived::Record{
      "FndApp", {{"name", Archived(std::string("a"))}, {"$class", Archived(FndNumber(false))}}});
  write(folder / "date", archivedDataWithRootObject(Archived(kDate)));
  write(folder / "number", archivedDataWithRootObject(Archived(FndNumber(3UL))));
  write(folder / "string", archivedDataWithRootObject(Archived(std::string("Documents/a.txt"))));
  write(folder / "labels", archivedDataWithRootObject(Archived(Archived::List{
                               Archived(std::string("Red")), Archived(std::string("grün")),
                               Archived(std::string("Red"))})));
  write(folder / "tags",
        archivedDataWithRootObject(Archived(Archived::List{Archived(Archived::Dictionary{
            {"label", Archived(std::string("Red"))}, {"color", Archived(FndNumber(6UL))}})})));
  write(folder / "record", archivedDataWithRootObject(Archived(Archived::Dictionary{
                               {"none", Archived()},
                               {"data", Archived(FndData{1, 2})},
                               {"records", Archived(Archived::List{record, record})}})));
}

}  // namespace

int main(int argc, char** argv) {
  if (argc != 2) {
    std::cerr << "usage: make_corpus FOLDER\n";
    return 2;
  }
  const std::filesystem::path folder(argv[1]);
  writePropertyLists(folder / "property_list");
  writeArchives(folder / "keyed_archive");
  return 0;
}
