#pragma once

#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "linux/catalog/Catalog.h"
#include "platform/types/TypeRegistry.h"

namespace vantrell::linuxos {

/// Knows one kind of package: folders whose names end in ".tessera".
class TesseraTypes final : public TypeRegistry {
 public:
  std::string typeIdentifierForName(std::string_view name, FileKind kind) const override;
  bool typeConformsTo(std::string_view type, std::string_view supertype) const override;
  std::string descriptionOfType(std::string_view type) const override;
};

/// A storage and a state folder of its own for each test, with a catalog that can be closed and
/// opened again. Names are relative to the storage.
class CatalogTest : public testing::Test {
 protected:
  CatalogTest();
  ~CatalogTest() override;

  std::string path(std::string_view name) const;
  std::string state(std::string_view name) const { return _folder + "/state/" + std::string(name); }
  std::string outside(std::string_view name) const;

  void write(std::string_view name, std::string_view text = "text");
  void makeFolder(std::string_view name);
  void rename(std::string_view from, std::string_view to);
  void moveOut(std::string_view name, std::string_view to);
  void moveIn(std::string_view from, std::string_view name);
  void exchange(std::string_view one, std::string_view other);
  void link(std::string_view existing, std::string_view added);
  void remove(std::string_view name);
  void setAttribute(std::string_view name, const char* attribute, std::string_view value);
  std::string attribute(std::string_view name, const char* attribute) const;

  /// From now on root's right to do everything is gone; files made so far belong to the user.
  void becomeOrdinaryUser();

  /// Waits until nothing that was done so far counts as recent, so that the next look trusts it.
  void letTimePass() const;

  CatalogOptions options();
  /// Opens the catalog when it is closed, and looks.
  LookReport look();
  void close() { _catalog.reset(); }
  /// Closes the catalog, opens it again and looks.
  LookReport lookAfterRestart();
  Catalog& catalog();

  FileID fileID(std::string_view name) const;
  SeenObject seen(std::string_view name) const;
  /// The document ID of the file, a new one when it has none.
  DocumentID idOf(std::string_view name);
  /// The document ID of the file, 0 when it has none.
  DocumentID knownIDOf(std::string_view name);
  /// Where the document is, relative to the storage; empty when it is gone.
  std::string placeOf(DocumentID documentID);

  std::vector<std::string> errorLines() const;
  const std::string& folder() const { return _folder; }

  std::vector<std::string> roots;

 private:
  std::string _folder;
  TesseraTypes _types;
  std::vector<std::pair<LogLevel, std::string>> _lines;
  std::unique_ptr<Catalog> _catalog;
  bool _wasRoot = false;
};

}  // namespace vantrell::linuxos
