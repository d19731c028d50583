#pragma once

namespace vantrell {

/// Facts about the machine that do not change while it runs.
class Devinfo {
 public:
  virtual ~Devinfo() = default;
  /// "DeviceClassNumber": 1 for a phone, 3 for a tablet, other numbers for other machines.
  virtual int deviceClassNumber() const = 0;
  /// "main-screen-scale": pixels to a point; 1.0 where no display is known.
  virtual double mainScreenScale() const = 0;
};

}  // namespace vantrell
