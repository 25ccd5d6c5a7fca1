#include "labels/cTollMYERSCM.h"

#include <gtest/gtest.h>

#include "tests/labels/LabelFixture.h"

namespace quendal {
namespace {

class TollMyerTest : public test::LabelFixture {
 protected:
  std::string Printed(const char* language) {
    host.system->fields["PrinterLanguage"] = language;
    EXPECT_TRUE(label.Init(host.system, "Dock 3"));
    TakeJobs();
    EXPECT_TRUE(label.PrintLabel(pack));
    const auto jobs = TakeJobs();
    return jobs.size() == 1 ? jobs[0] : "(" + std::to_string(jobs.size()) + " jobs)";
  }
  clsTollMYERSCM label;
};

TEST_F(TollMyerTest, MyerdcPutsTheStoreFirst) {
  const std::string format = label.PrintVPCLII();
  EXPECT_EQ(format.substr(0, 32), "{F,650,A,R,E,600,400,\"MYERDC\"|L,");
  EXPECT_NE(format.find("|C,530,5,0,1,2,2,O,L,0,0,\"FOR:\"|T,12,4,V,515,60,0,3,2,2,B,L,0,0,0|"
                        "T,11,30,V,530,170,0,1,1,2,B,L,0,0,0|"),
            std::string::npos);
  EXPECT_EQ(format.substr(format.size() - 36), "|T,31,22,V,22,60,0,1,2,1,B,L,0,0,0|}");
  EXPECT_EQ(Printed("VPCLII"),
            "{B,650,N,1|E,1,0,1,1,0,1|1,\"Acme Apparel Pty Ltd\"|2,\"DANDENONG SOUTH\"|3,\"VIC\"|"
            "4,\"Southern Road E\"|5,\"SRX000123456\"|6,\"BOL7781-2024\"|7,\"MELBOURNE\"|"
            "8,\"0900\"|9,\"HARBOUR STORES DC\"|10,\"3029\"|11,\"HARBOUR STORES CHADSTONE\"|"
            "12,\"0412\"|13,\"1 EXAMPLE PARAD\"|14,\"3148\"|15,\"(00)093123450000000012\"|"
            "16,\"PO PO778812\"|17,\"\"|18,\"WOMENSWEAR AND \"|19,\"\"|20,\"12\"|21,\"A4-N\"|"
            "22,\"~2014210363029~201900412\"|23,\"(421)0363029(90)0412\"|24,\"Date Packed 14/03/24\"|"
            "25,\"Not Before  15/03/24\"|26,\"Not After   20/03/24\"|27,\"\"|28,\"\"|29,\"SO SO10045\"|"
            "30,\"~20100093123450000000012\"|31,\"(00)093123450000000012\"|}");
}

TEST_F(TollMyerTest, ZplIsTheStoreLabelWithTollsLongerTexts) {
  const std::string zpl = Printed("ZPL");
  EXPECT_EQ(zpl.substr(0, 91),
            "^XA^MCY^XZ^XA^SZ2^MMT^MTT~JSN^LT0^MD0^MNY^PRA^PON^PMN^CI0^LRN^FO224,102^A0N,75,68^FD0900^FS");
  EXPECT_NE(zpl.find("^FO81,102^A0N,49,17^FDMELBOURNE^FS"), std::string::npos);
  EXPECT_NE(zpl.find("^FO459,102^A0N,49,17^FDHARBOUR STORES CHADSTONE^FS"), std::string::npos);
  EXPECT_EQ(zpl.substr(zpl.size() - 17), "^PQ1,0,0,N^MCN^XZ");
}

}  // namespace
}  // namespace quendal
