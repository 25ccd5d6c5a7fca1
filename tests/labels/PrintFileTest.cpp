// PrintFile on the label frame: a format and batch handed over as text go
// to the printer as they stand, or are drawn on an ordinary printer.
#include <gtest/gtest.h>

#include <array>

#include "labels/LabelPrinter.h"
#include "tests/labels/LabelFixture.h"

namespace quendal {
namespace {

constexpr std::array<vpcl::Packet, 1> kPackets = {vpcl::Field{1, 30, 300, 20, 1, 2, 2, 'B', 'L'}};
constexpr std::array<BatchField, 1> kFields = {{{1, &LabelValues::ConNoteNo}}};
constexpr LabelLayout kLayout{"640", vpcl::Format{"HSDC", 600, 400, kPackets}, kFields};

class clsProbeSCM : public PrintFileLabelPrinter {
 public:
  clsProbeSCM() : PrintFileLabelPrinter("clsProbeSCM", kLayout) {}
};

const std::string kFormat = "{F,77,A,R,E,600,400,\"HANDED\"|T,1,30,V,300,20,0,1,2,2,B,L,0,0,0|}";
const std::string kBatch = "{B,77,N,1|E,1,0,1,1,0,1|1,\"SRXZ00012345\"|}";

class PrintFileTest : public test::LabelFixture {
 protected:
  bool PrintIn(const char* language, const std::string& printer = "Dock 3") {
    host.system->fields["PrinterLanguage"] = language;
    label.Init(host.system, printer);
    TakeJobs();  // the class's own format download
    return label.PrintFile(kFormat, kBatch);
  }
  clsProbeSCM label;
};

TEST_F(PrintFileTest, EachLanguageGetsWhatItPrints) {
  // A thermal printer gets the format as it is and then the batch, in one job.
  EXPECT_TRUE(PrintIn("VPCLII"));
  EXPECT_EQ(TakeJobs(), std::vector<std::string>{kFormat + kBatch});

  // An ordinary printer draws the two: the consignment number lands on the page.
  spooler->AddPrinter("Office Laser", 203);
  EXPECT_TRUE(PrintIn("WinPCL", "Office Laser"));
  EXPECT_TRUE(TakeJobs().empty());
  ASSERT_FALSE(spooler->drawnJobs.empty());
  bool drawn = false;
  for (const auto& p : spooler->drawnJobs.back()->canvas.primitives)
    drawn = drawn || p.text == "SRXZ00012345";
  EXPECT_TRUE(drawn);

  // Any other language gets the format, and the rest is logged as unknown.
  EXPECT_TRUE(PrintIn("Axiohm"));
  EXPECT_EQ(TakeJobs(), std::vector<std::string>{kFormat});
  EXPECT_EQ(host.LogMessages().back(), "Axiohm unknown.");
  EXPECT_EQ(host.logs.back().at("Procedure").Text(), "WriteLabel");
}

TEST_F(PrintFileTest, APrinterThatDoesNotOpenIsNotASuccess) {
  EXPECT_FALSE(PrintIn("VPCLII", "Dock 9"));
  EXPECT_TRUE(TakeJobs().empty());
  EXPECT_EQ(host.LogMessages().back(), "Error 1801Unable to open printer Dock 9");
  EXPECT_EQ(spooler->OpenHandles(), 0u);
}

}  // namespace
}  // namespace quendal
