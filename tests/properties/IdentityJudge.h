#pragma once

#include <map>
#include <set>
#include <string>
#include <vector>

#include "HandOverTable.h"
#include "ObservedTree.h"

namespace vantrell::properties {

/// How often each thing that matters was seen, so that a run that saw none of it is noticed.
struct JudgeCounts {
  int looks = 0;
  int documentsToldAnID = 0;
  int certain = 0;    ///< verdicts where the table allowed one outcome
  int uncertain = 0;  ///< verdicts where it left a choice
  int handedOver = 0;
  int moved = 0;
  int gone = 0;
  int cameBack = 0;
  int attributesCarried = 0;

  void add(const JudgeCounts& other);
};

/// Holds what an index says about documents and places against what is on the disk.
///
/// It knows only what the test did, the table of hand-overs, and the answers given before.
/// What it finds wrong it collects as complaints; it never stops at the first.
///
/// Threads: use from one thread. Lifetime: one storage, over any number of indexes of it.
class IdentityJudge {
 public:
  /// The tree as the catalog was first opened on it.
  explicit IdentityJudge(ObservedTree tree) : _lastSeen(std::move(tree)) {}

  /// Judges what the index says after a look. `looked` is the disk right before that look,
  /// `settled` right after it; nothing but the look itself happened in between.
  void lookDone(linuxos::FileIndex& index, const ObservedTree& looked, ObservedTree settled);

  /// Judges the answer to a question for the IDs of these places.
  void told(const std::vector<Place>& places, const std::vector<DocumentID>& documentIDs);

  /// Says that the attributes of an object were set through the catalog's own process.
  void attributesNoted(ObjectNumber object, const Attributes& attributes);

  const std::vector<std::string>& complaints() const { return _complaints; }
  const JudgeCounts& counts() const { return _counts; }
  const ObservedTree& lastSeen() const { return _lastSeen; }
  void complain(std::string what) { _complaints.push_back(std::move(what)); }

 private:
  struct Verdict;

  Verdict judgeDocument(linuxos::FileIndex& index, const HandOverTable& table,
                        const ObservedTree& settled, const TrackedDocument& document);
  void count(const Verdict& verdict);
  void follow(const std::vector<Verdict>& verdicts, const ObservedTree& settled);
  void judgeDocumentPlaces(linuxos::FileIndex& index, const ObservedTree& settled);
  void judgePaths(linuxos::FileIndex& index, const ObservedTree& settled);
  void judgeFolderCounts(linuxos::FileIndex& index, const ObservedTree& settled);
  void judgeAttributes(const std::vector<Verdict>& verdicts, const ObservedTree& looked,
                       const ObservedTree& settled);
  void judgeCarried(const Verdict& verdict, const ObservedTree& looked, const Place& settled);
  TrackedDocument* ownerOf(ObjectNumber object);

  ObservedTree _lastSeen;
  std::vector<TrackedDocument> _documents;
  std::set<DocumentID> _toldEver;
  std::vector<std::string> _complaints;
  JudgeCounts _counts;
};

}  // namespace vantrell::properties
