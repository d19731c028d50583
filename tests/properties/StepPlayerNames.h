#pragma once

#include <array>
#include <cstdint>
#include <string>

#include "ObservedTree.h"

namespace vantrell::properties {

// Few names, so that things come to stand in each other's places.
inline constexpr std::array<const char*, 15> kFileNames = {
    "a",  "b",         "letter.txt", "r\xff\xfe", "a~",    "b.bak", "letter.txt.TMP", "#a#", "~b",
    ".a", "a.tessera", "c",          "d",         "b.sav", "e"};
inline constexpr std::array<const char*, 6> kFolderNames = {"F",  "G",         "Documents",
                                                            ".H", "\xe9t\xe9", "F~"};
inline constexpr std::array<const char*, 4> kPackageNames = {"p.tessera", "q.tessera", "~p.tessera",
                                                             ".p.tessera"};
inline constexpr std::array<const char*, 6> kBackupEndings = {"~",    ".bak", ".orig",
                                                              ".old", ".sav", ".tmp"};
inline constexpr std::array<const char*, 3> kKeptAttributes = {
    "com.quillon.lastuseddate#PS", "com.quillon.favorite-rank.number#PS",
    "com.quillon.metadata:_kMDItemUserTags"};

template <std::size_t N>
std::string chosen(const std::array<const char*, N>& names, std::uint32_t number) {
  return names[number % N];
}

std::string folderOf(const std::string& path);
/// True when something has that name, a link that leads nowhere too.
bool exists(const std::string& path);
/// The name a program gives to what it sets aside: a package keeps its ending, or it would
/// become a folder.
std::string asideName(const Place& place, std::uint32_t number);
std::string temporaryName(const Place& place, std::uint32_t number);

}  // namespace vantrell::properties
