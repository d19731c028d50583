#pragma once

#include <chrono>
#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <span>
#include <string>
#include <vector>

#include "platform/foundation/FndError.h"
#include "platform/foundation/Identifiers.h"
#include "platform/foundation/SerialQueue.h"

namespace vantrell {

/// What an event says besides its path; combined as bits.
enum TremorEventFlags : std::uint32_t {
  kTremorUserDropped = 0x02,      ///< events were lost on this side
  kTremorKernelDropped = 0x04,    ///< events were lost, or are not kept that far back
  kTremorEventIDsWrapped = 0x08,  ///< the IDs do not belong together any more
  kTremorHistoryDone = 0x10,      ///< what follows happened after the stream was started
};

/// How a stream delivers; combined as bits.
enum TremorStreamFlags : std::uint32_t {
  kTremorDeliversPathObjects = 0x01,
  kTremorFileEvents = 0x10,
  kTremorExtendedData = 0x40,
};

/// "Look at this": something about the object that is, or was, at `path`.
struct TremorEvent {
  EventID eventID;
  std::uint32_t flags = 0;
  std::optional<std::string> path;
  std::optional<FileID> fileID;
};

/// What a stream is to read.
struct TremorStreamRequest {
  std::vector<std::string> paths;        ///< those below count too
  std::optional<DeviceID> device;        ///< set: `paths` count from that device's root
  EventID since;                         ///< the first event is the first one after this
  std::chrono::milliseconds latency{0};  ///< how long the first event of a live batch may wait
  std::uint32_t flags = 0;
};

/// A cursor over the history and the present of the file system, oldest first.
///
/// Threads: batches arrive on the queue the stream was made with. `stop` may be called from any
/// thread, the callback included; no batch begins after it has returned on that queue.
/// Lifetime: destroying a running stream stops it.
class TremorStream {
 public:
  virtual ~TremorStream() = default;
  /// What had happened before this call is history, and comes before the history-done event.
  virtual Result<void> start() = 0;
  virtual void stop() = 0;
};

/// The file-system event stream.
///
/// Threads: all members may be called from any thread.
class Tremor {
 public:
  using BatchHandler = std::function<void(std::span<const TremorEvent>)>;

  virtual ~Tremor() = default;
  /// The newest event's ID. It can be used as an anchor at once: it is durable.
  virtual EventID currentEventID() = 0;
  virtual Result<std::unique_ptr<TremorStream>> createStream(TremorStreamRequest request,
                                                             SerialQueue queue,
                                                             BatchHandler handler) = 0;
};

}  // namespace vantrell
