#include "manifests/PcmsDocument.h"

#include <gtest/gtest.h>
#include <unistd.h>

#include <filesystem>

#include "frame/Error.h"
#include "labels/WinPrint.h"
#include "platform/FileSystem.h"

namespace quendal::pcms {
namespace {

TEST(PcmsValuesTest, ConsignmentAndArticleNumbers) {
  EXPECT_EQ(ConsignmentNumber(Var("NPP1"), Var("12345")), "NPP112345");
  EXPECT_EQ(ConsignmentNumber(Var("NPP1"), Var("ABC123456789")), "NPP13456789");
  EXPECT_EQ(ConsignmentNumber(Var(), Var()), "");

  // The check digit is 0 when the weighted total is a multiple of ten.
  EXPECT_EQ(CreateArticleID("NPP10000076", ArticleCode(1)), "NPP10000076015020");
  EXPECT_EQ(CreateArticleID("NPP10000077", ArticleCode(1)), "NPP10000077015029");

  EXPECT_EQ(ArticleCode(1), "01502");
  EXPECT_EQ(ArticleCode(2), "02502");
  EXPECT_EQ(ArticleCode(12), "12502");
  EXPECT_EQ(ArticleCode(100), "100502");  // past 99 the position keeps all its digits

  EXPECT_EQ(BarcodePrefix(Var("EXPRESS")), "99700196");
  EXPECT_EQ(BarcodePrefix(Var("express")), "99700193");
  EXPECT_EQ(BarcodePrefix(Var()), "99700193");
  EXPECT_EQ(ChargeCode(Var("STANDARD")), "S1");
  EXPECT_EQ(ChargeCode(Var("EXPRESS")), "X1");
  EXPECT_EQ(ChargeCode(Var("PLATINUM")), "PLATINUM");
}

TEST(PcmsValuesTest, WeightsDimensionsAndFlags) {
  for (const Var& none : {Var(), Var(0), Var(0.0), Var(""), Var("n/a")})
    EXPECT_EQ(WeightText(none), "0.40") << none.Text();
  EXPECT_EQ(WeightText(Var(12.5)), "12.50");
  EXPECT_EQ(WeightText(Var("12.5")), "12.50");
  EXPECT_EQ(WeightText(Var(1234.567)), "1234.57");
  EXPECT_EQ(WeightText(Var(0.125)), "0.13");

  EXPECT_EQ(Dimension(Var(0.4)), "40");
  EXPECT_EQ(Dimension(Var(1.2)), "120");
  EXPECT_EQ(Dimension(Var()), "");

  EXPECT_EQ(EmailNotification(Var("#%ATL #%noemail")), "N");
  EXPECT_EQ(EmailNotification(Var("")), "Y");
  EXPECT_EQ(EmailNotification(Var()), "Y");
  EXPECT_EQ(ReturnCountryCode(Var("Australia")), "Au");
  EXPECT_EQ(ReturnCountryCode(Var("   ")), "AU");
  EXPECT_EQ(ReturnCountryCode(Var()), "AU");

  EXPECT_EQ(TransactionTime(DateTime::FromParts(2024, 1, 2, 3, 4, 5)), "2024-01-02T03:04:05.0Z");
  EXPECT_EQ(CreatedTime(Var(DateTime::FromParts(2024, 12, 31, 23, 59, 58))),
            "2024-12-31T23:59:58.106+10:00");
}

TEST(PcmsValuesTest, ElementTextIsAlwaysWellFormed) {
  EXPECT_EQ(XmlText("Straße & <Co>"), "Straße & <Co>");  // escaping is the writer's
  EXPECT_EQ(XmlText("a\tb\r\nc\x01"), "a b  c ");
  EXPECT_EQ(XmlText("\xC3"), "\xEF\xBF\xBD");            // cut sequence
  EXPECT_EQ(XmlText("\xC0\xAF"), "\xEF\xBF\xBD\xEF\xBF\xBD");  // overlong "/"
  EXPECT_EQ(XmlText("\xED\xA0\x80"), "\xEF\xBF\xBD\xEF\xBF\xBD\xEF\xBF\xBD");  // surrogate
  EXPECT_EQ(XmlText("\xF0\x9F\x93\xA6"), "\xF0\x9F\x93\xA6");                 // 4-byte kept
}

class DayFileTest : public ::testing::Test {
 protected:
  void SetUp() override {
    dir = std::filesystem::temp_directory_path() /
          ("quendal-pcms-" + std::to_string(::getpid()) + "-" +
           ::testing::UnitTest::GetInstance()->current_test_info()->name());
    std::filesystem::remove_all(dir);
    std::filesystem::create_directories(dir);
  }
  void TearDown() override { std::filesystem::remove_all(dir); }

