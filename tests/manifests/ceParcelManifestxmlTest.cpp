#include "manifests/ceParcelManifestxml.h"

#include <gtest/gtest.h>

#include <pugixml.hpp>

#include "tests/manifests/eParcelFixture.h"

namespace quendal {
namespace {

using test::Crlf;
using test::MemoryHost;

constexpr std::string_view kManifestClass = "Quendal.clseParcelManifestxml";

class eParcelManifestTest : public test::eParcelFixture {
 protected:
  // J SMITH, one pack, express; the delivery address has a phone and an e-mail.
  std::shared_ptr<test::MemoryObject<host::ConNote>> ExpressToJSmith(int packs = 1) {
    auto order = MakeOrder({{"Name", "J SMITH"},
                            {"Line1", "5 Sample Street"},
                            {"Line2", Var()},
                            {"Suburb", "RICHMOND"},
                            {"State", "VIC"},
                            {"Postcode", "3121"},
                            {"Phone", " 0400 000 000 "},
                            {"Email", "j.smith@example.com"},
                            {"Reference", "WEB-5521"}},
                           true);
    return AddConNote(102, "NPP0000077", packs, order,
                      {{"Service", "EXPRESS"},
                       {"ServiceLevel", "EXPRESS"},
                       {"Weight", 1.2},
                       {"ConNoteDate", DateTime::FromParts(2024, 3, 14, 16, 5, 0)}});
  }
  // A store, standard service, no weight; a second address line, blank phone and e-mail.
  std::shared_ptr<test::MemoryObject<host::ConNote>> StandardToChadstone() {
    auto order = MakeOrder({{"Name", "Harbour Stores Chadstone"},
                            {"Line1", "Shop 210"},
                            {"Line2", "1 Example Parade"},
                            {"Suburb", "CHADSTONE"},
                            {"State", "VIC"},
                            {"Postcode", "3148"},
                            {"Phone", "  "},
                            {"Email", "   "},
                            {"Reference", "SO10045"}},
                           false);
    return AddConNote(103, "NPP0000078", 1, order,
                      {{"Weight", Var()}, {"ConNoteDate", DateTime::FromParts(2024, 3, 14, 9, 15, 0)}});
  }

