#pragma once

#include <functional>
#include <optional>
#include <string>
#include <string_view>

#include "platform/foundation/FndError.h"
#include "platform/foundation/FndURL.h"

namespace vantrell {

/// The host framework's operations that change files. Each is done whole or not at all, beneath
/// its root, and never replaces what is there: a collision is the foundation's
/// FileWriteFileExists with the colliding URL (`kDhCollidingURLKey`).
///
/// Threads: all members may be called from any thread; they return at once, and the completion
/// comes once, on any thread, with the resulting URL or an error.
class DhFileOperations {
 public:
  using Completion = std::move_only_function<void(Result<FndURL>)>;

  virtual ~DhFileOperations() = default;

  /// Copies the document, folder or package at `source` into `folder`.
  virtual void dh_importUnderFolder(const FndURL& source, const FndURL& folder,
                                    Completion completion) = 0;
  virtual void dh_createSubFolder(const FndURL& folder, std::string_view name,
                                  Completion completion) = 0;
  virtual void dh_renameWithNewName(const FndURL& item, std::string_view name,
                                    Completion completion) = 0;
  virtual void dh_reparentUnderFolder_withNewName(const FndURL& item, const FndURL& folder,
                                                  std::optional<std::string> name,
                                                  Completion completion) = 0;
  /// With bouncing, a taken name becomes "name 2.ext", "name 3.ext", … instead of a collision.
  virtual void dh_reparentUnderFolder_allowBouncing(const FndURL& item, const FndURL& folder,
                                                    bool allowBouncing, Completion completion) = 0;
  virtual void dh_trashUnderFolder(const FndURL& item, const FndURL& trashFolder,
                                   Completion completion) = 0;
  virtual void dh_delete(const FndURL& item,
                         std::move_only_function<void(std::optional<FndError>)> completion) = 0;
};

}  // namespace vantrell
