// libFuzzer target: any bytes found as the day's eParcel manifest. A run of
// one more consignment (Init, Load, Process, Term) either fails with a log
// entry or an error report and the file as it was, or leaves the
// consignment once in a manifest that parses: the day file, or a file
// beside it when the day file can't be read as a manifest.
#include <chrono>
#include <cstddef>
#include <cstdint>
#include <ctime>
#include <string>

#include "frame/Catalogue.h"
#include "manifests/PcmsDocument.h"
#include "platform/Clock.h"
#include "tests/fuzz/DayFileFuzz.h"
#include "tests/support/MemoryHost.h"

using namespace quendal;

namespace {

// Today at 16:30: the day file is found by the date it was created on.
DateTime TodayAtHalfPastFour() {
  const std::time_t t = std::chrono::system_clock::to_time_t(std::chrono::system_clock::now());
  std::tm local{};
  localtime_r(&t, &local);
  return DateTime::FromParts(local.tm_year + 1900, local.tm_mon + 1, local.tm_mday, 16, 30, 0);
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  const std::string before(reinterpret_cast<const char*>(data), size);
  fuzz::CountingPrompt& prompt = fuzz::Prompt();
  const int asked = prompt.asked;
  SetNow(TodayAtHalfPastFour());
  const std::string& folder = fuzz::EmptyFolder();
  const std::string path = folder + "NPP1_0999_EP.xml";
  fuzz::Lay(path, before);

  test::MemoryHost host;
  auto vendor =
      host.Make<host::Vendor>({{"VendorId", 1}, {"Name", "Acme Apparel Pty Ltd"}, {"State", "VIC"}});
  auto carrier = host.Make<host::Carrier>({{"CarrierId", 2},
                                           {"Options", "EP"},
                                           {"AccountRef", "NPP1"},
                                           {"AccountNumber", "98765"},
                                           {"FileFolder", folder}});
  host.Make<host::Partner>({{"PartnerId", 1}});
  host.Make<host::EDIDocument>(
      {{"ID", 7}, {"VendorId", 1}, {"PartnerId", 1}, {"CarrierId", 2}, {"OutputFolder", folder}});
  auto order = host.Make<host::Order>({{"DeliveryAddress", host.Make<host::Address>(
                                                               {{"Name", "J SMITH"},
                                                                {"Suburb", "RICHMOND"},
                                                                {"Postcode", "3121"}})}});
  auto conNote = host.Make<host::ConNote>({{"ConNoteId", 102},
                                           {"ConNoteNo", "NPP0000077"},
                                           {"ConNoteDate", Now()},
                                           {"Service", "EPARCEL"},
                                           {"ServiceLevel", "STANDARD"},
                                           {"Weight", 2.5},
                                           {"PartnerCode", "HBS"},
                                           {"Vendor", vendor},
                                           {"Carrier", carrier},
                                           {"Orders", test::MemoryHost::List<host::Order>({order})}});
  auto despatch = host.Make<host::Despatch>({{"DespatchNo", "PO778812"}});
  auto carton = host.Make<host::Carton>({{"Length", 0.40}, {"Width", 0.30}, {"Height", 0.25}});
  test::MemoryHost::Attach(
      conNote,
      {host.Make<host::Pack>({{"Order", order}, {"Despatch", despatch}, {"Carton", carton}})});

  auto object = CreateObject("Quendal.clseParcelManifestxml").object;
  auto* run = as<RowInterface>(object);
  fuzz::Check(run != nullptr);
  Grid columns, grid;
  LogList log;
  const bool done = run->Init(host.system, 7, columns) && run->Load("", grid) == 1 &&
                    run->Process(0, log) == 102 && run->Term();
  if (!done) {
    fuzz::Check(ReadFile(path).value_or("") == before && (!host.logs.empty() || prompt.asked > asked));
    return 0;
  }
  // The consignment is once in a manifest that parses (a file kept as it
  // was may hold it already, in which case the run adds nothing).
  int holding = 0;
  for (const auto& [file, bytes] : fuzz::Written(folder, path, before)) {
    fuzz::Check(pcms::Document::Parse(bytes) != nullptr);
    fuzz::Check(bytes.find("<ConsignmentNumber>NPP10000077</ConsignmentNumber>") != std::string::npos);
    ++holding;
  }
  fuzz::Check(holding <= 1);
  return 0;
}
