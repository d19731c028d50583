#include "linux/devinfo/LinuxDevinfo.h"

#include <gtest/gtest.h>

#include <filesystem>

#include "tests/contracts/TemporaryFolder.h"

namespace vantrell::linuxos {
namespace {

class LinuxDevinfoTest : public ::testing::Test {
 protected:
  LinuxDevinfoTest() {
    std::filesystem::create_directories(_root.path("sys/class/dmi/id"));
    std::filesystem::create_directories(_root.path("proc/device-tree"));
  }
  int classNumber() const { return LinuxDevinfo(_root.path()).deviceClassNumber(); }
  void setDMI(const std::string& text) { _root.writeFile("sys/class/dmi/id/chassis_type", text); }
  void setTree(const std::string& text) { _root.writeFile("proc/device-tree/chassis-type", text); }

 private:
  vantrell::testing::TemporaryFolder _root;
};

TEST_F(LinuxDevinfoTest, PhonesAndTabletsHaveTheNumbersThatTheExtensionKnows) {
  setDMI("11\n");
  EXPECT_EQ(classNumber(), 1);
  setDMI("30\n");
  EXPECT_EQ(classNumber(), 3);
}

TEST_F(LinuxDevinfoTest, NoOtherMachineIsTakenForOne) {
  for (const int chassis : {1, 3, 9, 23, 31, 36}) {
    setDMI(std::to_string(chassis) + "\n");
    EXPECT_EQ(classNumber(), 100 + chassis);
  }
}

TEST_F(LinuxDevinfoTest, TheDeviceTreeAnswersWhereThereIsNoDMI) {
  setTree(std::string("handset\0", 8));
  EXPECT_EQ(classNumber(), 1);
  setTree(std::string("tablet\0", 7));
  EXPECT_EQ(classNumber(), 3);
  setTree(std::string("laptop\0", 7));
  EXPECT_EQ(classNumber(), 109);
}

TEST_F(LinuxDevinfoTest, WhatCannotBeMadeOutIsAnUnknownMachine) {
  EXPECT_EQ(classNumber(), 102);
  for (const char* odd : {"", "x", "0", "-30", "300000000000", "30 tablets"}) {
    setDMI(odd);
    EXPECT_EQ(classNumber(), 102) << odd;
  }
}

TEST_F(LinuxDevinfoTest, TheScaleIsOneWhereNoDisplayIsKnown) {
  EXPECT_EQ(LinuxDevinfo().mainScreenScale(), 1.0);
}

}  // namespace
}  // namespace vantrell::linuxos
