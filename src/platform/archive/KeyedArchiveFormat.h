#pragma once

#include <cstddef>
#include <cstdint>
#include <string_view>

// A keyed archive is a property list:
//
//   { "$archiver": "FndKeyedArchiver",
//     "$objects": [ "$null", object, object, … ],
//     "$top": { "root": UID },
//     "$version": 100000 }
//
// A UID is a place in "$objects"; UID 0 is null. An object is one of
//
//   a string, a number, data        as they are
//   { "$class": UID, … }            an instance of the class at that place, with its fields:
//       FndDate                     "Fnd.time": seconds since 2001-01-01 UTC, a real
//       FndArray                    "Fnd.objects": [ UID, … ]
//       FndDictionary               "Fnd.keys": [ UID, … ] of strings, "Fnd.objects": [ UID, … ]
//       any other                   a record: each field is a UID, or a string, number or data
//                                   itself; a field's name that begins with "$" has one "$" more
//   { "$classes": [ "FndArray", "FndObject" ], "$classname": "FndArray" }
//                                   a class: its own name, and those of it and all above it
//
// Ours are written so: an object stands before what it holds, in order; a class stands behind
// what its first instance holds. Equal numbers, dates, data and strings of at most 64
// bytes are one object; containers never are.

namespace vantrell::keyedarchive {

inline constexpr std::string_view kVersionKey = "$version";
inline constexpr std::string_view kArchiverKey = "$archiver";
inline constexpr std::string_view kTopKey = "$top";
inline constexpr std::string_view kObjectsKey = "$objects";
inline constexpr std::string_view kRootKey = "root";
inline constexpr std::string_view kClassKey = "$class";
inline constexpr std::string_view kClassNameKey = "$classname";
inline constexpr std::string_view kClassesKey = "$classes";
inline constexpr std::string_view kTimeKey = "Fnd.time";
inline constexpr std::string_view kElementsKey = "Fnd.objects";
inline constexpr std::string_view kKeysKey = "Fnd.keys";

inline constexpr std::string_view kArchiver = "FndKeyedArchiver";
inline constexpr std::string_view kNull = "$null";
inline constexpr std::string_view kBaseClass = "FndObject";
inline constexpr std::uint64_t kVersion = 100000;

/// The most bytes of a value that is written once, however often it stands in an archive.
inline constexpr std::size_t kLongestShared = 64;

/// True for what `archiveClassName` gives: no record may be called so.
bool isReservedClassName(std::string_view name);

}  // namespace vantrell::keyedarchive
