#include "provider/LocalDochost.h"

#include <chrono>
#include <utility>

#include "platform/Services.h"
#include "support/Log.h"
#include "support/TracedSection.h"

namespace vantrell {
namespace {

constexpr std::chrono::milliseconds kLeastTimeBetweenRefreshes{500};

void signalWorkingSet() {
  logInfo("auto notify changes on DochostWorkingSetContainerItemIdentifier at startup");
  platform::services().manager->signalEnumeratorForContainerItemIdentifier(
      DochostWorkingSetContainerItemIdentifier, [](std::optional<FndError> error) {
        if (error) {
          logError("can't notify changes on DochostWorkingSetContainerItemIdentifier; ", *error);
        } else {
          logDebug("notified changes on DochostWorkingSetContainerItemIdentifier");
        }
      });
}

}  // namespace

LocalDochost::LocalDochost()
    : appRefreshCompletionHandlers(std::make_shared<Completions>()),
      appRefreshQueue("vantrell.app-refresh.queue"),
      appRefreshPacer(std::make_shared<DhPacer>("vantrell.app-refresh.pacer", appRefreshQueue,
                                                kLeastTimeBetweenRefreshes)) {
  appRefreshPacer->setEventBlock(
      [waiting = appRefreshCompletionHandlers] { pacerEvent(*waiting); });
  appRefreshPacer->resume();
  appRefreshPacer->signal();
  signalWorkingSet();
}

LocalDochost::~LocalDochost() {
  appRefreshPacer.reset();
  // The services may go next: wait for an event that is running, unless it is what destroys us.
  if (!appRefreshQueue.isCurrent()) appRefreshQueue.sync([] {});
}

void LocalDochost::providePlaceholderAtURL_completionHandler(const FndURL&,
                                                             ErrorCompletion completion) {
  completion(std::nullopt);
}

void LocalDochost::startProvidingItemAtURL_completionHandler(const FndURL&,
                                                             ErrorCompletion completion) {
  completion(std::nullopt);  // every item is here already
}

void LocalDochost::itemChangedAtURL(const FndURL&) {}

void LocalDochost::stopProvidingItemAtURL(const FndURL&) {}

void LocalDochost::_refreshInstalledAppsWithCompletionHandler(ErrorCompletion completion) {
  appRefreshQueue.async([waiting = appRefreshCompletionHandlers, pacer = appRefreshPacer,
                         completion = std::move(completion)]() mutable {
    waiting->push_back(std::move(completion));
    pacer->signal();
  });
}

void LocalDochost::pacerEvent(Completions& waiting) {
  const TracedSection section("pacer event");
  // Taken first: a handler may ask for the next refresh.
  Completions handlers = std::exchange(waiting, {});
  for (ErrorCompletion& handler : handlers) handler(std::nullopt);
}

}  // namespace vantrell
