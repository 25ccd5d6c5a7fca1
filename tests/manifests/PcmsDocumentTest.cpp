#include <gtest/gtest.h>

#include "labels/WinPrint.h"
#include "manifests/PcmsDocument.h"

namespace quendal::pcms {
namespace {

TEST(PcmsValuesTest, NumbersOfConsignmentsArticlesAndBarcodes) {
  EXPECT_EQ(ConsignmentNumber(Var("NPP1"), Var("12345")), "NPP112345");
  EXPECT_EQ(ConsignmentNumber(Var("NPP1"), Var("ABC123456789")), "NPP13456789");
  // The check digit is 0 when the weighted total is a multiple of ten.
  EXPECT_EQ(CreateArticleID("NPP10000076", ArticleCode(1)), "NPP10000076015020");
  EXPECT_EQ(ArticleCode(2), "02502");
  EXPECT_EQ(ArticleCode(100), "100502");  // past 99 the position keeps all its digits
  EXPECT_EQ(BarcodePrefix(Var("EXPRESS")), "99700196");
  EXPECT_EQ(BarcodePrefix(Var("express")), "99700193");
  EXPECT_EQ(ChargeCode(Var("PLATINUM")), "PLATINUM");
}

TEST(PcmsValuesTest, WeightsCountriesAndNotification) {
  for (const Var& none : {Var(), Var(0), Var(""), Var("n/a")}) EXPECT_EQ(WeightText(none), "0.40");
  EXPECT_EQ(WeightText(Var(12.5)), "12.50");
  EXPECT_EQ(WeightText(Var(1234.567)), "1234.57");
  EXPECT_EQ(EmailNotification(Var("#%ATL #%noemail")), "N");
  EXPECT_EQ(EmailNotification(Var("")), "Y");
  EXPECT_EQ(ReturnCountryCode(Var("Australia")), "Au");
  EXPECT_EQ(ReturnCountryCode(Var("   ")), "AU");
}

TEST(PcmsValuesTest, ElementTextIsAlwaysWellFormed) {
  EXPECT_EQ(XmlText("a\tb\r\nc\x01"), "a b  c ");
  EXPECT_EQ(XmlText("\xC3"), "\xEF\xBF\xBD");                                  // cut sequence
  EXPECT_EQ(XmlText("\xC0\xAF"), "\xEF\xBF\xBD\xEF\xBF\xBD");                  // overlong "/"
  EXPECT_EQ(XmlText("\xED\xA0\x80"), "\xEF\xBF\xBD\xEF\xBF\xBD\xEF\xBF\xBD");  // surrogate
  EXPECT_EQ(XmlText("\xF0\x9F\x93\xA6"), "\xF0\x9F\x93\xA6");
}

TEST(PcmsDocumentTest, ReadsWrappedAndBareTreesAndRefusesOthers) {
  Document run;
  run.SendPCMSManifest()
      .append_child("body")
      .append_child("PCMSManifest")
      .append_child("PCMSConsignment");
  auto wrapped = Document::Parse(run.FileText());
  ASSERT_TRUE(wrapped);
  EXPECT_EQ(wrapped->FileText(), run.FileText());  // reading and writing again changes nothing
  auto bare = Document::Parse(
      "<p:SendPCMSManifest xmlns:p='x'><p:body><p:PCMSManifest><p:PCMSConsignment/>"
      "</p:PCMSManifest></p:body></p:SendPCMSManifest>");
  ASSERT_TRUE(bare);
  EXPECT_EQ(bare->ConsignmentCount(), 1u);
  // UTF-16 is read (its characters hold zero bytes); a NUL character
  // after the root, where the parser would stop, is refused in either form.
  const std::string text = run.FileText();
  std::string utf16 = "\xFF\xFE";
  for (const char c : text) utf16 += std::string{c, '\0'};
  EXPECT_TRUE(Document::Parse(utf16));
  EXPECT_FALSE(Document::Parse(utf16 + std::string(2, '\0') + std::string("<\0x\0/\0>\0", 8)));
  EXPECT_FALSE(Document::Parse(text + std::string(1, '\0') + "<x/>"));
  EXPECT_FALSE(Document::Parse(""));
  EXPECT_FALSE(Document::Parse("<PCMS><SendPCMSManifest><header/></SendPCMSManifest></PCMS>"));
  EXPECT_FALSE(Document::Parse("<NewDataSet><Table/></NewDataSet>"));
}

}  // namespace
}  // namespace quendal::pcms
