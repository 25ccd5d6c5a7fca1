// Pieces of an expected DFE despatch advice, as the day's file holds them,
// for the consignments of the StarTrackRowsFixture's host data.
#pragma once

#include <array>
#include <string>
#include <utility>
#include <vector>

namespace quendal::test::dfe {

inline const std::string kHead =
    "<?xml version='1.0'?>\r\n<!--DFE Despatch Advice file created by Merivane.-->\r\n"
    "<NewDataSet>\r\n";
inline const std::string kTail = "</NewDataSet>\r\n";

using Cells = std::vector<std::pair<std::string, std::string>>;

// One table under the root, one element per line.
inline std::string Block(const std::string& table, const Cells& cells) {
  std::string out = "  <" + table + ">\r\n";
  for (const auto& [name, text] : cells) out += "    <" + name + ">" + text + "</" + name + ">\r\n";
  return out + "  </" + table + ">\r\n";
}

// The consignment's table; the receiver and the order are the fixture's.
struct TableCells {
  std::string connote;
  std::string date = "2024-03-14T09:00:00+10";
  std::string items;
  std::string kgs;
  std::string reference = "PONo DSP778812";
  std::string start = "2024-03-15T07:00:00+10";
  std::string stop = "2024-03-18T17:30:00+10";
  std::string dangerous = "False";
  std::string name = "Myer Chadstone";
  // Address lines, city, state and postcode.
  std::array<std::string, 5> address = {"1341 Dandenong Road", "Loading Dock 3", "CHADSTONE", "VIC",
                                        "3148"};
};

inline std::string Table(const TableCells& t) {
  return Block("Table", {{"ReceiverName", t.name},
                         {"ReceiverAddress1", t.address[0]},
                         {"ReceiverAddress2", t.address[1]},
                         {"ReceiverAddress3", ""},
                         {"ReceiverCity", t.address[2]},
                         {"ReceiverState", t.address[3]},
                         {"ReceiverPostcode", t.address[4]},
                         {"Connote", t.connote},
                         {"ConnoteDate", t.date},
                         {"Special", ""},
                         {"Items", t.items},
                         {"Pallets", "0"},
                         {"KGS", t.kgs},
                         {"Cubic", ""},
                         {"Service", ""},
                         {"CustomerReference", t.reference},
                         {"StartDate", t.start},
                         {"StopDate", t.stop},
                         {"Class", ""},
                         {"InsuranceAmount", "0.00"},
                         {"DangerousGoods", t.dangerous}});
}

inline std::string Table1(const std::string& id, const std::string& connote,
                          const std::string& packageType, const std::string& items,
                          const std::string& kgs, const std::string& type) {
  return Block("Table1", {{"ConnoteDetailsId", id},
                          {"Connote", connote},
                          {"SenderReference", "ASNNo ASN-000501"},
                          {"PackageType", packageType},
                          {"Items", items},
                          {"KGS", kgs},
                          {"Length", ""},
                          {"Width", ""},
                          {"Height", ""},
                          {"Quantity", ""},
                          {"Cubic", ""},
                          {"Type", type}});
}

inline std::string Table2(const std::string& id, const std::string& connote,
                          const std::string& sscc) {
  return Block("Table2",
               {{"ConnoteDetailsId", id}, {"Connote", connote}, {"LabelTrackCode", sscc}});
}

}  // namespace quendal::test::dfe
