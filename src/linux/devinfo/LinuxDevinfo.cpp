#include "linux/devinfo/LinuxDevinfo.h"

#include <array>
#include <charconv>
#include <fstream>
#include <optional>
#include <string_view>
#include <utility>

namespace vantrell::linuxos {
namespace {

constexpr int kPhone = 1;
constexpr int kTablet = 3;
constexpr int kOthersBase = 100;
constexpr int kUnknownChassis = 2;
constexpr int kHandheldChassis = 11;
constexpr int kTabletChassis = 30;
constexpr int kLastChassis = 36;

// The chassis names of the device tree and the DMI numbers for the same.
constexpr std::array<std::pair<std::string_view, int>, 8> kTreeNames = {{{"desktop", 3},
                                                                         {"laptop", 9},
                                                                         {"convertible", 31},
                                                                         {"server", 23},
                                                                         {"tablet", 30},
                                                                         {"handset", 11},
                                                                         {"watch", 2},
                                                                         {"embedded", 34}}};

std::string firstWord(const std::string& path) {
  std::ifstream file(path, std::ios::binary);
  std::string word;
  char c = 0;
  // The device tree's strings end in NUL, the other files' in a newline.
  while (word.size() < 64 && file.get(c) && c != '\0' && c != '\n') word += c;
  return word;
}

std::optional<int> chassisFromDMI(const std::string& root) {
  const std::string text = firstWord(root + "/sys/class/dmi/id/chassis_type");
  int chassis = 0;
  const auto parsed = std::from_chars(text.data(), text.data() + text.size(), chassis);
  if (parsed.ec != std::errc() || parsed.ptr != text.data() + text.size()) return std::nullopt;
  if (chassis < 1 || chassis > kLastChassis) return std::nullopt;
  return chassis;
}

std::optional<int> chassisFromDeviceTree(const std::string& root) {
  const std::string text = firstWord(root + "/proc/device-tree/chassis-type");
  for (const auto& [name, chassis] : kTreeNames) {
    if (text == name) return chassis;
  }
  return std::nullopt;
}

int classOfChassis(int chassis) {
  if (chassis == kHandheldChassis) return kPhone;
  if (chassis == kTabletChassis) return kTablet;
  return kOthersBase + chassis;
}

}  // namespace

LinuxDevinfo::LinuxDevinfo(const std::string& root) {
  auto chassis = chassisFromDMI(root);
  if (!chassis) chassis = chassisFromDeviceTree(root);
  _deviceClassNumber = classOfChassis(chassis.value_or(kUnknownChassis));
}

}  // namespace vantrell::linuxos
