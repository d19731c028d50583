#include "tests/fakes/FakeTree.h"

#include <algorithm>
#include <cerrno>
#include <stdexcept>

#include "tests/fakes/FakeErrors.h"

namespace vantrell {
namespace {

using Node = FakeTree::Node;

constexpr int kMostLinks = 40;

[[noreturn]] void senseless(std::string_view what, std::string_view path) {
  throw std::logic_error(std::string(what) + " \"" + std::string(path) + "\"");
}

std::vector<std::string> componentsOf(std::string_view path) {
  std::vector<std::string> parts = FndURL::fileURLWithPath(path).pathComponents();
  parts.erase(parts.begin());
  return parts;
}

std::string joined(const std::string& folder, std::string_view name) {
  std::string path = folder == "/" ? std::string() : folder;
  return path.append("/").append(name);
}

void putOnDevice(FakeNode& node, DeviceID device) {
  node.device = device;
  for (auto& [name, entry] : node.entries) putOnDevice(*entry, device);
}

bool isKept(std::string_view attribute) {
  return attribute.ends_with("#PS") || attribute == "com.quillon.metadata:_kMDItemUserTags";
}

// Looks everywhere below `folder` for the object that `wanted` accepts.
template <class Wanted>
std::optional<std::pair<std::string, Node>> search(const FakeNode& folder, const std::string& path,
                                                   const Wanted& wanted) {
  for (const auto& [name, entry] : folder.entries) {
    const std::string here = joined(path, name);
    if (wanted(*entry)) return std::pair(here, entry);
    if (auto found = search(*entry, here, wanted)) return found;
  }
  return std::nullopt;
}

}  // namespace

std::pair<std::string, std::string> splitFakePath(std::string_view path) {
  const FndURL url = FndURL::fileURLWithPath(path);
  return {url.URLByDeletingLastPathComponent().path(), std::string(url.lastPathComponent())};
}

Node entryOf(const FakeNode& folder, std::string_view name) {
  const auto found = std::ranges::find(folder.entries, name, [](const auto& e) { return e.first; });
  return found == folder.entries.end() ? nullptr : found->second;
}

FakeTree::FakeTree() : _root(std::make_shared<FakeNode>()) {
  _root->fileID = FileID{1};
  _root->kind = FileKind::Directory;
  _root->device = kDevice;
}

Node FakeTree::create(Node folder, std::string_view name, FileKind kind) {
  auto node = std::make_shared<FakeNode>();
  node->fileID = FileID{_nextFileID++};
  node->kind = kind;
  node->device = folder->device;
  folder->entries.emplace_back(name, node);
  return node;
}

Node FakeTree::need(std::string_view path) {
  Node node = _root;
  for (const std::string& name : componentsOf(path)) {
    node = entryOf(*node, name);
    if (node == nullptr) senseless("nothing is at", path);
  }
  return node;
}

Node FakeTree::makeAt(std::string_view path, FileKind kind) {
  const auto [folderPath, name] = splitFakePath(path);
  makeFolder(folderPath);
  const Node folder = need(folderPath);
  if (entryOf(*folder, name) != nullptr) senseless("there is something already at", path);
  return create(folder, name, kind);
}

Node FakeTree::takeOut(std::string_view path) {
  const auto [folderPath, name] = splitFakePath(path);
  const Node folder = need(folderPath);
  const Node node = need(path);
  std::erase_if(folder->entries, [&name](const auto& entry) { return entry.first == name; });
  return node;
}

void FakeTree::makeFolder(std::string_view path) {
  const std::lock_guard lock(mutex);
  Node node = _root;
  for (const std::string& name : componentsOf(path)) {
    const Node next = entryOf(*node, name);
    node = next != nullptr ? next : create(node, name, FileKind::Directory);
    if (node->kind != FileKind::Directory) senseless("a folder can't be made below", path);
  }
}

void FakeTree::writeFile(std::string_view path, std::string_view content) {
  const std::lock_guard lock(mutex);
  const auto [folderPath, name] = splitFakePath(path);
  makeFolder(folderPath);
  Node file = entryOf(*need(folderPath), name);
  if (file == nullptr) {
    file = makeAt(path, FileKind::RegularFile);
  } else {
    file->modified = FndDate::fromUnixTime(file->modified.unixSeconds() + 1);
  }
  file->content.assign(content.begin(), content.end());
}

void FakeTree::makeLink(std::string_view path, std::string_view target) {
  const std::lock_guard lock(mutex);
  makeAt(path, FileKind::SymbolicLink)->linkTarget = target;
}

void FakeTree::makeSpecial(std::string_view path, FileKind kind) {
  const std::lock_guard lock(mutex);
  makeAt(path, kind);
}

void FakeTree::makeHardLink(std::string_view existing, std::string_view path) {
  const std::lock_guard lock(mutex);
  const Node node = need(existing);
  if (node->kind == FileKind::Directory) senseless("a folder has one name", existing);
  const auto [folderPath, name] = splitFakePath(path);
  need(folderPath)->entries.emplace_back(name, node);
}

void FakeTree::move(std::string_view from, std::string_view to) {
  const std::lock_guard lock(mutex);
  const Node node = takeOut(from);
  const auto [folderPath, name] = splitFakePath(to);
  const Node folder = need(folderPath);
  if (entryOf(*folder, name) != nullptr) takeOut(to);
  folder->entries.emplace_back(name, node);
}

void FakeTree::remove(std::string_view path) {
  const std::lock_guard lock(mutex);
  takeOut(path);
}

void FakeTree::saveByReplacing(std::string_view path, std::string_view content) {
  const std::lock_guard lock(mutex);
  const Node old = takeOut(path);
  writeFile(path, content);
  const Node saved = need(path);
  saved->documentID = old->documentID;
  old->documentID = {};
  for (const auto& [name, value] : old->attributes) {
    if (isKept(name)) saved->attributes.emplace(name, value);
  }
}

void FakeTree::setMode(std::string_view path, unsigned mode) {
  const std::lock_guard lock(mutex);
  need(path)->mode = mode;
}

void FakeTree::mount(std::string_view path, DeviceID device) {
  const std::lock_guard lock(mutex);
  putOnDevice(*need(path), device);
}

void FakeTree::setAttribute(std::string_view path, std::string_view name, FndData value) {
  const std::lock_guard lock(mutex);
  need(path)->attributes.insert_or_assign(std::string(name), std::move(value));
}

std::optional<FndData> FakeTree::attribute(std::string_view path, std::string_view name) {
  const std::lock_guard lock(mutex);
  const auto& attributes = need(path)->attributes;
  const auto found = attributes.find(name);
  return found == attributes.end() ? std::nullopt : std::optional(found->second);
}

FileID FakeTree::fileID(std::string_view path) {
  const std::lock_guard lock(mutex);
  return need(path)->fileID;
}

DocumentID FakeTree::documentID(std::string_view path) {
  const std::lock_guard lock(mutex);
  return need(path)->documentID;
}

void FakeTree::withholdResource(FndURLResourceKey key) { _withheld.insert(key); }

void FakeTree::setResource(std::string_view path, FndURLResourceKey key,
                           FndURL::ResourceValue value) {
  _given.insert_or_assign({std::string(path), key}, std::move(value));
}

void FakeTree::setLinkCount(std::string_view path, std::uint64_t count) {
  _linkCounts[std::string(path)] = count;
}

void FakeTree::setAttributeCapacity(std::size_t bytes) { _attributeCapacity = bytes; }

std::optional<FndURL::ResourceValue> FakeTree::givenResource(const std::string& path,
                                                             FndURLResourceKey key) const {
  const auto found = _given.find({path, key});
  return found == _given.end() ? std::nullopt : std::optional(found->second);
}

std::optional<std::uint64_t> FakeTree::givenLinkCount(const std::string& path) const {
  const auto found = _linkCounts.find(path);
  return found == _linkCounts.end() ? std::nullopt : std::optional(found->second);
}

Result<Node> FakeTree::find(std::string_view path, FinalLink finalLink) {
  const std::lock_guard lock(mutex);
  Node node = _root;
  for (const std::string& name : componentsOf(path)) {
    if (node->kind == FileKind::SymbolicLink) return fakeFailure(ELOOP);
    if (node->kind != FileKind::Directory) return fakeFailure(ENOTDIR);
    if (!node->isSearchable()) return fakeFailure(EACCES);
    node = entryOf(*node, name);
    if (node == nullptr) return fakeFailure(ENOENT);
  }
  if (node->kind != FileKind::SymbolicLink || finalLink == FinalLink::Stay) return node;
  const auto target = realPath(std::string(path) + "/.");
  return target ? find(*target, FinalLink::Stay)
                : fakeFailure(static_cast<int>(target.error().code()));
}

Result<std::string> FakeTree::realPath(std::string_view path) {
  const std::lock_guard lock(mutex);
  // A "." at the end asks for what a link there leads to.
  const bool followsLast = path.ends_with("/.");
  std::vector<std::string> waiting = componentsOf(path);
  std::ranges::reverse(waiting);
  std::string real = "/";
  int links = 0;
  while (!waiting.empty()) {
    const std::string name = std::move(waiting.back());
    waiting.pop_back();
    if (name == "..") {
      real = splitFakePath(real).first;
      continue;
    }
    const auto folder = find(real);
    if (!folder) return std::unexpected(folder.error());
    if ((*folder)->kind != FileKind::Directory) return fakeFailure(ENOTDIR);
    if (!(*folder)->isSearchable()) return fakeFailure(EACCES);
    const Node entry = entryOf(**folder, name);
    const bool isLast = waiting.empty();
    if (entry == nullptr && (!isLast || followsLast)) return fakeFailure(ENOENT);
    if (entry == nullptr || entry->kind != FileKind::SymbolicLink || (isLast && !followsLast)) {
      real = joined(real, name);
      continue;
    }
    if (++links > kMostLinks) return fakeFailure(ELOOP);
    if (entry->linkTarget.starts_with('/')) real = "/";
    std::vector<std::string> target = componentsOf(entry->linkTarget);
    waiting.insert(waiting.end(), target.rbegin(), target.rend());
  }
  return real;
}

Result<std::string> FakeTree::pathOf(DeviceID device, FileID fileID) {
  const std::lock_guard lock(mutex);
  const auto found = search(*_root, "/", [&](const FakeNode& node) {
    return node.device == device && node.fileID == fileID;
  });
  if (found) return found->first;
  return fakeFailure(ENOENT);
}

Node FakeTree::nodeOfDocument(DocumentID documentID) {
  const std::lock_guard lock(mutex);
  const auto found = search(
      *_root, "/", [documentID](const FakeNode& node) { return node.documentID == documentID; });
  return found ? found->second : nullptr;
}

DocumentID FakeTree::allocateDocumentID(FakeNode& node) {
  const std::lock_guard lock(mutex);
  if (node.documentID.value == 0) node.documentID = DocumentID{_nextDocumentID++};
  return node.documentID;
}

}  // namespace vantrell
