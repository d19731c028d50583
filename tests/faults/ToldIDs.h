#pragma once

#include <map>
#include <string>
#include <string_view>
#include <vector>

#include "linux/catalog/FileIndex.h"

namespace vantrell::faults {

/// What a catalog has promised: which document ID it told for which file. It reads the reports of
/// a `CatalogWriter` that may have died at any moment, and holds a catalog to them.
///
/// Threads: use from one thread. Lifetime: its own.
class ToldIDs {
 public:
  /// Takes the lines of one writer, whose work is over.
  void read(std::string_view reports);
  void told(DocumentID documentID, const std::string& path);
  void renamed(const std::string& from, const std::string& to);

  /// Every ID stands for the file it was told for, but for those that were refused before.
  void expectAllKept(linuxos::FileIndex& index);
  /// Every ID stands for the file it was told for, or for none at all.
  void expectKeptOrRefused(linuxos::FileIndex& index);
  /// Forgets which ID stands for which file now, and keeps that they have been told: what a lost
  /// database leaves of the promises.
  void databaseWasLost();

  std::size_t count() const { return _promises.size(); }
  int refused() const { return _refused; }
  int kept() const { return _kept; }
  const std::vector<std::string>& errors() const { return _errors; }
  /// What was found wrong, one line each; empty when all promises were kept.
  std::string complaints() const;

 private:
  void readLine(std::string_view line);
  void expect(linuxos::FileIndex& index, bool mayRefuse);
  void complain(std::string what) { _complaints.push_back(std::move(what)); }

  struct Promise {
    std::string path;  ///< where its file is now
    bool wasRefused = false;
  };

  std::map<DocumentID, Promise> _promises;       ///< every ID that was ever told
  std::map<std::string, DocumentID> _documents;  ///< the ID that the file there was last told
  std::vector<std::string> _errors;
  std::vector<std::string> _complaints;
  int _refused = 0;
  int _kept = 0;
};

}  // namespace vantrell::faults
