#include "linux/catalog/DocumentTable.h"

namespace vantrell::linuxos::catalog {

namespace {

Document documentOf(const Statement& row) {
  return Document{row.documentID(0),
                  {row.fileID(1), row.bits(2)},
                  {row.fileID(3), std::string(row.bytes(4))},
                  row.integer(5) != 0,
                  row.integer(6) != 0};
}

}  // namespace

Result<bool> DocumentTable::isEmpty() {
  const auto any = _database.integer("SELECT EXISTS (SELECT 1 FROM documents)");
  if (!any) return std::unexpected(any.error());
  return *any == 0;
}

Result<std::vector<Document>> DocumentTable::read(Statement& statement) {
  std::vector<Document> documents;
  for (;;) {
    const auto row = statement.step();
    if (!row) return std::unexpected(row.error());
    if (!*row) return documents;
    documents.push_back(documentOf(statement));
  }
}

Result<std::optional<Document>> DocumentTable::readOne(Statement& statement) {
  const auto row = statement.step();
  if (!row) return std::unexpected(row.error());
  if (!*row) return std::nullopt;
  Document document = documentOf(statement);
  statement.reset();
  return document;
}

Result<std::optional<Document>> DocumentTable::document(DocumentID documentID) {
  return readOne(_byID.with(documentID));
}

Result<std::optional<Document>> DocumentTable::documentOfObject(const ObjectID& object) {
  return readOne(_byObject.with(object.fileID, object.generation));
}

Result<std::vector<Document>> DocumentTable::documentsOfFolder(FileID folder) {
  return read(_byFolder.with(folder));
}

Result<std::vector<Document>> DocumentTable::documentsOutOfView() {
  return read(_byFolder.with(FileID{}));
}

Result<std::vector<Document>> DocumentTable::documentsThatOweAttributes() {
  return read(_owing.with());
}

Result<void> DocumentTable::put(const Document& document) {
  return _put
      .with(document.documentID, document.object.fileID, document.object.generation,
            document.home.parent, document.home.name, document.isAlive, document.owesAttributes)
      .run();
}

Result<std::vector<Attribute>> DocumentTable::keptAttributes(DocumentID documentID) {
  std::vector<Attribute> attributes;
  _kept.with(documentID);
  for (;;) {
    const auto row = _kept.step();
    if (!row) return std::unexpected(row.error());
    if (!*row) return attributes;
    const std::string_view value = _kept.bytes(1);
    attributes.push_back({std::string(_kept.bytes(0)), FndData(value.begin(), value.end())});
  }
}

Result<void> DocumentTable::keepAttributes(DocumentID documentID,
                                           const std::vector<Attribute>& attributes) {
  if (auto forgotten = _forgetAll.with(documentID).run(); !forgotten) return forgotten;
  for (const Attribute& attribute : attributes) {
    auto kept = _keep.with(documentID, attribute.name, attribute.value).run();
    if (!kept) return kept;
  }
  return {};
}

Result<void> DocumentTable::noteAttribute(FileID fileID, std::string_view name,
                                          std::optional<FndDataView> value) {
  if (!value) return _forgetOfFile.with(fileID, name).run();
  const std::string_view bytes(reinterpret_cast<const char*>(value->data()), value->size());
  return _keepOfFile.with(fileID, name, bytes).run();
}

}  // namespace vantrell::linuxos::catalog
