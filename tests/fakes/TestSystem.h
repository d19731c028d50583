#pragma once

#include <string>
#include <string_view>

#include "platform/Services.h"
#include "tests/fakes/FakeAppreg.h"
#include "tests/fakes/FakeClock.h"
#include "tests/fakes/FakeExtendedAttributes.h"
#include "tests/fakes/FakeFileSystem.h"
#include "tests/fakes/FakeLogSink.h"
#include "tests/fakes/FakeManager.h"
#include "tests/fakes/FakeTree.h"
#include "tests/fakes/FakeTypeRegistry.h"
#include "tests/fakes/FakeVerstow.h"
#include "tests/fakes/FakeVolumes.h"

namespace vantrell {

/// A whole system of fakes, installed for as long as it lives. The storage root is there and
/// empty. Other roots and more applications are set up before anything is asked.
class TestSystem {
 public:
  static constexpr std::string_view kStorageRoot = "/storage/Documents";

  TestSystem();
  ~TestSystem();
  TestSystem(const TestSystem&) = delete;
  TestSystem& operator=(const TestSystem&) = delete;

  /// The path of something in the storage.
  static std::string inStorage(std::string_view relativePath);
  static FndURL urlInStorage(std::string_view relativePath);
  /// Makes the file and answers a fresh URL of it.
  FndURL file(std::string_view relativePath, std::string_view content = "");
  FndURL folder(std::string_view relativePath);

  /// Installs an application whose library is "/apps/<bundle identifier>/Documents", and makes
  /// that folder.
  FndURL addApp(std::string bundleIdentifier, std::optional<std::string> localizedName = {});

  FakeTypeRegistry types;
  FakeTree tree;
  FakeFileSystem fileSystem{tree, types};
  FakeExtendedAttributes attributes{tree};
  FakeVolumes volumes{tree};
  FakeVerstow verstow{tree, types};
  FakeLogSink log;
  FakeClock clock;
  FakeManager manager{kStorageRoot};
  FakeAppreg appreg;

 private:
  platform::Installation _installation;
};

}  // namespace vantrell
