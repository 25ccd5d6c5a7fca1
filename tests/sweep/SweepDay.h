// The demo's despatch day as a test bed for sweeping every built class:
// each run gets a fresh copy of the host database and of the carrier
// folders, reached through a Sweep, and runs one class's operation (a label
// per pack, one consignment, or a whole row run). What the run left behind
// is checked for the shape the carrier and the printer expect.
#pragma once

#include <map>
#include <memory>
#include <string>
#include <vector>

#include "frame/Catalogue.h"
#include "platform/MemorySpooler.h"
#include "tests/support/TempFolder.h"
#include "tests/sweep/SweepHost.h"

namespace quendal::test {

// Files by path relative to the run's folder.
using FileMap = std::map<std::string, std::string>;

struct Outcome {
  std::string escaped;               // what escaped to the caller, if anything
  std::vector<std::string> prompts;  // error reports shown
  std::vector<std::string> logs;     // messages of the log entries written
  FileMap files;                     // what the run's folder holds afterwards
  std::vector<MemorySpooler::Job> jobs;
};

class SweepDay {
 public:
  SweepDay();
  ~SweepDay();

  // Runs the class once on a fresh copy of the day; consignment classes find
  // the day file already holding one consignment of their carrier.
  Outcome Run(const CatalogueEntry& entry, Sweep& sweep);

  // What is wrong with a run, judged against the clean run of the same class;
  // `sameShape` also wants every printer stream to keep the clean run's structure.
  std::vector<std::string> Check(const CatalogueEntry& entry, const Outcome& clean,
                                 const Outcome& run, bool sameShape) const;

 private:
  struct Seed {
    std::string database;
    FileMap files;
  };
  const Seed& SeedOf(const CatalogueEntry& entry);
  Outcome RunIn(const CatalogueEntry& entry, Sweep& sweep, const Seed& seed, bool second);
  std::string CarrierFolder(const CatalogueEntry& entry) const;

  TempFolder temp_;
  std::string previousConfig_;
  Seed day_;
  std::map<std::string, Seed> seeds_;
  // Per carrier name: its consignments, its EDI document, its printer, its folder code.
  struct CarrierDay {
    std::vector<std::int64_t> conNotes;
    std::int16_t ediDocument = 0;
    std::string printer;
    std::string folder;  // relative to the day's root, ending in "/"
  };
  std::map<std::string, CarrierDay> carriers_;
  std::vector<std::string> printers_;
  int runNumber_ = 0;
};

// QUENDAL_SWEEP=full: every member with every text (by default a share of
// them, taken in turn, so that the sweep stays short under the sanitizers).
bool FullSweep();
// QUENDAL_SWEEP_CLASS=clsX: that class alone.
bool Swept(const CatalogueEntry& entry);

}  // namespace quendal::test
