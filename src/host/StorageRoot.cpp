#include "host/StorageRoot.h"

#include <fcntl.h>
#include <unistd.h>

#include <cerrno>
#include <filesystem>
#include <system_error>

#include "linux/FileDescriptor.h"
#include "linux/PosixError.h"
#include "platform/foundation/FndURL.h"
#include "platform/foundation/PosixNames.h"

namespace vantrell::host {
namespace {

constexpr std::string_view kAdvice = " Name another folder with --storage DIR.";

FndError refusal(const std::string& path, int osError) {
  const FndError plain = linuxos::readError(osError);
  std::string message = "The storage folder \"" + path +
                        "\" cannot be used: " + posixErrorText(osError) + "." +
                        std::string(kAdvice);
  return FndError(plain.domain(), plain.code(), {{"message", std::any(std::move(message))}});
}

FndError noFolder(const std::string& path) {
  return FndError::foundation(
      FndFoundationErrorCode::FileReadNoSuchFile,
      {{"message", std::any("There is no storage folder \"" + path + "\". Create it, or name" +
                            " another with --storage DIR.")}});
}

// 0, or the errno value that keeps the folder from being listed.
int whyUnreadable(const std::string& path) {
  const linuxos::FileDescriptor folder(
      ::open(path.c_str(), O_RDONLY | O_DIRECTORY | O_NONBLOCK | O_CLOEXEC));
  return folder ? 0 : errno;
}

Result<std::string> namedRoot(const std::optional<std::string>& given,
                              const linuxos::XdgFolders& folders) {
  if (given) return *given;
  if (auto documents = folders.documentsFolder()) return *std::move(documents);
  return std::unexpected(FndError::vantrell(
      VantrellErrorCode::InvalidArgument,
      "There is no documents folder in this user's settings." + std::string(kAdvice)));
}

}  // namespace

Result<std::string> storageRoot(const std::optional<std::string>& given,
                                const linuxos::XdgFolders& folders) {
  auto named = namedRoot(given, folders);
  if (!named) return named;
  std::error_code error;
  const std::filesystem::path path = std::filesystem::canonical(*named, error);
  if (error == std::errc::no_such_file_or_directory) return std::unexpected(noFolder(*named));
  if (error) return std::unexpected(refusal(*named, error.value()));
  const int osError = whyUnreadable(path.native());
  // A plain file is no folder; only the path that leads to something missing is "not there".
  if (osError == ENOTDIR) {
    return std::unexpected(FndError::posix(
        ENOTDIR,
        {{"message", std::any("\"" + *named + "\" is no folder." + std::string(kAdvice))}}));
  }
  if (osError != 0) return std::unexpected(refusal(*named, osError));
  return path.native();
}

std::optional<std::string> storageRootWarning(const std::string& canonicalPath) {
  for (const std::string& component : FndURL::fileURLWithPath(canonicalPath).pathComponents()) {
    if (component == "Documents") return std::nullopt;
  }
  return "No folder on the path \"" + canonicalPath +
         "\" is called \"Documents\", so there is no trash. Name one that is with --storage DIR,"
         " or bind-mount this one there.";
}

}  // namespace vantrell::host
