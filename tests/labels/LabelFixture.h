// What a label class needs around it in a test: an in-memory host, an
// in-memory spooler with the printer "Dock 3", the clock fixed at
// 14/03/2024, a private settings folder, and one ordinary carton sent to
// store 0412 (Harbour Stores Chadstone) through distribution centre 0900.
#pragma once

#include <gtest/gtest.h>

#include <memory>
#include <optional>
#include <string>

#include "platform/Clock.h"
#include "platform/MemorySpooler.h"
#include "tests/support/MemoryHost.h"
#include "tests/support/TempFolder.h"

namespace quendal::test {

class LabelFixture : public ::testing::Test {
 protected:
  void SetUp() override;
  void TearDown() override;

  std::shared_ptr<MemoryObject<host::Pack>> MakePack(int id, const std::string& sscc);
  // The bytes of the jobs printed since the last call, in order.
  std::vector<std::string> TakeJobs();

  TempFolder config;
  std::optional<std::string> savedXdg;
  std::shared_ptr<MemorySpooler> spooler = std::make_shared<MemorySpooler>();
  std::shared_ptr<Spooler> previousSpooler;
  MemoryHost host;
  std::shared_ptr<MemoryObject<host::Vendor>> vendor;
  std::shared_ptr<MemoryObject<host::Carrier>> carrier;
  std::shared_ptr<MemoryObject<host::Receiver>> dc;
  std::shared_ptr<MemoryObject<host::Receiver>> store;
  std::shared_ptr<MemoryObject<host::Order>> order;
  std::shared_ptr<MemoryObject<host::Despatch>> despatch;
  std::shared_ptr<MemoryObject<host::Carton>> carton;
  std::shared_ptr<MemoryObject<host::ConNote>> conNote;
  std::shared_ptr<MemoryObject<host::Pack>> pack;
};

}  // namespace quendal::test
