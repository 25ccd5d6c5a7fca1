// libFuzzer target: any bytes found as the day's DFE despatch advice. One
// more consignment is either refused, with a log entry or an error report
// and the file as it was, or it lands whole, once, in a file that parses:
// the day file, or a file beside it when the day file can't be extended.
#include <cstddef>
#include <cstdint>
#include <pugixml.hpp>
#include <string>

#include "carrierfiles/cDFEDAxml.h"
#include "platform/Clock.h"
#include "tests/fuzz/DayFileFuzz.h"
#include "tests/support/MemoryHost.h"

using namespace quendal;

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  const std::string before(reinterpret_cast<const char*>(data), size);
  fuzz::CountingPrompt& prompt = fuzz::Prompt();
  const int asked = prompt.asked;
  SetNow(DateTime::FromParts(2024, 3, 14, 9, 0, 0));
  const std::string& folder = fuzz::EmptyFolder();
  const std::string path = folder + "MANIFEST_40217_202403141200.XML";
  fuzz::Lay(path, before);

  test::MemoryHost host;
  auto carrier = host.Make<host::Carrier>(
      {{"FileFolder", folder}, {"AccountRef", "DFE"}, {"AccountNumber", "40217"}});
  auto receiver = host.Make<host::Receiver>({{"Name", "Harbour Retail DC"},
                                             {"Suburb", "PORT MELBOURNE"},
                                             {"State", "VIC"},
                                             {"Postcode", "3207"}});
  auto asn = host.Make<host::ASN>({{"ID", 501}, {"ASNNo", "ASN-000501"}});
  auto despatch = host.Make<host::Despatch>({{"DespatchNo", "DSP778812"}});
  auto conNote = host.Make<host::ConNote>({{"ConNoteId", 101},
                                           {"ConNoteNo", "0000001"},
                                           {"ConNoteDate", Now()},
                                           {"Weight", 12.5},
                                           {"Carrier", carrier},
                                           {"Receiver", receiver}});
  test::MemoryHost::Attach(conNote, {host.Make<host::Pack>({{"SSCC", "00093123450000001010"},
                                                            {"ASNId", 501},
                                                            {"ASN", asn},
                                                            {"PackType", "CARTON"},
                                                            {"Despatch", despatch}})});
  clsDFEDAxml cls;
  LogList log;
  cls.Process(host.system, conNote, asn, conNote->Packs(), log);

  bool completed = false;
  for (const auto& entry : host.logs)
    if (entry.at("Message").Text() == "ConNote 0000001 compile completed.") completed = true;
  if (!completed) {
    fuzz::Check(ReadFile(path).value_or("") == before && (!log.empty() || prompt.asked > asked));
    return 0;
  }
  // Exactly one file of the folder holds the consignment, once, and parses.
  int holding = 0;
  for (const auto& [file, bytes] : fuzz::Written(folder, path, before)) {
    if (bytes.find("<Connote>4021710000001</Connote>") == std::string::npos) continue;
    ++holding;
    pugi::xml_document doc;
    fuzz::Check(static_cast<bool>(doc.load_buffer(bytes.data(), bytes.size())));
    int tables = 0;
    for (pugi::xml_node table : doc.child("NewDataSet").children("Table"))
      if (std::string_view(table.child_value("Connote")) == "4021710000001") ++tables;
    fuzz::Check(tables == 1);
  }
  fuzz::Check(holding == 1);
  return 0;
}
