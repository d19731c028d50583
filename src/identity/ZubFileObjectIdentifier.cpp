#include "identity/ZubFileObjectIdentifier.h"

#include <charconv>
#include <string>

#include "platform/Services.h"
#include "support/Log.h"

namespace vantrell {
namespace {

constexpr std::string_view kDocumentPrefix = "did=";

}  // namespace

DochostItemIdentifier ZubFileObjectIdentifier::fromFileID(FileID fileID) {
  return "fid=" + std::to_string(fileID.value);
}

DochostItemIdentifier ZubFileObjectIdentifier::fromDocumentID(DocumentID documentID) {
  return "did=" + std::to_string(documentID.value);
}

std::optional<DochostItemIdentifier> ZubFileObjectIdentifier::fromAppLibraryDataContainerURL(
    const FndURL& url) {
  Appreg* const appreg = platform::services().appreg;
  const Appreg::BundleProxy proxy =
      appreg == nullptr ? nullptr : appreg->bundleProxyForAppLibraryURL(url);
  if (proxy == nullptr) {
    dh_default_log().write(LogLevel::Error, "[ERROR] can't find bundle proxy at ", url);
    return std::nullopt;
  }
  return appLibraryIdentifier(*proxy);
}

std::optional<DocumentID> ZubFileObjectIdentifier::documentIDIn(std::string_view identifier) {
  if (!identifier.starts_with(kDocumentPrefix)) return std::nullopt;
  identifier.remove_prefix(kDocumentPrefix.size());
  DocumentID documentID;
  const char* const end = identifier.data() + identifier.size();
  const auto read = std::from_chars(identifier.data(), end, documentID.value);
  if (read.ec != std::errc() || read.ptr != end) return std::nullopt;
  return documentID;
}

std::optional<std::string_view> ZubFileObjectIdentifier::bundleIdentifierIn(
    std::string_view identifier) {
  if (!identifier.starts_with('#')) return std::nullopt;
  return identifier.substr(1);
}

DochostItemIdentifier appLibraryIdentifier(const AppregBundleProxy& bundleProxy) {
  return "#" + bundleProxy.bundleIdentifier().value_or("(null)");
}

}  // namespace vantrell