  static pugi::xml_document Parse(const std::string& text) {
    pugi::xml_document doc;
    EXPECT_TRUE(doc.load_string(text.c_str())) << text;
    return doc;
  }
  static pugi::xpath_node_set Select(const pugi::xml_document& doc, const char* path) {
    return doc.select_nodes(path);
  }
};

constexpr std::string_view kTwoRowFile = R"(<?xml version="1.0" encoding="utf-8"?>
<PCMS xmlns="http://www.auspost.com.au/xml/pcms">
<SendPCMSManifest>
  <header>
    <TransactionDateTime>2024-03-14T16:30:00.0Z</TransactionDateTime>
    <TransactionId>PO778812</TransactionId>
    <TransactionSequence>0</TransactionSequence>
    <ApplicationId>MERCHANT</ApplicationId>
  </header>
  <body>
    <PCMSManifest>
      <MerchantLocationId>NPP1</MerchantLocationId>
      <ManifestNumber>1000</ManifestNumber>
      <DateSubmitted>2024-03-14T16:30:00.0Z</DateSubmitted>
      <DateLodged>2024-03-14T16:30:00.0Z</DateLodged>
      <PCMSConsignment>
        <ConsignmentNumber>NPP10000077</ConsignmentNumber>
        <ChargeCode>X1</ChargeCode>
        <ReferenceNo1>WEB-5521</ReferenceNo1>
        <DeliveryName>J SMITH</DeliveryName>
        <DeliveryCompanyName>Harbour Stores Ltd</DeliveryCompanyName>
        <EmailNotification>N</EmailNotification>
        <DeliveryAddressLine1>5 Sample Street</DeliveryAddressLine1>
        <DeliveryPhoneNumber>0400 000 000</DeliveryPhoneNumber>
        <DeliveryEmailAddress>j.smith@example.com</DeliveryEmailAddress>
        <DeliverySuburb>RICHMOND</DeliverySuburb>
        <DeliveryStateCode>VIC</DeliveryStateCode>
        <DeliveryPostcode>3121</DeliveryPostcode>
        <DeliveryCountryCode>AU</DeliveryCountryCode>
        <IsInternationalDelivery>false</IsInternationalDelivery>
        <ReturnName>Acme Apparel Pty Ltd</ReturnName>
        <ReturnAddressLine1>Unit 4</ReturnAddressLine1>
        <ReturnSuburb>DANDENONG SOUTH</ReturnSuburb>
        <ReturnStateCode>VIC</ReturnStateCode>
        <ReturnPostcode>3175</ReturnPostcode>
        <ReturnCountryCode>Au</ReturnCountryCode>
        <CreatedDateTime>2024-03-14T16:05:00.106+10:00</CreatedDateTime>
        <PostChargeToAccount>98765</PostChargeToAccount>
        <IsSignatureRequired>Y</IsSignatureRequired>
        <DeliverPartConsignment>N</DeliverPartConsignment>
        <ContainsDangerousGoods>false</ContainsDangerousGoods>
        <PCMSDomesticArticle>
          <ArticleNumber>NPP10000077015029</ArticleNumber>
          <BarcodeArticleNumber>99700196NPP1000007701502903121</BarcodeArticleNumber>
          <Length>40</Length>
          <Width>30</Width>
          <Height>25</Height>
          <ActualWeight>1.20</ActualWeight>
          <IsTransitCoverRequired>N</IsTransitCoverRequired>
          <ContentsItem>
            <GoodsDescription>Apparel</GoodsDescription>
          </ContentsItem>
        </PCMSDomesticArticle>
      </PCMSConsignment>
      <PCMSConsignment>
        <ConsignmentNumber>NPP10000078</ConsignmentNumber>
        <ChargeCode>S1</ChargeCode>
        <ReferenceNo1>SO10045</ReferenceNo1>
        <DeliveryName>Harbour Stores Chadstone</DeliveryName>
        <EmailNotification>N</EmailNotification>
        <DeliveryAddressLine1>Shop 210</DeliveryAddressLine1>
        <DeliveryAddressLine2>1 Example Parade</DeliveryAddressLine2>
        <DeliverySuburb>CHADSTONE</DeliverySuburb>
        <DeliveryStateCode>VIC</DeliveryStateCode>
        <DeliveryPostcode>3148</DeliveryPostcode>
        <DeliveryCountryCode>AU</DeliveryCountryCode>
        <IsInternationalDelivery>false</IsInternationalDelivery>
        <ReturnName>Acme Apparel Pty Ltd</ReturnName>
        <ReturnAddressLine1>Unit 4</ReturnAddressLine1>
        <ReturnSuburb>DANDENONG SOUTH</ReturnSuburb>
        <ReturnStateCode>VIC</ReturnStateCode>
        <ReturnPostcode>3175</ReturnPostcode>
        <ReturnCountryCode>Au</ReturnCountryCode>
        <CreatedDateTime>2024-03-14T09:15:00.106+10:00</CreatedDateTime>
        <PostChargeToAccount>98765</PostChargeToAccount>
        <IsSignatureRequired>Y</IsSignatureRequired>
        <DeliverPartConsignment>N</DeliverPartConsignment>
        <ContainsDangerousGoods>false</ContainsDangerousGoods>
        <PCMSDomesticArticle>
          <ArticleNumber>NPP10000078015028</ArticleNumber>
          <BarcodeArticleNumber>99700193NPP1000007801502803148</BarcodeArticleNumber>
          <Length>40</Length>
          <Width>30</Width>
          <Height>25</Height>
          <ActualWeight>0.40</ActualWeight>
          <IsTransitCoverRequired>N</IsTransitCoverRequired>
          <ContentsItem>
            <GoodsDescription>Apparel</GoodsDescription>
          </ContentsItem>
        </PCMSDomesticArticle>
      </PCMSConsignment>
    </PCMSManifest>
  </body>
</SendPCMSManifest>
</PCMS>
)";

TEST_F(eParcelManifestTest, TwoRowsGiveOneFileWithOneHeaderAndBothConsignments) {
  auto first = ExpressToJSmith();
  auto second = StandardToChadstone();
  auto object = CreateObject(kManifestClass).object;
  auto* rows = as<RowInterface>(object);
  Grid columns;
  ASSERT_TRUE(rows->Init(host.system, 7, columns));
  ASSERT_EQ(columns.Rows(), 5u);
  EXPECT_EQ(columns(3, 0).Text(), "Order No");
  EXPECT_EQ(columns(4, 2).Whole(), 3000);
  EXPECT_TRUE(rows->PROCESSALL());

  Grid grid;
  ASSERT_EQ(rows->Load("", grid), 2);
  ASSERT_EQ(grid.Columns(), 6u);
  EXPECT_EQ(grid(0, 0).Text(), "NPP0000077");
  EXPECT_EQ(grid(0, 2).Text(), "J SMITH RICHMOND");  // the single order's name and suburb
  EXPECT_EQ(grid(1, 3).Text(), "EPARCEL-STANDARD");
  EXPECT_TRUE(grid(1, 4).IsText());
  EXPECT_TRUE(grid(1, 5).IsNull());

  LogList log = {41, 42};
  EXPECT_EQ(rows->Process(0, log), 102);
  ASSERT_EQ(log.size(), 1u);  // the entry of this row only
  EXPECT_EQ(host.logs.at(static_cast<std::size_t>(log[0] - 1)).at("Message").Text(),
            "Consigment NPP0000077 compile completed.");
  EXPECT_EQ(rows->Process(1, log), 103);
  EXPECT_TRUE(FilesInFolder().empty());  // nothing is written before Term
  EXPECT_TRUE(rows->Term());

  ASSERT_EQ(FilesInFolder(), std::vector<std::string>{"NPP1_1000_EP.xml"});
  EXPECT_EQ(FileText("NPP1_1000_EP.xml"), Crlf(kTwoRowFile));

  // Both consignments belong to the one manifest record now.
  for (const auto& conNote : {first, second}) {
    EXPECT_EQ(conNote->Get("ManifestId").Whole(), 1);
    EXPECT_EQ(conNote->Get("Status").Whole(), 8);
  }
  EXPECT_EQ(host.nextManifestId, 2);

  // The document went with the file: a second Term writes nothing more.
  EXPECT_TRUE(rows->Term());
  EXPECT_EQ(FileText("NPP1_1000_EP.xml"), Crlf(kTwoRowFile));
}

TEST_F(eParcelManifestTest, EveryPackIsAnArticleWithItsOwnIdAndCarton) {
  auto conNote = ExpressToJSmith(3);
  auto bigCarton = host.Make<host::Carton>({{"Length", 1.2}, {"Width", 1.0}, {"Height", 0.455}});
  auto packs = host::Object::As<host::PackList>(conNote->Get("Packs"));
  auto* second = dynamic_cast<test::MemoryObject<host::Pack>*>(packs->Item(2).ptr().get());
  second->fields["Carton"] = Var(bigCarton);

  auto object = Start(kManifestClass);
  LogList log;
  ASSERT_EQ(as<RowInterface>(object)->Process(0, log), 102);
  ASSERT_TRUE(as<RowInterface>(object)->Term());

  const auto doc = Parse(FileText("NPP1_1000_EP.xml"));
  const auto articles = Select(doc, "//PCMSDomesticArticle");
  ASSERT_EQ(articles.size(), 3u);
  const char* ids[] = {"NPP10000077015029", "NPP10000077025028", "NPP10000077035027"};
  for (std::size_t i = 0; i < 3; ++i) {
    const pugi::xml_node a = articles[i].node();
    EXPECT_STREQ(a.child_value("ArticleNumber"), ids[i]);
    EXPECT_EQ(std::string(a.child_value("BarcodeArticleNumber")),
              "99700196" + std::string(ids[i]) + "03121");
    EXPECT_STREQ(a.child_value("ActualWeight"), "1.20");
  }
  EXPECT_STREQ(articles[1].node().child_value("Length"), "120");
  EXPECT_STREQ(articles[1].node().child_value("Height"), "45.5");
  EXPECT_STREQ(articles[2].node().child_value("Length"), "40");
}

TEST_F(eParcelManifestTest, ALaterRunTheSameDayExtendsTheDayFile) {
  ClockOnRealDate();
  ExpressToJSmith();
  {
    auto morning = Start(kManifestClass);
    LogList log;
    ASSERT_EQ(as<RowInterface>(morning)->Process(0, log), 102);
    ASSERT_TRUE(as<RowInterface>(morning)->Term());
  }
  // The morning's consignment carries its manifest now; the afternoon lists only the new one.
  StandardToChadstone();
  std::int32_t count = 0;
  auto afternoon = Start(kManifestClass, &count);
  ASSERT_EQ(count, 1);
  LogList log;
  ASSERT_EQ(as<RowInterface>(afternoon)->Process(0, log), 103);
  ASSERT_TRUE(as<RowInterface>(afternoon)->Term());

  ASSERT_EQ(FilesInFolder(), std::vector<std::string>{"NPP1_1000_EP.xml"});
  const std::string text = FileText("NPP1_1000_EP.xml");
  EXPECT_TRUE(text.starts_with("<?xml version=\"1.0\" encoding=\"utf-8\"?>\r\n<PCMS xmlns="));
  EXPECT_TRUE(text.ends_with("</SendPCMSManifest>\r\n</PCMS>\r\n"));
  const auto doc = Parse(text);
  EXPECT_EQ(Select(doc, "/PCMS").size(), 1u);
  EXPECT_EQ(Select(doc, "//SendPCMSManifest").size(), 1u);
  EXPECT_EQ(Select(doc, "//header").size(), 1u);
  EXPECT_EQ(Select(doc, "//PCMSManifest").size(), 1u);
  const auto numbers = Select(doc, "//PCMSConsignment/ConsignmentNumber");
  ASSERT_EQ(numbers.size(), 2u);
  EXPECT_STREQ(numbers[0].node().child_value(), "NPP10000077");
  EXPECT_STREQ(numbers[1].node().child_value(), "NPP10000078");
  // The first run's manifest number names the day's manifest.
  EXPECT_STREQ(doc.select_node("//PCMSManifest/ManifestNumber").node().child_value(), "1000");
}

TEST_F(eParcelManifestTest, AnUnreadableDayFileIsKeptAndTheRunGoesBesideIt) {
  ClockOnRealDate();
  const std::string broken = "<?xml version=\"1.0\"?><PCMS><SendPCMSManifest><body>";
  ASSERT_TRUE(ReplaceFile(folder + "NPP1_0999_EP.xml", broken));
  ExpressToJSmith();
  auto object = Start(kManifestClass);
  LogList log;
  ASSERT_EQ(as<RowInterface>(object)->Process(0, log), 102);
  ASSERT_TRUE(as<RowInterface>(object)->Term());

  EXPECT_EQ(FileText("NPP1_0999_EP.xml"), broken);
  ASSERT_EQ(FilesInFolder(), (std::vector<std::string>{"NPP1_0999_EP.xml", "NPP1_0999_EP_2.xml"}));
  EXPECT_EQ(Parse(FileText("NPP1_0999_EP_2.xml")).select_nodes("//PCMSConsignment").size(), 1u);
  EXPECT_EQ(host.LogMessages().back(),
            "Manifest file " + folder +
                "NPP1_0999_EP.xml cannot be read as a PCMS manifest; it is kept and the "
                "consignments are written to " +
                folder + "NPP1_0999_EP_2.xml.");

  // The next run of the day extends the file beside it.
  StandardToChadstone();
  auto later = Start(kManifestClass);
  ASSERT_EQ(as<RowInterface>(later)->Process(0, log), 103);
  ASSERT_TRUE(as<RowInterface>(later)->Term());
  EXPECT_EQ(FilesInFolder().size(), 2u);
  EXPECT_EQ(Parse(FileText("NPP1_0999_EP_2.xml")).select_nodes("//PCMSConsignment").size(), 2u);
}

TEST_F(eParcelManifestTest, NothingIsWrittenWithoutAProcessedRow) {
  auto object = Start(kManifestClass);  // no consignments at all
  EXPECT_EQ(host.LogMessages(), std::vector<std::string>{"No Consignments found to process."});
  EXPECT_EQ(host.logs[0].at("Procedure").Text(), "Load");
  EXPECT_TRUE(as<RowInterface>(object)->Term());

  ExpressToJSmith();
  auto loaded = Start(kManifestClass);
  EXPECT_TRUE(as<RowInterface>(loaded)->Term());
  EXPECT_TRUE(FilesInFolder().empty());
  EXPECT_EQ(host.nextManifestId, 1);  // no manifest record either
}

TEST_F(eParcelManifestTest, AManifestRecordThatCannotBeSavedStopsTheRow) {
  auto conNote = ExpressToJSmith();
  auto object = Start(kManifestClass);
  auto* rows = as<RowInterface>(object);
  host.manifestSaveFails = true;
  LogList log = {7};
  EXPECT_EQ(rows->Process(0, log), 0);
  EXPECT_EQ(host.LogMessages().back(), "Failed to create mainifest ID");
  EXPECT_EQ(host.logs.back().at("Procedure").Text(), "Process");
  EXPECT_EQ(log, LogList{static_cast<std::int32_t>(host.logs.size())});
  EXPECT_TRUE(conNote->Get("ManifestId").IsNull());
  EXPECT_TRUE(rows->Term());
  EXPECT_TRUE(FilesInFolder().empty());

  // Once the host saves the record, the row goes through under it.
  host.manifestSaveFails = false;
  EXPECT_EQ(rows->Process(0, log), 102);
  EXPECT_EQ(conNote->Get("ManifestId").Whole(), 1);
}

TEST_F(eParcelManifestTest, HostTextsComeOutEscapedAndWellFormed) {
  auto order = MakeOrder({{"Name", "Smith & Sons <Pty> \"Ltd\""},
                          {"Line1", "Café Straße 5\x01\ttab"},
                          {"Suburb", "M\xFFNCHEN"},
                          {"Postcode", "3000"},
                          {"Reference", "]]>"}},
                         true);
  AddConNote(104, "NPP0000079", 1, order);
  auto object = Start(kManifestClass);
  LogList log;
  ASSERT_EQ(as<RowInterface>(object)->Process(0, log), 104);
  ASSERT_TRUE(as<RowInterface>(object)->Term());

  const std::string text = FileText("NPP1_1000_EP.xml");
  EXPECT_NE(text.find("<DeliveryName>Smith &amp; Sons &lt;Pty&gt; \"Ltd\"</DeliveryName>"),
            std::string::npos);
  EXPECT_EQ(text.find("\xEF\xBB\xBF"), std::string::npos);  // no byte-order mark
  const auto doc = Parse(text);
  const pugi::xml_node consignment = doc.select_node("//PCMSConsignment").node();
  EXPECT_STREQ(consignment.child_value("DeliveryName"), "Smith & Sons <Pty> \"Ltd\"");
  EXPECT_STREQ(consignment.child_value("DeliveryAddressLine1"), "Café Straße 5  tab");
  EXPECT_STREQ(consignment.child_value("DeliverySuburb"), "M\xEF\xBF\xBDNCHEN");
  EXPECT_STREQ(consignment.child_value("ReferenceNo1"), "]]>");
}

TEST_F(eParcelManifestTest, FileNamesFromHostTextsStayInTheCarrierFolder) {
  carrier->fields["AccountRef"] = Var("a/..");
  carrier->fields["Options"] = Var("../../x");
  ExpressToJSmith();
  auto object = Start(kManifestClass);
  LogList log;
  ASSERT_EQ(as<RowInterface>(object)->Process(0, log), 102);
  ASSERT_TRUE(as<RowInterface>(object)->Term());
  EXPECT_EQ(FilesInFolder(), std::vector<std::string>{"A____1000_______x.xml"});
}

TEST_F(eParcelManifestTest, NullHostDataDoesNotStopTheRun) {
  // Every scalar Null, the pack without despatch or carton, the order without slip lines.
  auto order = host.Make<host::Order>({{"DeliveryAddress", host.Make<host::Address>()}});
  auto blankVendor = host.Make<host::Vendor>();
  auto conNote = host.Make<host::ConNote>({{"ConNoteId", 105},
                                           {"Vendor", blankVendor},
                                           {"Carrier", carrier},
                                           {"Orders", MemoryHost::List<host::Order>({order})}});
  vendor->fields["VendorId"] = Var();  // the blank vendor is the document's too
  host.ediDocuments[0]->fields["VendorId"] = Var();
  MemoryHost::Attach(conNote, {host.Make<host::Pack>({{"Order", order}})});

  auto prompt = std::make_shared<test::ScriptedPrompt>();
  test::PromptScope scope(prompt);
  std::int32_t count = 0;
  auto object = Start(kManifestClass, &count);
  ASSERT_EQ(count, 1);
  LogList log;
  EXPECT_EQ(as<RowInterface>(object)->Process(0, log), 105);
  EXPECT_TRUE(as<RowInterface>(object)->Term());
  EXPECT_TRUE(prompt->messages.empty());

  const auto doc = Parse(FileText("NPP1_1000_EP.xml"));
  const pugi::xml_node consignment = doc.select_node("//PCMSConsignment").node();
  EXPECT_STREQ(consignment.child_value("ConsignmentNumber"), "NPP1");
  EXPECT_STREQ(consignment.child_value("ChargeCode"), "");
  EXPECT_STREQ(consignment.child_value("ReturnCountryCode"), "AU");
  EXPECT_STREQ(consignment.child_value("CreatedDateTime"), "T.106+10:00");
  EXPECT_FALSE(consignment.child("DeliveryCompanyName"));
  const pugi::xml_node article = consignment.child("PCMSDomesticArticle");
  EXPECT_STREQ(article.child_value("ActualWeight"), "0.40");
  EXPECT_STREQ(article.child_value("Length"), "");
  EXPECT_STREQ(doc.select_node("//TransactionId").node().child_value(), "");
}

TEST_F(eParcelManifestTest, ARowThatCannotBeReadLeavesNoTraceInTheFile) {
  ExpressToJSmith();
  auto packless = host.Make<host::ConNote>({{"ConNoteId", 106},
                                            {"ConNoteNo", "NPP0000080"},
                                            {"Vendor", vendor},
                                            {"Carrier", carrier}});
  auto prompt = std::make_shared<test::ScriptedPrompt>();  // answers Abort
  test::PromptScope scope(prompt);
  auto object = Start(kManifestClass);
  auto* rows = as<RowInterface>(object);
  LogList log;
  EXPECT_EQ(rows->Process(1, log), 0);  // no packs: the error report, then Abort
  ASSERT_EQ(prompt->messages.size(), 1u);
  EXPECT_NE(prompt->messages[0].find("ceParcelManifestxml, Function Process"), std::string::npos);
  EXPECT_TRUE(packless->Get("ManifestId").IsNull());

  // A row the host never loaded is logged, not reported as a failure of the library.
  EXPECT_EQ(rows->Process(2, log), 0);
  EXPECT_EQ(rows->Process(-1, log), 0);
  EXPECT_EQ(host.LogMessages().back(), "Row -1 is not one of the 2 loaded rows.");
  EXPECT_EQ(prompt->messages.size(), 1u);

  EXPECT_EQ(rows->Process(0, log), 102);
  EXPECT_TRUE(rows->Term());
  const auto doc = Parse(FileText("NPP1_1000_EP.xml"));
  EXPECT_EQ(doc.select_nodes("//PCMSConsignment").size(), 1u);
  EXPECT_EQ(doc.select_nodes("//header").size(), 1u);
}

}  // namespace
}  // namespace quendal
