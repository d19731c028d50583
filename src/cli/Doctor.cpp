#include "cli/Doctor.h"

#include <cerrno>
#include <chrono>
#include <string>

#include "linux/system/MountTable.h"
#include "platform/Services.h"

namespace vantrell::cli {
namespace {

// Any attribute does: what matters is whether the volume knows of attributes at all. Nothing is
// written to find out.
constexpr std::string_view kProbedAttribute = "com.quillon.metadata:_kMDItemUserTags";

std::string textOfMoment(std::chrono::system_clock::time_point time) {
  using namespace std::chrono;
  const auto sinceEpoch = duration_cast<nanoseconds>(time.time_since_epoch());
  const auto whole = floor<seconds>(sinceEpoch);
  return FndDate::fromUnixTime(whole.count(),
                               static_cast<std::uint32_t>((sinceEpoch - whole).count()))
      .description();
}

double millisecondsIn(std::chrono::microseconds duration) {
  return static_cast<double>(duration.count()) / 1000;
}

Json pathsIn(const std::vector<std::string>& paths) {
  Json list = Json::array();
  for (const std::string& path : paths) list.push_back(path);
  return list;
}

void putAttributes(Json& report, const FndURL& root) {
  const auto size = platform::services().attributes->sizeOfAttribute(root, kProbedAttribute);
  const bool work = size || size.error().isPosix(ENODATA);
  report["extendedAttributes"] = work;
  if (work) return;
  report["extendedAttributesProblem"] =
      size.error().isPosix(EOPNOTSUPP)
          ? "The volume has none: tags, ranks and dates cannot be kept."
          : size.error().description();
}

void putStorage(Json& report, const FndURL& root) {
  const platform::Services& services = platform::services();
  const auto file = services.fileSystem->open(root, OpenMode::EventOnly);
  if (file) {
    if (const auto device = (*file)->deviceID()) report["device"] = device->value;
  }
  const auto uuid = services.volumes->volumeUUIDForURL(root);
  report["volumeUUID"] = uuid ? uuid->description() : uuid.error().description();
  report["fileSystemType"] = linuxos::fileSystemTypeOfPath(root.path());
  putAttributes(report, root);
}

Json databaseReport(linuxos::LinuxSystem& system) {
  const auto statistics = system.statistics();
  if (!statistics) return recordOfError(statistics.error());
  Json report;
  putText(report, "path", system.databasePath());
  report["bytes"] = statistics->databaseBytes;
  report["schemaVersion"] = statistics->schemaVersion;
  report["entries"] = statistics->entries;
  report["folders"] = statistics->folders;
  report["documents"] = statistics->documents;
  report["highestDocumentID"] = statistics->highestDocumentID.value;
  report["lastLook"] = textOfMoment(statistics->lastLook);
  return report;
}

Json lookReport(const linuxos::LookReport& look) {
  Json report;
  report["milliseconds"] = millisecondsIn(look.duration);
  report["entriesSeen"] = look.entriesSeen;
  report["created"] = look.created;
  report["gone"] = look.gone;
  report["moved"] = look.moved;
  report["changed"] = look.changed;
  report["replaced"] = look.replaced;
  report["documentsHandedOver"] = look.documentsHandedOver;
  report["documentsReturned"] = look.documentsReturned;
  report["documentsGone"] = look.documentsGone;
  report["unreadableFolderCount"] = look.unreadableFolderCount;
  report["unreadableFolders"] = pathsIn(look.unreadableFolders);
  return report;
}

}  // namespace

Json doctorReport(const host::HostPlaces& places,
                  const Result<std::unique_ptr<host::EmbeddedHost>>& host) {
  Json report;
  report["version"] = VANTRELL_VERSION;
  putText(report, "storageRoot", places.storageRoot);
  putText(report, "stateFolder", places.stateFolder);
  putText(report, "module", places.module);
  if (!host) return report;
  linuxos::LinuxSystem& system = (*host)->system();
  putStorage(report, FndURL::fileURLWithPath(places.storageRoot));
  report["backend"] = "looks at start only";
  report["database"] = databaseReport(system);
  report["look"] = lookReport((*host)->lookAtStart());
  report["typeDatabases"] = pathsIn(system.typeDatabases());
  report["log"] = system.logDescription();
  return report;
}

}  // namespace vantrell::cli
