// Every built class, once per host member it reads, with that member alone
// Null (a scalar) or Nothing (an object or collection); and once per text
// member and hostile text, with that member alone answering the text.
// Each run must end without anything escaping, keep the carrier files
// whole (fixed widths, column counts, well-formed XML, nothing outside the
// carrier folder) and keep the printer streams' structure.
//
// QUENDAL_SWEEP=full sweeps every member with every text; by default every
// fourth member of each class (a different fourth per class) with one text
// each, taken in turn, so that the sweep stays short under the sanitizers.
// QUENDAL_SWEEP_CLASS=clsX sweeps one class.
#include <gtest/gtest.h>

#include <iostream>

#include "tests/sweep/SweepDay.h"

namespace quendal::test {
namespace {

struct Tally {
  int runs = 0;
  std::vector<std::string> faults;
  void Add(const std::string& what, const std::vector<std::string>& found) {
    ++runs;
    for (const auto& f : found) faults.push_back(what + ": " + f);
  }
  void Report(const char* sweep) const {
    std::cout << sweep << ": " << runs << " runs, " << faults.size() << " faults\n";
    ::testing::Test::RecordProperty(std::string(sweep) + "_runs", runs);
    for (std::size_t i = 0; i < faults.size() && i < 400; ++i) ADD_FAILURE() << faults[i];
  }
};

// The share of members a default sweep takes.
constexpr std::size_t kShare = 4;

// The built classes of the family, with the members the clean run read.
template <class Each>
void ForEachClass(Family family, SweepDay& day, Tally& tally, Each&& each) {
  std::size_t index = 0;
  for (const auto& entry : Catalogue()) {
    if (!entry.factory || entry.family != family || !Swept(entry)) continue;
    ++index;
    Sweep recorder;
    const Outcome clean = day.Run(entry, recorder);
    const std::string name(entry.className);
    tally.Add(name + " clean", day.Check(entry, clean, clean, true));
    if (!clean.prompts.empty())
      tally.faults.push_back(name + " clean run reported " + clean.prompts.front());
    std::vector<std::pair<MemberKey, Var::Type>> members;
    std::size_t turn = index;
    for (const auto& [key, kind] : recorder.Read())
      if (kind != Var::Type::Null && (FullSweep() || turn++ % kShare == 0))
        members.emplace_back(key, kind);
    each(entry, clean, members);
  }
}

void NullSweep(Family family, const char* name) {
  SweepDay day;
  Tally tally;
  ForEachClass(family, day, tally,
               [&](const CatalogueEntry& entry, const Outcome& clean, const auto& members) {
                 for (const auto& [key, kind] : members) {
                   Sweep sweep;
                   sweep.Aim(key);
                   const Outcome run = day.Run(entry, sweep);
                   tally.Add(std::string(entry.className) + " with " + key.Name() + " Null",
                             day.Check(entry, clean, run, false));
                 }
               });
  tally.Report(name);
  EXPECT_GT(tally.runs, 0);
}

TEST(NullSweep, LabelClasses) { NullSweep(Family::Label, "null sweep, label classes"); }
TEST(NullSweep, ConsignmentClasses) {
  NullSweep(Family::Consignment, "null sweep, consignment classes");
}
TEST(NullSweep, RowClasses) { NullSweep(Family::Rows, "null sweep, row classes"); }

// Texts that break printer streams, delimited and fixed-width records, XML
// and file names when they pass through unchanged.
const std::vector<std::string>& HostileTexts() {
  static const std::vector<std::string> texts = {
      "ALL \"OF\" 'THEM' |{B,1,N}| ^XA~JA^XZ, A;B\tC\r\nD\n../..\\x/y:z* "
      "\xC3\x84\xE2\x82\xAC\xE2\x9C\x93\xF0\x9F\x98\x80",
      std::string(10000, 'W'),
      "QUOTE\"D \"TEXT",
      "PIPE|TEXT|",
      "BRACE{B,1,N}TEXT}",
      "CARET^FS^XZ~TILDE",
      "COMMA,TEXT,",
      "TAB\tTEXT",
      "LINE\r\nBREAK\nTEXT\r",
      "../../../escaped",
      "..\\..\\escaped/a/b",
      "\xC3\x84\xC3\x96\xC3\x9C \xE2\x82\xAC \xE2\x9C\x93 \xE6\x97\xA5\xE6\x9C\xAC "
      "\xF0\x9F\x98\x80",
      "",
  };
  return texts;
}

// Settings rather than texts: folders and printers say where output goes,
// option codes, the service level and the language what is printed.
bool IsSetting(const MemberKey& key) {
  return key.member == "FileFolder" || key.member == "OutputFolder" ||
         key.member == "DocumentPrinter" || key.member == "PrinterLanguage" ||
         key.member == "Options" || key.member == "NotifyOptions" || key.member == "ServiceLevel";
}

void TextSweep(Family family, const char* name) {
  SweepDay day;
  Tally tally;
  const auto& texts = HostileTexts();
  std::size_t turn = 0;
  ForEachClass(
      family, day, tally,
      [&](const CatalogueEntry& entry, const Outcome& clean, const auto& members) {
        for (const auto& [key, kind] : members) {
          if (kind != Var::Type::Text || IsSetting(key)) continue;
          std::vector<std::size_t> which;
          if (FullSweep())
            for (std::size_t i = 0; i < texts.size(); ++i) which.push_back(i);
          else  // the long text lays out slowly in the row classes' printed reports
            which = {family == Family::Rows && turn % texts.size() == 1 ? 0 : turn % texts.size()};
          ++turn;
          for (std::size_t i : which) {
            Sweep sweep;
            const std::string text = texts[i];
            sweep.Aim(key, [text](const Var&) { return Var(text); });
            const Outcome run = day.Run(entry, sweep);
            tally.Add(
                std::string(entry.className) + " with " + key.Name() + " text " + std::to_string(i),
                day.Check(entry, clean, run, true));
          }
        }
      });
  tally.Report(name);
  EXPECT_GT(tally.runs, 0);
}

TEST(TextSweep, LabelClasses) { TextSweep(Family::Label, "text sweep, label classes"); }
TEST(TextSweep, ConsignmentClasses) {
  TextSweep(Family::Consignment, "text sweep, consignment classes");
}
TEST(TextSweep, RowClasses) { TextSweep(Family::Rows, "text sweep, row classes"); }

}  // namespace
}  // namespace quendal::test
