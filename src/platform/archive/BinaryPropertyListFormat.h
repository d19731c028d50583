#pragma once

#include <array>
#include <cstddef>
#include <cstdint>

// A binary property list, all numbers big-endian:
//
//   "bplist00"
//   objects           a marker byte each (type in the high half, "n" in the low), then its body
//                       00001000  false              00001001  true
//                       0001nnnn  integer of 2^n bytes: 1, 2, 4 unsigned; 8, 16 two's complement
//                       0010nnnn  real, IEEE 754, of 2^n bytes: 4 or 8
//                       00110011  date: a double, seconds since 2001-01-01 UTC
//                       0100nnnn  data of n bytes
//                       0101nnnn  ASCII string of n bytes
//                       0110nnnn  UTF-16 string of n two-byte units
//                       1000nnnn  UID of n + 1 bytes
//                       1010nnnn  array: n references
//                       1101nnnn  dictionary: n references to keys, then n to values
//                     An n of 15 where it counts says that an integer object follows the marker
//                     and holds the count. A reference is an object's number.
//   offset table      where each object begins in the file, in the order of their numbers
//   trailer           6 bytes unused
//                     1 byte   bytes in an entry of the offset table
//                     1 byte   bytes in a reference
//                     8 bytes  number of objects
//                     8 bytes  number of the top object
//                     8 bytes  where the offset table begins
//
// Ours are written so: the top object is number 0, and what a container holds follows it, depth
// first, a dictionary in the order of its keys' bytes. Equal scalars of at most 64 bytes are one
// object. Containers are never one object, however equal: a reader that limits what sharing may
// unfold to can then always take what we wrote. Every size is the least of 1, 2, 4, 8 bytes
// that does.

namespace vantrell::bplist {

inline constexpr std::array<std::uint8_t, 8> kMagic = {'b', 'p', 'l', 'i', 's', 't', '0', '0'};
inline constexpr std::size_t kTrailerSize = 32;

/// The high half of a marker.
enum class Type : std::uint8_t {
  Truth = 0x0,
  Integer = 0x1,
  Real = 0x2,
  Date = 0x3,
  Data = 0x4,
  Ascii = 0x5,
  Utf16 = 0x6,
  UID = 0x8,
  Array = 0xa,
  Dictionary = 0xd,
};

inline constexpr std::uint8_t kFalseMarker = 0x08;
inline constexpr std::uint8_t kTrueMarker = 0x09;
/// In the low half of a marker: the count follows.
inline constexpr std::uint8_t kCountFollows = 0xf;

/// Marker and body of a scalar that is written once, however often it stands in a list.
inline constexpr std::size_t kLongestSharedScalar = 64;

}  // namespace vantrell::bplist
