#pragma once

#include <string>
#include <string_view>

namespace vantrell::testing {

/// A folder of a test's own, gone with it, however deep it has become.
class TemporaryFolder {
 public:
  TemporaryFolder();
  ~TemporaryFolder();
  TemporaryFolder(const TemporaryFolder&) = delete;
  TemporaryFolder& operator=(const TemporaryFolder&) = delete;

  /// Canonical.
  const std::string& path() const { return _path; }
  std::string path(std::string_view name) const;

  // Each makes what it says below the folder and answers its path. `name` may hold folders, which
  // must be there.
  std::string makeFolder(std::string_view name) const;
  std::string writeFile(std::string_view name, std::string_view bytes = "") const;
  std::string makeLink(std::string_view name, const std::string& target) const;
  std::string makeFifo(std::string_view name) const;
  std::string makeSocket(std::string_view name) const;

 private:
  std::string _path;
};

/// Takes the rights of root away from the whole process for a scope; an ordinary user stays one.
class AsOrdinaryUser {
 public:
  AsOrdinaryUser();
  ~AsOrdinaryUser();
  AsOrdinaryUser(const AsOrdinaryUser&) = delete;
  AsOrdinaryUser& operator=(const AsOrdinaryUser&) = delete;

 private:
  bool _wasRoot;
};

/// The value of an attribute as the kernel tells it, prefix and all; "(none)" when there is none.
std::string rawAttribute(const std::string& path, const std::string& fullName);

}  // namespace vantrell::testing
