#pragma once

#include <map>
#include <string>
#include <string_view>
#include <vector>

#include "platform/types/TypeRegistry.h"

namespace vantrell {

/// A few kinds of content, told by the extension; more can be declared.
///
/// Threads: declare before it is used.
class FakeTypeRegistry : public TypeRegistry {
 public:
  /// Knows "txt" and "md" as text, "png" as a picture, and as packages "tessera", "brindle" (of
  /// the families whose sizes are told) and "pouch" (of another).
  FakeTypeRegistry();

  void declareFile(std::string extension, std::string type, std::vector<std::string> supertypes);
  void declarePackage(std::string extension, std::string type);
  void declareAlias(std::string alias, std::string type);

  std::string typeIdentifierForName(std::string_view name, FileKind kind) const override;
  bool typeConformsTo(std::string_view type, std::string_view supertype) const override;
  std::string descriptionOfType(std::string_view type) const override;

 private:
  std::string unaliased(std::string_view type) const;

  std::map<std::string, std::string, std::less<>> _files;     // by extension
  std::map<std::string, std::string, std::less<>> _packages;  // by extension
  std::map<std::string, std::string, std::less<>> _aliases;
  std::map<std::string, std::vector<std::string>, std::less<>> _supertypes;
};

}  // namespace vantrell
