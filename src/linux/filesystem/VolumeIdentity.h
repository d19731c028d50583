#pragma once

#include <string>

#include "linux/filesystem/ObjectStatus.h"
#include "linux/filesystem/Places.h"
#include "platform/foundation/FndUUID.h"

namespace vantrell::linuxos {

/// The identity that the file system of the opened folder was made with; none when it has none
/// that a program may ask for.
std::optional<FndUUID> fileSystemUUID(int folder);

/// The identity of the block device among the links in `folder` ("/dev/disk/by-uuid"), which
/// also serves kernels that do not tell it themselves.
std::optional<FndUUID> blockDeviceUUID(const std::string& folder, dev_t device);

/// The identity kept in the attribute of `root`, which is opened for reading; one is made, and is
/// durable, when there is none that was made for this folder.
OsResult<FndUUID> keptVolumeUUID(int root, FileID rootID);

}  // namespace vantrell::linuxos
