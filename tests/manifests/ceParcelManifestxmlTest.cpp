#include <gtest/gtest.h>

#include "manifests/ceParcelManifestxml.h"
#include "tests/manifests/eParcelFixture.h"
#include "tests/support/KillLoop.h"

namespace quendal {
namespace {

using Strings = std::vector<std::string>;
using test::MemoryHost;

constexpr std::string_view kManifestClass = "Quendal.clseParcelManifestxml";

class eParcelManifestTest : public test::eParcelFixture {
 protected:
  // The object's rows after Init and Load.
  RowInterface* Loaded(const std::unique_ptr<Component>& object) {
    auto* rows = as<RowInterface>(object);
    Grid columns, grid;
    rows->Init(host.system, 7, columns);
    rows->Load("", grid);
    return rows;
  }
  // J SMITH, express; the delivery address has a phone and an e-mail.
  std::shared_ptr<test::MemoryObject<host::ConNote>> ExpressToJSmith(int packs = 1) {
    auto order = MakeOrder({{"Name", "J SMITH"},
                            {"Line1", "5 Sample Street"},
                            {"Suburb", "RICHMOND"},
                            {"State", "VIC"},
                            {"Postcode", "3121"},
                            {"Phone", " 0400 000 000 "},
                            {"Email", "j.smith@example.com"},
                            {"Reference", "WEB-5521"}});
    return AddConNote(102, "NPP0000077", packs, order,
                      {{"Service", "EXPRESS"},
                       {"ServiceLevel", "EXPRESS"},
                       {"Weight", 1.2},
                       {"ConNoteDate", DateTime::FromParts(2024, 3, 14, 16, 5, 0)}});
  }
  // A store, standard service, no weight, no slip line; a second address line, blank phone and
  // e-mail.
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
    return AddConNote(
        103, "NPP0000078", 1, order,
        {{"Weight", Var()}, {"ConNoteDate", DateTime::FromParts(2024, 3, 14, 9, 15, 0)}});
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

// The golden text with every line ended by CR LF, as the file has it.
std::string Crlf(std::string_view text) {
  std::string out;
  for (char c : text) out += c == '\n' ? std::string("\r\n") : std::string(1, c);
  return out;
}

TEST_F(eParcelManifestTest, TwoRowsGiveOneFileWithOneHeaderAndBothConsignments) {
  auto first = ExpressToJSmith();
  auto second = StandardToChadstone();
  auto object = CreateObject(kManifestClass).object;
  auto* rows = as<RowInterface>(object);
  Grid columns, grid;
  ASSERT_TRUE(rows->Init(host.system, 7, columns));
  EXPECT_EQ(columns.Rows(), 5u);
  EXPECT_EQ(columns(3, 0).Text(), "Order No");
  ASSERT_EQ(rows->Load("", grid), 2);
  EXPECT_EQ(grid.Columns(), 6u);
  EXPECT_EQ(grid(0, 2).Text(), "J SMITH RICHMOND");  // the single order's name and suburb
  EXPECT_EQ(grid(1, 3).Text(), "EPARCEL-STANDARD");

  LogList log = {41, 42};
  EXPECT_EQ(rows->Process(0, log), 102);
  ASSERT_EQ(log.size(), 1u);  // the entry of this row only
  EXPECT_EQ(host.LogMessages().at(static_cast<std::size_t>(log[0] - 1)),
            "Consigment NPP0000077 compile completed.");
  EXPECT_EQ(rows->Process(1, log), 103);
  EXPECT_TRUE(FilesInFolder().empty());  // nothing is written before Term
  EXPECT_TRUE(rows->Term());
  EXPECT_TRUE(rows->Term());  // the document went with the file: nothing is added twice

  ASSERT_EQ(FilesInFolder(), Strings{"NPP1_1000_EP.xml"});
  EXPECT_EQ(FileText("NPP1_1000_EP.xml"), Crlf(kTwoRowFile));
  for (const auto& conNote : {first, second}) {
    EXPECT_EQ(conNote->Get("ManifestId").Whole(), 1);
    EXPECT_EQ(conNote->Get("Status").Whole(), 8);
  }
  EXPECT_EQ(host.nextManifestId, 2);  // one manifest record for the run
}

TEST_F(eParcelManifestTest, EveryPackIsAnArticleWithItsOwnIdAndCarton) {
  auto conNote = ExpressToJSmith(3);
  auto packs = host::Object::As<host::PackList>(conNote->Get("Packs"));
  dynamic_cast<test::MemoryObject<host::Pack>&>(*packs->Item(2)).fields["Carton"] =
      Var(host.Make<host::Carton>({{"Length", 1.2}, {"Width", 1.0}, {"Height", 0.455}}));
  Run(kManifestClass, {0});
  const std::string file = "NPP1_1000_EP.xml";
  EXPECT_EQ(Values(file, "//ArticleNumber"),
            (Strings{"NPP10000077015029", "NPP10000077025028", "NPP10000077035027"}));
  EXPECT_EQ(Values(file, "//BarcodeArticleNumber"),
            (Strings{"99700196NPP1000007701502903121", "99700196NPP1000007702502803121",
                     "99700196NPP1000007703502703121"}));
  EXPECT_EQ(Values(file, "//Length"), (Strings{"40", "120", "40"}));
  EXPECT_EQ(Values(file, "//Height"), (Strings{"25", "45.5", "25"}));
}

TEST_F(eParcelManifestTest, LaterRunsOfTheDayExtendTheDayFile) {
  ClockOnRealDate();
  ExpressToJSmith();
  EXPECT_EQ(Run(kManifestClass, {0}), (std::vector<std::int32_t>{1, 102}));
  StandardToChadstone();  // the morning's consignment has its manifest: only this one is listed
  EXPECT_EQ(Run(kManifestClass, {0}), (std::vector<std::int32_t>{1, 103}));

  ASSERT_EQ(FilesInFolder(), Strings{"NPP1_1000_EP.xml"});
  const std::string text = FileText("NPP1_1000_EP.xml");
  EXPECT_TRUE(text.starts_with("<?xml version=\"1.0\" encoding=\"utf-8\"?>\r\n<PCMS xmlns="));
  EXPECT_TRUE(text.ends_with("</SendPCMSManifest>\r\n</PCMS>\r\n"));
  EXPECT_EQ(Values("NPP1_1000_EP.xml", "/PCMS/SendPCMSManifest/header/TransactionId"),
            Strings{"PO778812"});
  EXPECT_EQ(Values("NPP1_1000_EP.xml", "//PCMSManifest/ManifestNumber"), Strings{"1000"});
  EXPECT_EQ(Values("NPP1_1000_EP.xml", "//PCMSConsignment/ConsignmentNumber"),
            (Strings{"NPP10000077", "NPP10000078"}));
}

TEST_F(eParcelManifestTest, AnUnreadableDayFileIsKeptAndTheRunGoesBesideIt) {
  ClockOnRealDate();
  const std::string broken = "<?xml version=\"1.0\"?><PCMS><SendPCMSManifest><body>";
  ASSERT_TRUE(ReplaceFile(folder + "NPP1_0999_EP.xml", broken));
  ExpressToJSmith();
  Run(kManifestClass, {0});
  StandardToChadstone();
  Run(kManifestClass, {0});

  EXPECT_EQ(FileText("NPP1_0999_EP.xml"), broken);
  EXPECT_EQ(FilesInFolder(), (Strings{"NPP1_0999_EP.xml", "NPP1_0999_EP_2.xml"}));
  EXPECT_EQ(Values("NPP1_0999_EP_2.xml", "//ConsignmentNumber"),
            (Strings{"NPP10000077", "NPP10000078"}));
  EXPECT_EQ(host.LogMessages().back(),
            "Manifest file " + folder +
                "NPP1_0999_EP.xml cannot be read as a PCMS manifest; it is kept and the "
                "consignments are written to " +
                folder + "NPP1_0999_EP_2.xml.");

  // A whole manifest with a NUL and more after it: rewriting it would drop
  // what follows the NUL, so it is kept too.
  const std::string held = FileText("NPP1_0999_EP_2.xml") + std::string(1, '\0') + "<more/>";
  ASSERT_TRUE(ReplaceFile(folder + "NPP1_0999_EP_2.xml", held));
  ExpressToJSmith();
  Run(kManifestClass, {0});
  EXPECT_EQ(FileText("NPP1_0999_EP_2.xml"), held);
  EXPECT_EQ(FilesInFolder(),
            (Strings{"NPP1_0999_EP.xml", "NPP1_0999_EP_2.xml", "NPP1_0999_EP_3.xml"}));
}

TEST_F(eParcelManifestTest, AFileThatCannotBeWrittenIsReportedAndKeptForAnotherTerm) {
  std::filesystem::create_directories(dir / "later");
  carrier->fields["FileFolder"] = Var(folder + "later/");
  ExpressToJSmith();
  auto prompt = std::make_shared<test::ScriptedPrompt>();  // answers Abort
  test::PromptScope scope(prompt);
  auto object = CreateObject(kManifestClass).object;
  RowInterface* rows = Loaded(object);
  LogList log;
  ASSERT_EQ(rows->Process(0, log), 102);
  // The folder goes away before Term (the share dropped, say).
  std::filesystem::rename(dir / "later", dir / "away");
  EXPECT_FALSE(rows->Term());
  std::filesystem::rename(dir / "away", dir / "later");
  ASSERT_EQ(prompt->messages.size(), 1u);
  EXPECT_NE(prompt->messages[0].find("#76"), std::string::npos);
  EXPECT_NE(prompt->messages[0].find("ceParcelManifestxml, Function Term"), std::string::npos);

  EXPECT_TRUE(rows->Term());
  EXPECT_EQ(Values("later/NPP1_1000_EP.xml", "//ConsignmentNumber"), Strings{"NPP10000077"});
}

TEST_F(eParcelManifestTest, AConsignmentThatCannotBeKeptUntilTermIsNeitherStampedNorReportedDone) {
  carrier->fields["FileFolder"] = Var(folder + "missing/");
  auto conNote = ExpressToJSmith();
  auto object = CreateObject(kManifestClass).object;
  RowInterface* rows = Loaded(object);
  LogList log;
  EXPECT_EQ(rows->Process(0, log), 0);
  ASSERT_EQ(log.size(), 1u);
  EXPECT_EQ(host.LogMessages().back(), "Consignment NPP10000077 cannot be kept for the manifest file in " +
                                           folder + "missing/; it is not added.");
  EXPECT_EQ(conNote->Get("ManifestId").NumberOr(0), 0);
  EXPECT_TRUE(rows->Term());  // nothing to write

  // Without a folder text nothing goes to the working directory, and no
  // manifest record is made for a file that is never written.
  test::WorkingDirectory cwd(folder + "cwd");
  for (const Var& none : {Var(""), Var()}) {
    carrier->fields["FileFolder"] = none;
    auto again = CreateObject(kManifestClass).object;
    RowInterface* run = Loaded(again);
    EXPECT_EQ(run->Process(0, log), 0);
    EXPECT_EQ(host.LogMessages().back(), "Invalid folder ");
    EXPECT_EQ(host.logs.back().at("Procedure").Text(), "Open carrier message file");
    EXPECT_TRUE(run->Term());
  }
  EXPECT_EQ(conNote->Get("ManifestId").NumberOr(0), 0);
  EXPECT_TRUE(cwd.Entries().empty());
}

TEST_F(eParcelManifestTest, NothingIsWrittenWithoutAConsignmentInTheDocument) {
  EXPECT_EQ(Run(kManifestClass, {}), std::vector<std::int32_t>{0});
  EXPECT_EQ(host.LogMessages(), Strings{"No Consignments found to process."});
  EXPECT_EQ(host.logs[0].at("Procedure").Text(), "Load");

  auto conNote = ExpressToJSmith();
  Run(kManifestClass, {});  // Term without Process
  host.manifestSaveFails = true;
  EXPECT_EQ(Run(kManifestClass, {0}), (std::vector<std::int32_t>{1, 0}));
  EXPECT_EQ(host.LogMessages().back(), "Failed to create mainifest ID");
  EXPECT_EQ(host.logs.back().at("Procedure").Text(), "Process");
  EXPECT_EQ(conNote->Get("ManifestId").NumberOr(0), 0);
  EXPECT_TRUE(FilesInFolder().empty());
}

TEST_F(eParcelManifestTest, AConsignmentThatCannotBeReadLeavesNoDocumentBehind) {
  // A pack without an order: the consignment cannot be read (error 91).
  auto orderless = host.Make<host::ConNote>({{"ConNoteId", 110},
                                             {"ConNoteNo", "NPP0000110"},
                                             {"Vendor", vendor},
                                             {"Carrier", carrier}});
  MemoryHost::Attach(orderless, {host.Make<host::Pack>({{"Despatch", host.Make<host::Despatch>(
                                                                          {{"DespatchNo", "PO110"}})}})});
  auto prompt = std::make_shared<test::ScriptedPrompt>();  // answers Abort
  test::PromptScope scope(prompt);
  EXPECT_EQ(Run(kManifestClass, {0}), (std::vector<std::int32_t>{1, 0}));
  EXPECT_TRUE(FilesInFolder().empty());

  // With a readable consignment after it, only that one is written, and the
  // header names it. (The first run's manifest record was made: this run has the next.)
  ExpressToJSmith();
  EXPECT_EQ(Run(kManifestClass, {0, 1}), (std::vector<std::int32_t>{2, 0, 102}));
  ASSERT_EQ(FilesInFolder(), Strings{"NPP1_1001_EP.xml"});
  EXPECT_EQ(Values("NPP1_1001_EP.xml", "//ConsignmentNumber"), Strings{"NPP10000077"});
  EXPECT_EQ(Values("NPP1_1001_EP.xml", "//TransactionId"), Strings{"PO778812"});
}

TEST_F(eParcelManifestTest, ARowProcessedTwiceIsInTheManifestOnce) {
  ExpressToJSmith();
  auto object = CreateObject(kManifestClass).object;
  RowInterface* rows = Loaded(object);
  LogList log;
  EXPECT_EQ(rows->Process(0, log), 102);
  EXPECT_EQ(rows->Process(0, log), 0);
  EXPECT_EQ(host.LogMessages().back(),
            "Consignment NPP10000077 is already in this manifest; it is not added again.");
  EXPECT_TRUE(rows->Term());
  EXPECT_EQ(Values("NPP1_1000_EP.xml", "//ConsignmentNumber"), Strings{"NPP10000077"});
}

TEST_F(eParcelManifestTest, HostTextsComeOutEscapedAndWellFormed) {
  auto order = MakeOrder({{"Name", "Smith & Sons <Pty> \"Ltd\""},
                          {"Line1", "Café Straße 5\x01\ttab"},
                          {"Suburb", "M\xFFNCHEN"},
                          {"Postcode", "3000"},
                          {"Reference", "]]>"}});
  AddConNote(104, "NPP0000079", 1, order);
  Run(kManifestClass, {0});
  const std::string file = "NPP1_1000_EP.xml";
  EXPECT_NE(
      FileText(file).find("<DeliveryName>Smith &amp; Sons &lt;Pty&gt; \"Ltd\"</DeliveryName>"),
      std::string::npos);
  EXPECT_FALSE(FileText(file).starts_with("\xEF\xBB\xBF"));  // no byte-order mark
  EXPECT_EQ(Values(file, "//DeliveryName"), Strings{"Smith & Sons <Pty> \"Ltd\""});
  EXPECT_EQ(Values(file, "//DeliveryAddressLine1"), Strings{"Café Straße 5  tab"});
  EXPECT_EQ(Values(file, "//DeliverySuburb"), Strings{"M\xEF\xBF\xBDNCHEN"});
  EXPECT_EQ(Values(file, "//ReferenceNo1"), Strings{"]]>"});
}

TEST_F(eParcelManifestTest, FileNamesFromHostTextsStayInTheCarrierFolder) {
  carrier->fields["AccountRef"] = Var("a/..");
  carrier->fields["Options"] = Var("../../x");
  ExpressToJSmith();
  Run(kManifestClass, {0});
  EXPECT_EQ(FilesInFolder(), Strings{"A____1000_______x.xml"});
}

TEST_F(eParcelManifestTest, NullHostDataNeverStopsTheRunNorLeavesHalfAConsignment) {
  // Every scalar Null; a pack without despatch or carton; an order without slip lines.
  auto order = host.Make<host::Order>({{"DeliveryAddress", host.Make<host::Address>()}});
  auto blank = host.Make<host::ConNote>({{"ConNoteId", 105},
                                         {"Vendor", host.Make<host::Vendor>()},
                                         {"Carrier", carrier},
                                         {"Orders", MemoryHost::List<host::Order>({order})}});
  vendor->fields["VendorId"] = Var();
  host.ediDocuments[0]->fields["VendorId"] = Var();
  MemoryHost::Attach(blank, {host.Make<host::Pack>({{"Order", order}})});
  // No packs at all: the consignment cannot be read.
  host.Make<host::ConNote>({{"ConNoteId", 106}, {"Vendor", vendor}, {"Carrier", carrier}});

  auto prompt = std::make_shared<test::ScriptedPrompt>();  // answers Abort
  test::PromptScope scope(prompt);
  EXPECT_EQ(Run(kManifestClass, {1, 5, -1, 0}), (std::vector<std::int32_t>{2, 0, 0, 0, 105}));
  ASSERT_EQ(prompt->messages.size(), 1u);  // for the row without packs
  EXPECT_NE(prompt->messages[0].find("ceParcelManifestxml, Function Process"), std::string::npos);
  // Rows the host never loaded are logged.
  EXPECT_EQ(host.LogMessages().at(1), "Row -1 is not one of the 2 loaded rows.");

  const std::string file = "NPP1_1000_EP.xml";
  EXPECT_EQ(Values(file, "//ConsignmentNumber"), Strings{"NPP1"});
  EXPECT_EQ(Values(file, "//ActualWeight"), Strings{"0.40"});
  EXPECT_EQ(Values(file, "//CreatedDateTime"), Strings{"T.106+10:00"});
  EXPECT_EQ(Values(file, "//ReturnCountryCode"), Strings{"AU"});
  EXPECT_EQ(Values(file, "//Length"), Strings{""});
  EXPECT_EQ(Values(file, "//TransactionId"), Strings{""});
  EXPECT_TRUE(Values(file, "//DeliveryCompanyName").empty());
}

// A process killed at any moment of its manifest runs (each run one
// consignment: Init, Load, Process, Term) leaves one day file that parses
// and holds every consignment of a finished run once.
TEST_F(eParcelManifestTest, KilledAtAnyMomentTheDayFileParsesAndHoldsEachRunOnce) {
  ClockOnRealDate();
  test::ScriptedPrompt answers;
  test::PromptScope prompt{std::shared_ptr<ErrorPrompt>(&answers, [](ErrorPrompt*) {})};
  auto order = MakeOrder({{"Name", "J SMITH"}, {"Suburb", "RICHMOND"}, {"Postcode", "3121"}});
  test::KillLoop loop;
  loop.write = [&](int n) {
    char number[16];
    std::snprintf(number, sizeof number, "NPP%07d", n);
    AddConNote(n, number, 1, order);
    const std::size_t asked = answers.messages.size();
    auto object = CreateObject(kManifestClass).object;
    auto* run = as<RowInterface>(object);
    Grid columns, grid;
    LogList log;
    return run->Init(host.system, 7, columns) && run->Load("", grid) == 1 &&
           run->Process(0, log) == n && run->Term() && answers.messages.size() == asked;
  };
  loop.read = [&] {
    std::vector<int> numbers;
    const Strings files = FilesInFolder();
    std::size_t days = 0;
    for (const std::string& name : files) {
      if (name.starts_with(".")) continue;  // what a kill left of a file not yet in place
      ++days;
      EXPECT_TRUE(FileText(name).ends_with("</SendPCMSManifest>\r\n</PCMS>\r\n")) << name;
      for (const std::string& no : Values(name, "//PCMSConsignment/ConsignmentNumber"))
        numbers.push_back(std::stoi(no.substr(no.size() - 7)));
      EXPECT_EQ(Values(name, "//PCMSConsignment").size(), Values(name, "//PCMSDomesticArticle").size());
    }
    EXPECT_EQ(days, 1u);
    return numbers;
  };
  test::RunKillLoop(loop);
}

}  // namespace
}  // namespace quendal
