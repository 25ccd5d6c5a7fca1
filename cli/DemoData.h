// The demo's despatch day as one host-data JSON document: a vendor, a
// carrier for every carrier the catalogue names (each with its account,
// folder and label printer), distribution centres and stores, about thirty
// consignments of one to nine packs dated today, an ASN per despatch and an
// EDI document per carrier.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "cli/Cli.h"
#include "frame/Var.h"

namespace quendal::cli {

struct DemoCarrier {
  std::int32_t carrierId;
  std::int32_t ediDocumentId;
  std::string name;     // as the catalogue names the carrier
  std::string printer;  // its label printer (a folder of the directory spooler)
  std::string folder;   // its FileFolder, ending in "/"
  std::string outputFolder;  // its EDI document's OutputFolder, ending in "/"
};

// A file the demo lays down beside the data before it runs the classes.
struct DemoFile {
  std::string path;
  std::string text;
};

struct DemoData {
  json document;
  std::vector<DemoCarrier> carriers;
  std::string documentPrinter;
  std::vector<DemoFile> files;  // the map files of the map-driven despatch advice
};

// `root` is the demo folder (absolute); carrier folders lie under root/carriers/.
// `consignments` sets the size of the day (the demo's own is 30); however
// many there are, they all fall between 08:00 and 18:00 of the same day.
DemoData BuildDemoData(const std::string& root, DateTime now, int consignments = 30);

// The SSCC "00" + extension digit, company prefix, serial and GS1 check digit.
std::string DemoSscc(std::int64_t serial);

}  // namespace quendal::cli
