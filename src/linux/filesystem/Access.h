#pragma once

#include "linux/filesystem/ObjectStatus.h"

namespace vantrell::linuxos {

/// What is known of the mount an object lies on.
enum class MountAccess : std::uint8_t { Unknown, ReadWrite, ReadOnly };

/// The access of the mount that holds the opened folder.
MountAccess mountAccessOf(int folder);

/// What this process may do with an object.
struct ObjectAccess {
  bool readable = false;
  bool writable = false;
};

/// The access of `user`, who is the effective one, to `name` in `folder`, as the kernel would
/// grant it. `mount` is that of the folder; with `Unknown` the kernel is asked.
ObjectAccess accessTo(int folder, const char* name, const ObjectStatus& status, MountAccess mount,
                      uid_t user);

}  // namespace vantrell::linuxos
