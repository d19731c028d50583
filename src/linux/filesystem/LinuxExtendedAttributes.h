#pragma once

#include "platform/filesystem/FileSystem.h"

namespace vantrell::linuxos {

/// How an attribute is read relative to an opened folder.
enum class AttributeReading : std::uint8_t {
  RelativeCall,  ///< getxattrat(2), since Linux 6.13: one call
  ThroughProc,   ///< by the folder's link in /proc: works everywhere, and takes longer
};

/// The faster way that this kernel has.
AttributeReading bestAttributeReading();

/// Extended attributes in Linux's "user." namespace. The prefix is added and taken away here and
/// in `LinuxOpenFile`, and nobody else knows of it.
///
/// Threads: all members may be called from any thread.
class LinuxExtendedAttributes : public ExtendedAttributes {
 public:
  explicit LinuxExtendedAttributes(AttributeReading reading = bestAttributeReading());

  Result<std::size_t> sizeOfAttribute(const FndURL& url, std::string_view name) override;
  Result<std::size_t> copyAttribute(const FndURL& url, std::string_view name,
                                    std::span<std::uint8_t> buffer) override;

 private:
  AttributeReading _reading;
};

}  // namespace vantrell::linuxos
