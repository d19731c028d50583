#pragma once

#include <cstdint>
#include <initializer_list>
#include <random>
#include <string>
#include <vector>

#include "TestStorage.h"

namespace vantrell::properties {

/// One thing that happens, with numbers that choose among what is there when it happens. Steps
/// can therefore be left out of a list, and the rest still means something.
struct Step {
  std::uint32_t action = 0;
  std::uint32_t one = 0;
  std::uint32_t two = 0;
  std::uint32_t three = 0;
};

/// Does to a storage what people and programs do to theirs, one step at a time.
///
/// Threads: use from one thread. Lifetime: borrows the storage.
class StepPlayer {
 public:
  explicit StepPlayer(TestStorage& storage) : _storage(storage) {}

  /// A step whose action is drawn by how often programs do it.
  static Step draw(std::mt19937_64& random);
  /// A step that only makes something new.
  static Step drawCreation(std::mt19937_64& random);
  /// A step by which something leaves the view, and one by which something comes back.
  static Step drawDeparture(std::mt19937_64& random);
  static Step drawReturn(std::mt19937_64& random);

  /// Steps that set attributes do nothing without `takesAttributes`.
  void play(const Step& step, bool takesAttributes);

 private:
  struct Action;
  static const std::vector<Action>& actions();
  static Step drawOneOf(std::initializer_list<void (StepPlayer::*)()> choices,
                        std::mt19937_64& random);

  // Making and removing.
  void createFile();
  void createFolder();
  void createPackage();
  void createOther();
  void remove();
  void removeAndReuseNumber();
  void copy();
  void copyWithAttributes();
  void copyAs(bool withAttributes);
  void hardLink();
  // Moving.
  void rename();
  void moveToFolder();
  void renameOver();
  void exchange();
  void rotate();
  void hide();
  void show();
  void trash();
  void moveOut();
  void moveIn();
  void moveInOver();
  void moveFolder();
  void recaseFolderAsPackage();
  // Saving.
  void writeInPlace();
  void saveThroughTemporary();
  void saveThroughUnnamed();
  void saveWithBackup();
  void saveWithBackupDeleted();
  void saveByExchange();
  void saveByExchangeKeepingOld();
  void exchangeWithTemporary(bool removeOld);
  void saveByUnlinkAndCreate();
  void saveOneNameOfHardLink();
  void replaceByNonDocument();
  // Attributes.
  void setKeptAttribute();
  void setOtherAttribute();
  void removeAttribute();

  std::string content();
  const Place* document(std::uint32_t number) const;
  const Place* plainFolder(std::uint32_t number) const;
  const Place* thingOutside(std::uint32_t number) const;
  std::string anyFolder(std::uint32_t number) const;
  std::string freePath(const std::string& folder, const std::string& name) const;
  void createLike(const Place& original, const std::string& path);
  void removeThing(const std::string& path);
  bool putOver(const std::string& from, const Place& target);

  TestStorage& _storage;
  ObservedTree _tree;
  Step _step;
  bool _takesAttributes = true;
  std::uint32_t _contents = 0;
};

}  // namespace vantrell::properties
