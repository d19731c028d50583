#pragma once

#include <string>

#include "platform/devinfo/Devinfo.h"

namespace vantrell::linuxos {

/// What kind of machine this is, from its firmware: the DMI chassis type, or the chassis type of
/// the device tree.
///
/// Handhelds and phones are class 1, tablets class 3. Every other machine is 100 plus the number
/// that the DMI standard gives its chassis (9: laptop, 23: rack server, ...), and 102 when nothing
/// is known: numbers that cannot be taken for the other two.
///
/// Threads: all members may be called from any thread.
class LinuxDevinfo : public Devinfo {
 public:
  /// Reads below `root`: "/" is this machine.
  explicit LinuxDevinfo(const std::string& root = "/");

  int deviceClassNumber() const override { return _deviceClassNumber; }
  double mainScreenScale() const override { return 1.0; }

 private:
  int _deviceClassNumber;
};

}  // namespace vantrell::linuxos
