#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <variant>
#include <vector>

#include "platform/foundation/FndDate.h"

namespace vantrell::cli {

inline constexpr int kStatusDone = 0;
inline constexpr int kStatusFailed = 1;
inline constexpr int kStatusWrongUsage = 2;

enum class Command : std::uint8_t { Ls, Item, Id, Path, Tag, Rank, Used, Doctor };

enum class ColorMode : std::uint8_t { Auto, Always, Never };

/// What `used` is to store.
enum class UsedChange : std::uint8_t { Date, Now, Clear };

/// What the command line asks for, with every number and date read already.
struct Arguments {
  Command command = Command::Doctor;
  std::string operand;  ///< the container, item or path, as the user wrote it

  std::vector<std::string> labels;    ///< for `tag`, in order
  std::optional<std::uint64_t> rank;  ///< for `rank`; none clears it
  UsedChange usedChange = UsedChange::Clear;
  std::optional<FndDate> usedDate;  ///< for `used` with a date

  std::optional<std::string> storage;
  bool json = false;
  bool verbose = false;
  bool print0 = false;
  ColorMode color = ColorMode::Auto;
};

/// Why there is nothing to do: help was asked for, or the usage was wrong.
struct NothingToRun {
  int status = kStatusDone;
  std::string text;   ///< for standard output when done, else the reason
  bool json = false;  ///< the reason is wanted as JSON
};

/// Reads the words after the program's name.
std::variant<Arguments, NothingToRun> parseArguments(const std::vector<std::string>& words);

}  // namespace vantrell::cli
