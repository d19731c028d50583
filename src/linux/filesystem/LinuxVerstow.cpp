#include "linux/filesystem/LinuxVerstow.h"

#include <fcntl.h>

#include <cerrno>
#include <utility>

#include "linux/PosixError.h"
#include "linux/filesystem/LinuxOpenFile.h"

namespace vantrell::linuxos {

LinuxVerstow::LinuxVerstow(FileIndex& index, const TypeRegistry& types, std::string storageRoot)
    : _index(index), _types(types), _storageRoot(std::move(storageRoot)) {}

void LinuxVerstow::prepare() {}  // the index is ready when it is handed over

// The error's number says what another volume means to the caller.
Result<void> LinuxVerstow::checkDevice(DeviceID device, int osError) const {
  const auto place = placeOf(_storageRoot);
  if (!place) return std::unexpected(posixError(place.error()));
  const auto root = lookAt(place->folder.get(), place->name.data());
  if (!root) return std::unexpected(posixError(root.error()));
  if (root->device != device) return std::unexpected(posixError(osError));
  return {};
}

Result<FileID> LinuxVerstow::resolveDocumentID(DocumentID documentID, DeviceID device) {
  if (auto checked = checkDevice(device, ENOENT); !checked) {
    return std::unexpected(std::move(checked.error()));
  }
  return _index.fileIDOfDocument(documentID);
}

Result<DocumentID> LinuxVerstow::getOrAllocateDocumentID(OpenFile& file) {
  auto* linuxFile = dynamic_cast<LinuxOpenFile*>(&file);
  if (linuxFile == nullptr) return std::unexpected(posixError(EINVAL));
  const auto object = linuxFile->seen();
  if (!object) return std::unexpected(object.error());
  if (!isDocument(object->kind, object->isPackage)) return std::unexpected(posixError(EINVAL));
  return documentID(*object, true);
}

Result<DocumentID> LinuxVerstow::permanentStorageAtURL(const FndURL& url, bool allocateIfNone) {
  const auto file = LinuxOpenFile::open(url.path(), OpenMode::EventOnly, _index, _types);
  if (!file) return std::unexpected(file.error());
  const auto object = (*file)->seen();
  if (!object) return std::unexpected(object.error());
  if (!isDocument(object->kind, object->isPackage)) return DocumentID{};
  return documentID(*object, allocateIfNone);
}

Result<DocumentID> LinuxVerstow::documentID(const SeenObject& object, bool allocateIfNone) {
  if (auto checked = checkDevice(object.device, EXDEV); !checked) {
    return std::unexpected(std::move(checked.error()));
  }
  if (!allocateIfNone) return _index.documentIDOfObject(object);
  const auto place = placeOf(object.path);
  if (!place) return std::unexpected(posixError(place.error()));
  const auto folder = lookAt(place->folder.get(), "", AT_EMPTY_PATH);
  if (!folder) return std::unexpected(posixError(folder.error()));
  const auto ids = _index.documentIDsOfObjects(folder->fileID, {&object, 1});
  if (!ids) return std::unexpected(ids.error());
  if (ids->front().value == 0) return std::unexpected(posixError(ENOENT));  // gone meanwhile
  return ids->front();
}

}  // namespace vantrell::linuxos
