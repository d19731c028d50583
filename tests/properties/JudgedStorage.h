#pragma once

#include <memory>
#include <string>

#include "IdentityJudge.h"
#include "PackageTypes.h"
#include "TestStorage.h"
#include "linux/catalog/Catalog.h"

namespace vantrell::properties {

/// A storage with a catalog on it, and a judge that watches every answer. Names are relative to
/// the storage root.
///
/// Threads: use from one thread. Lifetime: its own.
class JudgedStorage {
 public:
  JudgedStorage(const std::string& parent, const std::string& stateParent)
      : storage(parent, stateParent) {}
  explicit JudgedStorage(const std::string& parent) : storage(parent) {}

  std::string path(const std::string& name) const { return storage.root() + "/" + name; }
  FileID fileAt(const std::string& name) const { return seeObject(path(name)).fileID; }

  /// Closes the catalog and opens it again. The caller looks.
  void reopen();
  /// A look, judged through `index` when there is one. Opens the catalog when it is closed.
  void look(linuxos::FileIndex* index = nullptr);
  /// The document ID of what stands there; 0, and a complaint, for a failure.
  DocumentID ask(const std::string& name);
  /// The name of the file that stands for the document, by the catalog's word; "" when gone.
  std::string whereIs(DocumentID documentID);
  /// All that the judge has to say, one line each; empty when all is well.
  std::string complaints() const;

  linuxos::Catalog& catalog() { return *_catalog; }
  IdentityJudge& judge() { return *_judge; }

  TestStorage storage;

 private:
  PackageTypes _types;
  std::unique_ptr<IdentityJudge> _judge;
  std::unique_ptr<linuxos::Catalog> _catalog;
};

}  // namespace vantrell::properties