  // A run of one consignment numbered `number`.
  static Document Run(const std::string& number) {
    Document run;
    AppendText(run.SendPCMSManifest(), "header", "h" + number);
    pugi::xml_node manifest = run.SendPCMSManifest().append_child("body").append_child("PCMSManifest");
    AppendText(manifest, "ManifestNumber", number);
    AppendText(manifest.append_child("PCMSConsignment"), "ConsignmentNumber", number);
    return run;
  }
  std::string Path(const std::string& name) const { return (dir / name).string(); }

  std::filesystem::path dir;
};

TEST_F(DayFileTest, ParsesWrappedAndBareTreesAndRefusesEverythingElse) {
  const std::string written = Run("1").FileText();
  auto wrapped = Document::Parse(written);
  ASSERT_TRUE(wrapped);
  EXPECT_EQ(wrapped->ConsignmentCount(), 1u);
  EXPECT_EQ(wrapped->FileText(), written);  // reading and writing again changes nothing

  auto bare = Document::Parse(
      "<p:SendPCMSManifest xmlns:p=\"x\"><p:body><p:PCMSManifest><p:PCMSConsignment/>"
      "</p:PCMSManifest></p:body></p:SendPCMSManifest>");
  ASSERT_TRUE(bare);
  EXPECT_EQ(bare->ConsignmentCount(), 1u);

  EXPECT_FALSE(Document::Parse(""));
  EXPECT_FALSE(Document::Parse("<PCMS><SendPCMSManifest><body>"));
  EXPECT_FALSE(Document::Parse("<PCMS><SendPCMSManifest><header/></SendPCMSManifest></PCMS>"));
  EXPECT_FALSE(Document::Parse("<NewDataSet><Table/></NewDataSet>"));
}

TEST_F(DayFileTest, RunsAddToTheDayFileAndNeverOverwriteWhatCannotBeRead) {
  const DayFileWritten first = WriteDayFile(Path("day.xml"), Run("1"));
  EXPECT_EQ(first.path, Path("day.xml"));
  const DayFileWritten second = WriteDayFile(Path("day.xml"), Run("2"));
  EXPECT_TRUE(second.unreadable.empty());
  auto day = Document::Parse(*ReadFile(Path("day.xml")));
  ASSERT_TRUE(day);
  EXPECT_EQ(day->ConsignmentCount(), 2u);
  EXPECT_EQ(day->SendPCMSManifest().child("header").text().as_string(), std::string("h1"));

  // A text that is not a manifest, and a folder in the way, are both passed over.
  ASSERT_TRUE(ReplaceFile(Path("other.xml"), "plain text"));
  std::filesystem::create_directories(dir / "other_2.xml");
  const DayFileWritten third = WriteDayFile(Path("other.xml"), Run("3"));
  EXPECT_EQ(third.path, Path("other_3.xml"));
  EXPECT_EQ(third.unreadable, (std::vector<std::string>{Path("other.xml"), Path("other_2.xml")}));
  EXPECT_EQ(*ReadFile(Path("other.xml")), "plain text");
}

TEST_F(DayFileTest, AFolderThatIsNotThereRaisesPathNotFound) {
  try {
    WriteDayFile(Path("missing/day.xml"), Run("1"));
    FAIL() << "no error raised";
  } catch (const Error& e) {
    EXPECT_EQ(e.Number(), 76);
  }
}

}  // namespace
}  // namespace quendal::pcms
