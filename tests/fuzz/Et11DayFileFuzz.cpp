// libFuzzer target: any bytes found as the day's ET11 file. One more
// consignment is either refused, with a log entry or an error report and
// the file as it was, or it replaces the file's trailer: what stood before
// the trailer is kept, the consignment's lines follow, and a new trailer
// counts four more lines than the old one.
#include <charconv>
#include <cstddef>
#include <cstdint>
#include <string>

#include "carrierfiles/cTNTDAet11.h"
#include "platform/Clock.h"
#include "tests/fuzz/DayFileFuzz.h"
#include "tests/support/MemoryHost.h"
#include "tests/support/Records.h"

using namespace quendal;

namespace {

std::uint64_t CountOf(const std::string& trailer) {
  std::size_t at = trailer.size();
  while (at > 0 && trailer[at - 1] >= '0' && trailer[at - 1] <= '9') --at;
  std::uint64_t count = 0;
  std::from_chars(trailer.data() + at, trailer.data() + trailer.size(), count);
  return count;
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  const std::string before(reinterpret_cast<const char*>(data), size);
  fuzz::CountingPrompt& prompt = fuzz::Prompt();
  const int asked = prompt.asked;
  SetNow(DateTime::FromParts(2024, 3, 14, 9, 30, 0));
  const std::string& folder = fuzz::EmptyFolder();
  const std::string path = folder + "TNT0114031200.TXT";
  fuzz::Lay(path, before);

  test::MemoryHost host;
  auto carrier = host.Make<host::Carrier>(
      {{"FileFolder", folder}, {"AccountRef", "TNT01"}, {"AccountNumber", "30012345"}});
  auto despatch = host.Make<host::Despatch>({{"NotAfter", DateTime::FromParts(2024, 3, 19, 17, 0, 0)}});
  auto asn = host.Make<host::ASN>({{"ID", 1}, {"ASNNo", "ASN0004501"}, {"OriginCode", "MELBOURNE"}});
  auto conNote = host.Make<host::ConNote>({{"ConNoteId", 102},
                                           {"ConNoteNo", "FUZZ0001"},
                                           {"ConNoteDate", DateTime::FromParts(2024, 3, 14, 8, 0, 0)},
                                           {"Service", "EXPRESS"},
                                           {"CarrierPrefix", "TNT"},
                                           {"Weight", 12.25},
                                           {"Carrier", carrier}});
  test::MemoryHost::Attach(
      conNote, {host.Make<host::Pack>({{"SSCC", "00093123450000000012"}, {"Despatch", despatch}})});
  clsTNTDAet11 cls;
  LogList log;
  cls.Process(host.system, conNote, asn, host::Object::As<host::PackList>(conNote->fields["Packs"]), log);

  const std::string after = ReadFile(path).value_or("");
  if (after == before) {
    fuzz::Check(!log.empty() || prompt.asked > asked);
    return 0;
  }
  fuzz::Check(log.empty() && prompt.asked == asked);
  // The old trailer is the file's last line, after its last line feed.
  std::size_t kept = 0;
  if (!before.empty()) {
    const std::size_t feed = before.size() >= 3 ? before.rfind('\n', before.size() - 3) : std::string::npos;
    kept = feed == std::string::npos ? 0 : feed + 1;
    fuzz::Check(after.compare(0, kept, before, 0, kept) == 0);
  }
  const std::vector<std::string> lines = test::CrLfLines(after.substr(kept));
  fuzz::Check(after.ends_with("\r\n"));
  const std::size_t n = lines.size();
  fuzz::Check(n == (before.empty() ? 7u : 5u));
  fuzz::Check(lines[n - 5][0] == 'C' && lines[n - 4][0] == 'E' && lines[n - 3][0] == 'F' &&
              lines[n - 2][0] == 'H' && lines[n - 1][0] == 'Z');
  fuzz::Check(lines[n - 5].find("FUZZ0001") != std::string::npos);
  const std::uint64_t previous = before.empty() ? 3 : CountOf(before.substr(kept, before.size() - kept - 2));
  fuzz::Check(CountOf(lines.back()) == previous + 4);
  return 0;
}
