#pragma once
// A test machine in UTC with its own store directory under a temporary root,
// the debug flag off before and after each test.
#include <gtest/gtest.h>

#include <cstdlib>
#include <ctime>
#include <filesystem>

#include "base/Console.h"
#include "support/FakePlatform.h"
#include "support/TempDir.h"

namespace bw::test {

class MachineFixture : public ::testing::Test {
 protected:
  void SetUp() override {
    setenv("TZ", "UTC", 1);
    tzset();
    gDebug = 0;
    fake.root = root.path();
    std::filesystem::create_directories(fake.ownStoreDirectory());
  }
  void TearDown() override { gDebug = 0; }

  TempDir root;
  FakePlatform fake;
};

}  // namespace bw::test
