#include <gtest/gtest.h>

#include "carrierfiles/Layout.h"
#include "tests/support/MemoryHost.h"

namespace quendal {
namespace {

using test::MemoryHost;

LayoutProblem ProblemOf(std::string_view text) {
  const LayoutRead read = ReadLayout(text);
  EXPECT_EQ(read.layout, nullptr) << text;
  return read.problem;
}

// The lines a layout writes for a consignment of two packs.
std::vector<std::string> Written(std::string_view text, LayoutValues values) {
  const LayoutRead read = ReadLayout(text);
  EXPECT_NE(read.layout, nullptr) << read.problem.message;
  std::vector<std::string> lines;
  if (!read.layout) return lines;
  for (const LayoutRecord& record : read.layout->records) {
    if (record.when != RecordWhen::Pack) {
      lines.push_back(RenderRecord(*read.layout, record, values, nullptr, 0));
      continue;
    }
    for (std::int32_t i = 1; i <= values.packCount; ++i)
      lines.push_back(RenderRecord(*read.layout, record, values, values.packs->Item(i), i));
  }
  return lines;
}

TEST(LayoutTest, EveryShippedLayoutReads) {
  ASSERT_EQ(DefaultLayoutClasses().size(), 7u);
  for (std::string_view name : DefaultLayoutClasses()) {
    const LayoutRead read = ReadLayout(DefaultLayout(name));
    EXPECT_NE(read.layout, nullptr) << name << ": " << ProblemText(name, read.problem);
  }
  EXPECT_TRUE(DefaultLayout("clsStarTrackDAcln").empty());
}

TEST(LayoutTest, ProblemsArePlacedAtTheirLineAndColumn) {
  struct Case {
    std::string_view text;
    int line;
    int column;
    std::string_view message;
  };
  const Case cases[] = {
      {"record pack\n  left 5 ConNote.Nope\n", 2, 10, "unknown value \"ConNote.Nope\""},
      {"record pack\n  left 5 Receiver\n", 2, 10, "unknown value \"Receiver\""},
      {"record pack\n  cut 0 Pack.SSCC\n", 2, 7,
       "bad width \"0\": a width is a whole number from 1 to 999"},
      {"record pack\n  left -3 Pack.SSCC\n", 2, 8,
       "bad width \"-3\": a width is a whole number from 0 to 999"},
      {"record pack\n  zero 1000 PackNo\n", 2, 8,
       "bad width \"1000\": a width is a whole number from 1 to 999"},
      {"record pack\r\n  \"40\r\n", 2, 3,
       "the quoted text is not closed: it must end on its line with \""},
      {"record consignment\n  text PackNo\n", 2, 8, "PackNo is a value of pack records only"},
      {"  \"40\"\nrecord pack\n", 1, 3, "a field comes before the first \"record\" line"},
      {"record pack\n  left 5\n", 2, 9, "missing a value after \"5\""},
      {"record pack\n  text Pack.SSCC trim\n", 2, 18,
       "unknown option \"trim\": or \"TEXT\" or upper"},
      {"record pack\n  date \"YYYYMMDD\" Now upper\n", 2, 23, "\"upper\" applies to text fields only"},
      {"record pack\n  number \"0.0.0\" Pack.Weight\n", 2, 10,
       "bad number mask \"0.0.0\": digits \"0\" or \"#\" and at most one \".\""},
      {"record footer\n", 1, 8, "unknown record \"footer\": header, consignment, pack or trailer"},
      {"record pack\n  text Pack.SSCC\nformat fixed\n", 3, 1,
       "\"format\" may only stand once, before the first record"},
      {"format delimited \";;\"\n", 1, 18,
       "bad delimiter \";;\": tab or one quoted character such as \",\""},
      {"# nothing but a header\nrecord header\n  \"H\"\n", 3, 1,
       "the layout has no consignment or pack record"},
      {"record pack\n  \"a\tb\"\n", 2, 5, "a quoted text may not hold a tab or other control character"},
  };
  for (const Case& c : cases) {
    const LayoutProblem problem = ProblemOf(c.text);
    EXPECT_EQ(problem.line, c.line) << c.text;
    EXPECT_EQ(problem.column, c.column) << c.text;
    EXPECT_EQ(problem.message, c.message) << c.text;
  }
  EXPECT_EQ(ProblemText("/x/clsHunterDA.layout", {2, 10, "unknown value \"ConNote.Nope\""}),
            "/x/clsHunterDA.layout line 2 column 10: unknown value \"ConNote.Nope\"");
  EXPECT_EQ(ProblemOf(std::string(kLayoutFileLimit + 1, ' ')).message,
            "the file is too large: a layout holds at most 65536 bytes");
}

class LayoutRenderTest : public ::testing::Test {
 protected:
  void SetUp() override {
    auto conNote = host.Make<host::ConNote>(
        {{"ConNoteNo", "IPE00012346"},
         {"ConNoteDate", DateTime::FromParts(2024, 3, 14, 8, 5, 0)},
         {"Weight", 0},
         {"Volume", 0.0004},
         {"Receiver", host.Make<host::Receiver>({{"Name", "Harbour \"North\", Dock"}})}});
    std::vector<std::shared_ptr<test::MemoryObject<host::Pack>>> packs;
    for (const char* sscc : {"00093123450000000012", "00093123450000000029"})
      packs.push_back(host.Make<host::Pack>({{"SSCC", sscc}, {"Weight", 6.25}}));
    MemoryHost::Attach(conNote, packs);
    values.conNote = conNote;
    values.packs = conNote->Packs();
    values.packCount = 2;
    values.serviceCode = "4H";
    values.now = DateTime::FromParts(2024, 3, 14, 9, 30, 0);
  }
  MemoryHost host;
  LayoutValues values;
};

TEST_F(LayoutRenderTest, FixedFieldsCutPadAndStandInForMissingValues) {
  const auto lines = Written(
      "\xEF\xBB\xBF# a byte-order mark, comments and CR LF are what editors leave\r\n"
      "record consignment\r\n"
      "  \"40\"  # type\r\n"
      "  date \"YYMMDD\" conNote.conNoteDate\r\n"
      "  cut 5 Receiver.Name upper\r\n"
      "  cutright 4 ServiceCode\r\n"
      "  number \"0000.0\" ConNote.Weight or \"0000.1\"\r\n"
      "  number \"00.000\" ConNote.Volume or \"00.001\"\r\n"
      "  left 3 ConNote.BookingNo or \"---\"\r\n"
      "  right 14 ConNote.ConNoteNo\r\n"
      "  \"say \"\"hi\"\"\"\r\n"
      "record pack\r\n"
      "  zero 3 PackNo\r\n"
      "  text Pack.SSCC\r\n"
      "  spaces 2\r\n"
      "  number \"000.0\" Pack.Weight\r\n"
      "record trailer\r\n"
      "  date \"YYYYMMDDHHMM\" Now\r\n",
      values);
  EXPECT_EQ(lines, (std::vector<std::string>{
                       "40240314HARBO  4H0000.100.001---   IPE00012346say \"hi\"",
                       "00100093123450000000012  006.3",
                       "00200093123450000000029  006.3",
                       "202403140930",
                   }));
}

TEST_F(LayoutRenderTest, DelimitedFieldsStayOneColumnEach) {
  EXPECT_EQ(Written("format delimited tab\nrecord consignment\n  text Receiver.Name\n  text PackCount\n"
                    "  \"\"\n  text ConNote.ConNoteNo\n",
                    values),
            (std::vector<std::string>{"Harbour \"North\", Dock\t2\t\tIPE00012346"}));
  EXPECT_EQ(Written("format delimited \",\"\nrecord consignment\n  text Receiver.Name\n  text PackCount\n",
                    values),
            (std::vector<std::string>{"\"Harbour \"\"North\"\", Dock\",2"}));
}

}  // namespace
}  // namespace quendal
