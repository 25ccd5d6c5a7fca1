#include "labels/cMayneCMLSCM.h"

#include <gtest/gtest.h>

#include <regex>

#include "labels/cStarTrackGenericSCM.h"
#include "tests/labels/LabelFixture.h"

namespace quendal {
namespace {

const std::string kCmldcFormat =
    "{F,10,A,R,E,600,400,\"CMLDC\"|L,S,555,2,555,398,4,\"11111111\"|"
    "C,585,5,0,1,1,1,O,L,0,0,\"FROM:\"|T,1,25,V,585,40,0,1,1,1,O,L,0,0,0|"
    "T,2,25,V,573,40,0,1,1,1,O,L,0,0,0|T,3,3,V,573,170,0,1,1,1,O,L,0,0,0|"
    "C,585,200,0,1,1,1,O,L,0,0,\"CARRIER:\"|T,4,15,V,585,250,0,1,1,1,B,L,0,0,0|"
    "C,573,200,0,1,1,1,O,L,0,0,\"CON NO:\"|T,5,12,V,573,250,0,1,1,1,B,L,0,0,0|"
    "C,561,200,0,1,1,1,O,L,0,0,\"B/L NO:\"|T,6,12,V,561,250,0,1,1,1,B,L,0,0,0|"
    "C,530,5,0,1,2,2,O,L,0,0,\"TO:\"|T,7,7,V,530,40,0,1,1,2,B,L,0,0,0|"
    "T,8,4,V,515,110,0,3,1,2,B,L,0,0,0|T,9,30,V,503,5,0,1,1,1,O,L,0,0,0|"
    "T,10,4,V,491,5,0,1,1,1,O,L,0,0,0|C,530,200,0,1,2,2,O,L,0,0,\"FOR:\"|"
    "T,11,15,V,530,240,0,1,1,2,B,L,0,0,0|T,12,4,V,515,330,0,3,1,2,B,L,0,0,0|"
    "T,13,15,V,503,200,0,1,1,1,O,L,0,0,0|T,14,4,V,491,200,0,1,1,1,O,L,0,0,0|"
    "L,S,485,2,485,398,2,\"11111111\"|C,470,5,0,1,1,1,O,L,0,0,\"SSCC\"|"
    "T,15,22,V,470,40,0,1,2,1,B,L,0,0,0|C,455,5,0,1,1,1,O,L,0,0,\"PO:\"|"
    "T,16,25,V,455,40,0,1,1,1,B,L,0,0,0|T,17,4,V,445,340,0,3,1,2,W,L,0,0,0|"
    "C,440,200,0,1,1,1,O,L,0,0,\"STORE ZONE/DEPT\"|T,18,15,V,425,200,0,1,1,1,B,L,0,0,0|"
    "T,19,30,V,405,200,0,1,1,2,B,L,0,0,0|T,20,4,V,400,5,0,3,2,2,B,L,0,0,0|"
    "T,21,4,V,400,80,0,3,2,2,B,L,0,0,0|L,S,390,2,390,398,2,\"11111111\"|"
    "B,22,30,V,235,40,8,4,115,8,L,0|T,23,40,V,220,60,0,1,1,1,B,L,0,0,0|"
    "T,24,30,V,203,5,0,1,1,1,B,L,0,0,0|T,25,30,V,191,5,0,1,1,1,B,L,0,0,0|"
    "T,26,30,V,179,5,0,1,1,1,B,L,0,0,0|T,27,30,V,203,200,0,1,1,1,B,L,0,0,0|"
    "T,28,30,V,191,200,0,1,1,1,B,L,0,0,0|T,29,30,V,179,200,0,1,1,1,B,L,0,0,0|"
    "B,30,21,V,40,40,8,4,125,8,L,0|T,31,22,V,22,60,0,1,2,1,B,L,0,0,0|}";

const std::string kCmldcBatch =
    "{B,10,N,1|E,1,0,1,1,0,1|1,\"Acme Apparel Pty Ltd\"|2,\"DANDENONG SOUTH\"|3,\"VIC\"|"
    "4,\"Southern Road E\"|5,\"SRX000123456\"|6,\"BOL7781-2024\"|7,\"MELBOUR\"|8,\"0900\"|"
    "9,\"HARBOUR STORES DC\"|10,\"3029\"|11,\"HARBOUR STORES \"|12,\"0412\"|13,\"1 EXAMPLE PARAD\"|"
    "14,\"3148\"|15,\"(00)093123450000000012\"|16,\"PO PO778812\"|17,\"\"|18,\"WOMENSWEAR AND \"|"
    "19,\"Level 2\"|20,\"12\"|21,\"A4-N\"|22,\"~2014210363029~201900412\"|"
    "23,\"(421)0363029(90)0412\"|24,\"Date Packed 14/03/24\"|25,\"Not Before  15/03/24\"|"
    "26,\"Not After   20/03/24\"|27,\"\"|28,\"\"|29,\"SO SO10045\"|"
    "30,\"~20100093123450000000012\"|31,\"(00)093123450000000012\"|}";

// The store label in ZPL for the fixture's carton, piece by piece.
const std::string kSetUp = "^XA^MCY^XZ^XA^SZ2^MMT^MTT~JSN^LT0^MD0^MNY^PRA^PON^PMN^CI0^LRN";
const std::string kPanel = "^FO611,400^A0N,114,117^FR^FD^FS";
const std::string kSender =
    "^FO412,78^A0N,17,17^FDBOL7781-2024^FS^FO412,49^A0N,17,17^FDSRX000123456^FS"
    "^FO408,7^A0N,33,34^FDSouthern Road E^FS^FO328,66^A0N,33,17^FDB/L No:^FS"
    "^FO328,36^A0N,33,17^FDCon No:^FS^FO328,3^A0N,33,17^FDCARRIER:^FS"
    "^FO90,57^A0N,33,17^FDDANDENONG SOUTHVIC^FS^FO93,18^A0N,33,17^FDAcme Apparel Pty Ltd^FS"
    "^FO24,18^A0N,33,17^FDFROM:^FS";
const std::string kZones =
    "^FO191,518^A0N,49,51^FDLevel 2^FS^FO191,461^A0N,49,51^FDWOMENSWEAR AND ^FS"
    "^FO191,373^A0N,65,51^FDSTORE ZONE/DEPT^FS^FO48,465^A0N,98,51^FDA4-N^FS"
    "^FO66,367^A0N,98,51^FD12^FS";
const std::string kTo =
    "^FO24,200^A0N,33,17^FD3029^FS^FO24,155^A0N,33,17^FDHARBOUR STORES DC^FS"
    "^FO81,102^A0N,49,17^FDMELBOUR^FS^FO24,84^A0N,65,34^FDTO:^FS";
const std::string kFor =
    "^FO569,199^A0N,33,17^FD3148^FS^FO379,199^A0N,33,17^FD3148^FS"
    "^FO379,155^A0N,33,17^FD1 EXAMPLE PARAD^FS^FO459,102^A0N,49,17^FDHARBOUR STORES ^FS"
    "^FO379,102^A0N,49,34^FDFOR:^FS";
const std::string kMiddle =
    "^FO45,319^A0N,33,34^FD00093123450000000012^FS^FO45,289^A0N,33,34^FDSSCC^FS"
    "^FO453,248^A0N,33,17^FDPO PO778812^FS^FO379,248^A0N,33,34^FDPO:^FS"
    "^FO616,81^A0N,94,68^FD0412^FS";
const std::string kBarcodes =
    "^FO82,882^A0N,19,34^FV(421)0363029(90)0412^FS"
    "^BY4,,305^FO45,575^BCN,,N,N,N,N^FV>;>84210363029>8900412^FS"
    "^FO82,1166^A0N,19,34^FV(00)093123450000000012^FS"
    "^BY4,,234^FO42,924^BCN,,N,N,N,N^FV>;>800093123450000000012^FS^PQ1,0,0,N^MCN^XZ";
const std::string kOrdinaryZpl = kSetUp + "^FO224,102^A0N,75,68^FD0900^FS" + kPanel + kSender + kZones +
                                 kTo + kFor + kMiddle + kBarcodes;

class MayneCMLTest : public test::LabelFixture {
 protected:
  void SetUp() override {
    LabelFixture::SetUp();
    label.SetStoreZoneDept("Level 2");
  }
  void Ready(const char* language) {
    host.system->fields["PrinterLanguage"] = language;
    ASSERT_TRUE(label.Init(host.system, "Dock 3"));
    TakeJobs();
  }
  std::string Printed() {
    EXPECT_TRUE(label.PrintLabel(pack));
    const auto jobs = TakeJobs();
    return jobs.size() == 1 ? jobs[0] : "(" + std::to_string(jobs.size()) + " jobs)";
  }
  clsMayneCMLSCM label;
};

TEST_F(MayneCMLTest, InitDownloadsTheCmldcFormatExceptForZpl) {
  EXPECT_EQ(label.PrintVPCLII(), kCmldcFormat);
  ASSERT_TRUE(label.Init(host.system, "Dock 3"));
  EXPECT_EQ(TakeJobs(), std::vector<std::string>{kCmldcFormat});
  for (const char* language : {"ZPL", "WinPCL"}) {
    host.system->fields["PrinterLanguage"] = language;
    ASSERT_TRUE(label.Init(host.system, "Dock 3"));
    EXPECT_TRUE(TakeJobs().empty()) << language;
  }
  // The reference class speaks no ZPL: it downloads its format and logs the language.
  host.system->fields["PrinterLanguage"] = "ZPL";
  clsStarTrackGenericSCM generic;
  ASSERT_TRUE(generic.Init(host.system, "Dock 3"));
  EXPECT_EQ(TakeJobs().size(), 1u);
  EXPECT_TRUE(generic.PrintLabel(pack));
  EXPECT_EQ(host.LogMessages(), std::vector<std::string>{"ZPL unknown."});
}

TEST_F(MayneCMLTest, OrdinaryCartonInEachLanguage) {
  Ready("ZPL");
  // No panel text: no box behind it, but its reversed field still goes.
  EXPECT_EQ(Printed(), kOrdinaryZpl);
  EXPECT_EQ(label.PrintZPL(), kOrdinaryZpl);
  Ready("VPCLII");
  EXPECT_EQ(Printed(), kCmldcBatch);
  Ready("Axiohm");
  EXPECT_TRUE(label.PrintLabel(pack));
  EXPECT_TRUE(TakeJobs().front().empty());
  EXPECT_EQ(host.LogMessages(), std::vector<std::string>{"Axiohm unknown."});
}

TEST_F(MayneCMLTest, APalletStillPrintsOneZplLabel) {
  carton->fields["Code"] = "PLT01";
  Ready("ZPL");
  EXPECT_EQ(Printed(), kOrdinaryZpl);
  Ready("VPCLII");
  EXPECT_EQ(Printed(), std::regex_replace(kCmldcBatch, std::regex("^\\{B,10,N,1\\|"), "{B,10,N,5|"));
}

TEST_F(MayneCMLTest, CaretsAndTildesInHostTextsAreNotCommands) {
  dc->fields["Name"] = "A^XZ~JR Depot";
  store->fields["Name"] = "Store ^FS~JA";
  Ready("ZPL");
  const std::string zpl = Printed();
  EXPECT_NE(zpl.find("^FO24,155^A0N,33,17^FDAXZJR DEPOT^FS"), std::string::npos) << zpl;
  EXPECT_NE(zpl.find("^FO459,102^A0N,49,17^FDSTORE FSJA^FS"), std::string::npos) << zpl;
  // The label ends where it should, and nowhere before.
  EXPECT_EQ(zpl.find("^XZ", kSetUp.size()), zpl.size() - 3);
}

TEST_F(MayneCMLTest, APanelTextGetsItsBox) {
  LabelValues values;
  values.PanelText = "X~1";
  const std::string zpl = zpl::Render(kStoreLabelZpl, values);
  EXPECT_NE(zpl.find("^FO601,390^GB132,0,118^FS^FO611,400^A0N,114,117^FR^FDX1^FS"), std::string::npos);
  EXPECT_EQ(zpl::FieldData("a\r\nb^c~d"), "a  bcd");
}

}  // namespace
}  // namespace quendal
