#include "cli/Commands.h"

#include <cstdlib>
#include <future>
#include <memory>
#include <utility>

#include "cli/Doctor.h"
#include "cli/ItemArgument.h"
#include "cli/ItemTable.h"
#include "cli/Json.h"
#include "host/EmbeddedHost.h"
#include "host/StorageRoot.h"
#include "platform/Services.h"
#include "platform/dochost/DochostTags.h"

namespace vantrell::cli {
namespace {

// What every command needs, for as long as it runs.
struct Session {
  const Arguments& arguments;
  Output& output;
  DochostExtension& extension;
};

bool wantsColor(const Arguments& arguments, const Output& output) {
  if (arguments.color != ColorMode::Auto) return arguments.color == ColorMode::Always;
  const char* noColor = std::getenv("NO_COLOR");
  return output.isTerminal() && (noColor == nullptr || *noColor == '\0');
}

Result<DochostItemRef> itemOfArgument(const Session& session) {
  const auto identifier = identifierOfArgument(session.extension, session.arguments.operand);
  if (!identifier) return std::unexpected(identifier.error());
  return session.extension.itemForIdentifier_error(*identifier);
}

// A script gets the bytes; a terminal would take some of them for commands.
std::string pathForReader(const Output& output, const std::string& path) {
  return (output.isTerminal() ? displayText(path) : path) + "\n";
}

std::string textOfItem(const Arguments& arguments, const DochostItem& item) {
  if (arguments.print0) return item.fileURL().path() + '\0';
  const Json record = recordOfItem(item);
  return arguments.json ? lineOf(record) : tableOf(record);
}

Result<void> ls(const Session& session) {
  const Arguments& arguments = session.arguments;
  const auto container = identifierOfArgument(session.extension, arguments.operand);
  if (!container) return std::unexpected(container.error());
  ItemTable table(*platform::services().types, wantsColor(arguments, session.output));
  Result<void> written;
  const auto showPage = [&](std::vector<DochostItemRef> items) {
    if (!arguments.json && !arguments.print0) {
      session.output.append(table.linesOf(items));
    } else {
      for (const DochostItemRef& item : items) session.output.append(textOfItem(arguments, *item));
    }
    written = session.output.flush();
    return written && session.output.isWanted();
  };
  auto listed = session.extension._listItemsInContainer_pageHandler(*container, showPage);
  return listed ? std::move(written) : std::move(listed);
}

Result<void> item(const Session& session) {
  const auto found = itemOfArgument(session);
  if (!found) return std::unexpected(found.error());
  session.output.append(textOfItem(session.arguments, **found));
  return {};
}

Result<void> id(const Session& session) {
  const Arguments& arguments = session.arguments;
  const auto identifier = identifierOfPath(session.extension, arguments.operand);
  if (!identifier) return std::unexpected(identifier.error());
  if (arguments.json) {
    session.output.append(lineOf(Json{{"itemIdentifier", *identifier}}));
  } else {
    session.output.append(*identifier + (arguments.print0 ? '\0' : '\n'));
  }
  return {};
}

Result<void> path(const Session& session) {
  const Arguments& arguments = session.arguments;
  const auto found = itemOfArgument(session);
  if (!found) return std::unexpected(found.error());
  const std::string& place = (*found)->fileURL().path();
  if (arguments.json) {
    Json object;
    putText(object, "path", place);
    session.output.append(lineOf(object));
  } else if (arguments.print0) {
    session.output.append(place + '\0');
  } else {
    session.output.append(pathForReader(session.output, place));
  }
  return {};
}

// Makes a request of the extension that changes the item, waits for its end and gives the fresh
// record. `request` takes the identifier and the completion handler.
template <class Request>
Result<DochostItemRef> changed(const Session& session, const Request& request) {
  const auto identifier = identifierOfArgument(session.extension, session.arguments.operand);
  if (!identifier) return std::unexpected(identifier.error());
  std::promise<Result<DochostItemRef>> promise;
  auto answer = promise.get_future();
  request(*identifier, [promise = std::move(promise)](DochostItemRef fresh,
                                                      std::optional<FndError> error) mutable {
    if (error) {
      promise.set_value(std::unexpected(*std::move(error)));
    } else {
      promise.set_value(std::move(fresh));
    }
  });
  return answer.get();
}

Result<void> show(const Session& session, const Result<DochostItemRef>& fresh) {
  if (!fresh) return std::unexpected(fresh.error());
  session.output.append(textOfItem(session.arguments, **fresh));
  return {};
}

Result<void> tag(const Session& session) {
  std::vector<DochostTag> tags;
  for (const std::string& label : session.arguments.labels) tags.push_back({label, std::nullopt});
  auto data = dataFromDochostTags(tags);
  if (!data) return std::unexpected(std::move(data.error()));
  return show(session, changed(session, [&](const auto& identifier, auto completion) {
                session.extension.setTagData_forItemIdentifier_completionHandler(
                    *std::move(data), identifier, std::move(completion));
              }));
}

Result<void> rank(const Session& session) {
  return show(session, changed(session, [&](const auto& identifier, auto completion) {
                session.extension.setFavoriteRank_forItemIdentifier_completionHandler(
                    session.arguments.rank, identifier, std::move(completion));
              }));
}

// Dates are stored as seconds in floating point, which is good to less than a microsecond.
bool isSameMoment(const std::optional<FndDate>& a, const std::optional<FndDate>& b) {
  if (!a || !b) return !a && !b;
  const double difference = a->secondsSinceReferenceDate() - b->secondsSinceReferenceDate();
  return difference < 1e-3 && difference > -1e-3;
}

Result<void> used(const Session& session) {
  std::optional<FndDate> date = session.arguments.usedDate;
  if (session.arguments.usedChange == UsedChange::Now) date = platform::services().clock->now();
  const auto fresh = changed(session, [&](const auto& identifier, auto completion) {
    session.extension.setLastUsedDate_forItemIdentifier_completionHandler(date, identifier,
                                                                          std::move(completion));
  });
  // The request succeeds even when the date could not be written; the record tells.
  if (fresh && !isSameMoment((*fresh)->lastUsedDate(), date)) {
    return std::unexpected(FndError::foundation(
        FndFoundationErrorCode::FileWriteNoPermission,
        {{"message",
          std::any(std::string("The date could not be stored; --verbose shows why."))}}));
  }
  return show(session, fresh);
}

Result<void> run(const Session& session) {
  switch (session.arguments.command) {
    case Command::Ls:
      return ls(session);
    case Command::Item:
      return item(session);
    case Command::Id:
      return id(session);
    case Command::Path:
      return path(session);
    case Command::Tag:
      return tag(session);
    case Command::Rank:
      return rank(session);
    case Command::Used:
      return used(session);
    case Command::Doctor:
      break;
  }
  return {};
}

}  // namespace

int runCommand(const Arguments& arguments, Output& output, const Reporter& reporter) {
  const auto folders = linuxos::XdgFolders::ofThisProcess();
  auto places = host::EmbeddedHost::places(arguments.storage, folders);
  const auto fail = [&](const FndError& error, std::string_view subject = "") {
    reporter.error(subject, error);
    return kStatusFailed;
  };
  if (!places) return fail(places.error());
  if (const auto warning = host::storageRootWarning(places->storageRoot)) {
    reporter.warning(*warning);
  }
  const host::HostPlaces known = *places;
  const auto host = host::EmbeddedHost::start(*std::move(places), arguments.verbose);
  int status = kStatusDone;
  if (arguments.command == Command::Doctor) {
    const Json report = doctorReport(known, host);
    output.append(arguments.json ? lineOf(report) : tableOf(report));
    if (!host) status = fail(host.error());
  } else if (!host) {
    return fail(host.error());
  } else if (auto done = run({arguments, output, (*host)->extension()}); !done) {
    status = fail(done.error(), arguments.operand);
  }
  if (auto written = output.flush(); !written) return fail(written.error(), "standard output");
  return status;
}

}  // namespace vantrell::cli
