#include "cli/ItemArgument.h"

#include <array>
#include <filesystem>
#include <optional>
#include <string_view>
#include <system_error>
#include <utility>

#include "linux/PosixError.h"
#include "platform/Services.h"
#include "platform/dochost/DhURLOperations.h"
#include "platform/dochost/DochostErrors.h"

namespace vantrell::cli {
namespace {

constexpr std::array<std::pair<std::string_view, std::string_view>, 3> kWords = {
    {{"root", DochostRootContainerItemIdentifier},
     {"working-set", DochostWorkingSetContainerItemIdentifier},
     {"all-directories", DochostAllDirectoriesContainerItemIdentifier}}};

std::optional<std::string> identifierIn(const std::string& argument) {
  for (const auto& [word, identifier] : kWords) {
    if (argument == word || argument == identifier) return std::string(identifier);
  }
  const bool looksLikeOne = argument.starts_with("did=") || argument.starts_with("fid=") ||
                            argument.starts_with('#') ||
                            argument == DochostTemporaryLocalFolderItemIdentifier;
  return looksLikeOne ? std::optional(argument) : std::nullopt;
}

Result<FndURL> canonicalURLOfPath(const std::string& path) {
  if (path.empty()) {
    return std::unexpected(
        FndError::vantrell(VantrellErrorCode::InvalidArgument, "The path is empty."));
  }
  std::error_code error;
  const std::filesystem::path absolute = std::filesystem::absolute(path, error);
  if (error) return std::unexpected(linuxos::readError(error.value()));
  return platform::services().fileSystem->canonicalURL(FndURL::fileURLWithPath(absolute.native()));
}

// Why the extension gives no identifier for what should be at `url`.
FndError whyNoItem(const FndURL& url) {
  constexpr std::array kKeys = {FndURLResourceKey::FileResourceIdentifier};
  auto found = platform::services().fileSystem->readResourceValues(url, kKeys);
  if (!found) return std::move(found.error());
  const FndURL& root = platform::services().manager->documentStorageURL();
  if (dh_relationshipToItemAtURL(root, url) == DhURLRelationship::Other) {
    return FndError::vantrell(VantrellErrorCode::InvalidArgument,
                              "It lies outside the storage folder \"" + root.path() + "\".");
  }
  return FndError(kDochostErrorDomain, static_cast<std::int64_t>(DochostErrorCode::NoSuchItem),
                  {{"message", std::any(std::string("The provider shows no item there."))}});
}

}  // namespace

Result<DochostItemIdentifier> identifierOfPath(DochostExtension& extension,
                                               const std::string& path) {
  const auto url = canonicalURLOfPath(path);
  if (!url) return std::unexpected(url.error());
  auto identifier = extension._persistentIdentifierForItemAt(*url);
  if (!identifier) return std::unexpected(whyNoItem(*url));
  return *std::move(identifier);
}

Result<DochostItemIdentifier> identifierOfArgument(DochostExtension& extension,
                                                   const std::string& argument) {
  if (auto identifier = identifierIn(argument)) return *std::move(identifier);
  return identifierOfPath(extension, argument);
}

}  // namespace vantrell::cli
