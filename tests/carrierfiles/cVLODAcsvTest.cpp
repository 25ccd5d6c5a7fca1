#include "carrierfiles/cVLODAcsv.h"

#include <filesystem>

#include "tests/carrierfiles/MapCsvFixture.h"
#include "tests/support/KillLoop.h"
#include "tests/support/Records.h"

namespace quendal {
namespace {

using test::CsvLine;
using test::kCsvSscc;
using test::MapText;
using ::testing::ElementsAre;

const std::vector<std::string> kVloNames = {
    "SUPPLIERNO",         "CUSTOMERCODE",      "SHIPNOTENO",       "SHIPNOTEDATE",
    "SHIPNOTETIME",       "SHIPNOTETYPECODE",  "SHIPNOTESTATUS",   "BILLOFLADING",
    "BOOKINGNO",          "ORDERNO",           "ORDERDATE",        "ORDERSTATUSCODE",
    "POVERSIONNO",        "INVOICENO",         "DELREFERENCE",     "PARTNERSUPPLIERNO",
    "COMPANYCODE",        "CONSIGNMENTNOTENO", "CARRIERNAME",      "CARRIERACCOUNTREF",
    "CARRIERSERVICECODE", "CARRIERRUNCODE",    "SENDERNAME",       "SENDERADDR1",
    "SENDERADDR2",        "SENDERTOWN",        "SENDERSTATE",      "SENDERPOSTCODE",
    "SENDERCONTACT",      "RECEIVERNAME",      "RECEIVERADDR1",    "RECEIVERADDR2",
    "RECEIVERTOWN",       "RECEIVERSTATE",     "RECEIVERPOSTCODE", "RECEIVERCONTACT",
    "DELIVERYDATE",       "SCHEDULEDATE",      "SCHEDULETIME",     "DATESHIPPED",
    "SHIPTOCODE",         "PALLETNO",          "PALLETMARKTYPE",   "PALLETTYPECODE",
    "CONTAINERNO",        "SHIPPACKCODE",      "SHIPMENTWEIGHT",   "SHIPMENTVOLUME",
    "SHIPMENTCOUNT",      "PACKMARKTYPE",      "PACKAGETYPECODE",  "PACKWEIGHT",
    "PACKLENGTH",         "PACKWIDTH",         "PACKHEIGHT",       "BUYSTORECODE"};

// Every field of one pack of the fixture's consignment, in catalogue order:
// what the notice, order and consignment give, the receiver, the dates and
// store, then the pack's own values.
std::string VloLine(std::string_view sscc, std::string_view packValues) {
  return std::string(
             ",,ASN0004500,20240314,0745,00,CC,BOL7700,BK2200,PO778800,10/03/2024,CC,556677,,"
             "SO20045,556677,HBS01,VLO00012345,VLO,70067890,EXP,MEL,Kestrel Apparel Pty Ltd,"
             "Unit 7,40 Industry Drive,DANDENONG SOUTH,VIC,3175,,") +
         "Harbour Stores DC,1 Distribution Way,,TRUGANINA,VIC,3029,Dock Manager," +
         "20240315,20240315,0905,20240314,0412,,,," + std::string(sscc) + "," +
         std::string(packValues) + ",0412\r\n";
}

class VLODAcsvTest : public test::MapCsvFixture {
 protected:
  clsVLODAcsv vlo;
};

TEST_F(VLODAcsvTest, ThreeColumnMapWritesOneLinePerPackAndLogsEachPack) {
  Map("VLODA.map", "CONSIGNMENTNOTENO\r\nCONTAINERNO\r\nPACKWEIGHT\r\n");
  const LogList log = Process(vlo, ConNote("VLO00012345", 2), {7});

  EXPECT_EQ(Output(), CsvLine({"VLO00012345", kCsvSscc[0], "310.5"}) +
                          CsvLine({"VLO00012345", kCsvSscc[1], "8.13"}));
  EXPECT_THAT(host.LogMessages(),
              ElementsAre("......Pack 00093123450000100016 added to ConNote VLO00012345",
                          "......Pack 00093123450000100023 added to ConNote VLO00012345",
                          "ASN ASN0004500 VLO DA compile completed. 2 packs added."));
  EXPECT_EQ(host.logs[0].at("Procedure").Text(), "Process Pack");
  EXPECT_EQ(host.logs[2].at("Procedure").Text(), "Process");
  EXPECT_EQ(host.logs[2].at("Source").Text(), "Quendal.clsVLODAcsv");
  EXPECT_THAT(log, ElementsAre(7, 1, 2, 3));
}

TEST_F(VLODAcsvTest, MapOfEveryFieldWritesTheWholeCatalogue) {
  Map("VLODA.map", MapText(kVloNames));
  Process(vlo, ConNote());
  EXPECT_EQ(Output(), VloLine(kCsvSscc[0], "PLT01,27.46,0.125,3,GM,09,310.5,1.2,1,1.4") +
                          VloLine(kCsvSscc[1], "CTN25,27.46,0.125,3,GM,CT,8.13,0.4,0.3,0.25") +
                          VloLine(kCsvSscc[2], "CTN01,27.46,0.125,3,GM,CT,12.0,0.4,0.3,0.25"));
}

TEST_F(VLODAcsvTest, HandEditedMapLinesAreTrimmedAndThoseNamingNoFieldStayEmptyColumns) {
  // A byte-order mark, LF ends, any case, spaces and tabs, a blank line,
  // an unknown name twice and blank lines at the end.
  Map("VLODA.map",
      "\xEF\xBB\xBF  consignmentNoteNo \t\nNOSUCHFIELD\n\nCONTAINERNO\nNOSUCHFIELD\n\n\n");
  Process(vlo, ConNote("VLO00012345", 1));
  EXPECT_EQ(Output(), CsvLine({"VLO00012345", "", "", kCsvSscc[0], ""}));
  const std::string file = "ASN map file " + folder + "VLODA.map ";
  EXPECT_THAT(
      host.LogMessages(),
      ElementsAre(file + "line 2 names no field: \"NOSUCHFIELD\"; its column is written empty.",
                  file + "line 3 is blank; its column is written empty.",
                  "......Pack 00093123450000100016 added to ConNote VLO00012345",
                  "ASN ASN0004500 VLO DA compile completed. 1 packs added."));
  EXPECT_EQ(host.logs[0].at("Procedure").Text(), "OpenMapFile");
}

TEST_F(VLODAcsvTest, SecondConsignmentOnTheSameObjectUsesTheMapItLoaded) {
  Map("VLODA.map", "CONSIGNMENTNOTENO\r\nSHIPMENTCOUNT\r\nBOGUS");
  Process(vlo, ConNote("VLO00012345", 1));
  // A map edited after the first call is read by a new object only.
  Map("VLODA.map", "CONTAINERNO\r\n");
  Process(vlo, ConNote("VLO00012346", 2));
  EXPECT_EQ(Output(), CsvLine({"VLO00012345", "1", ""}) + CsvLine({"VLO00012346", "2", ""}) +
                          CsvLine({"VLO00012346", "2", ""}));
  // The unknown name was logged once, on the first call.
  EXPECT_EQ(host.LogMessages()[0],
            "ASN map file " + folder +
                "VLODA.map line 3 names no field: \"BOGUS\"; its column is written empty.");
  EXPECT_EQ(host.LogMessages()[1], "......Pack 00093123450000100016 added to ConNote VLO00012345");
  EXPECT_EQ(host.LogMessages().size(), 6u);
}

TEST_F(VLODAcsvTest, WithoutAMapNothingIsWrittenUntilTheMapIsThere) {
  const std::string file = "ASN map file " + folder + "VLODA.map";
  LogList log = Process(vlo, ConNote());
  EXPECT_THAT(host.LogMessages(), ElementsAre(file + " does not exist."));
  EXPECT_THAT(log, ElementsAre(1));
  Map("VLODA.map", "");
  Process(vlo, ConNote());
  Map("VLODA.map", " \r\n\t\r\n");
  Process(vlo, ConNote());
  Map("VLODA.map", "CONTAINERNO\r\n" + std::string(70000, ' '));
  Process(vlo, ConNote());
  EXPECT_THAT(host.LogMessages(),
              ElementsAre(file + " does not exist.", file + " is empty.", file + " is empty.",
                          file + " is too large: a map file holds at most 65536 bytes."));
  EXPECT_FALSE(FileExists(folder + "VLO_1403240930.txt"));

  Map("VLODA.map", "CONTAINERNO");
  Process(vlo, ConNote("VLO00012345", 1));
  EXPECT_EQ(Output(), CsvLine({kCsvSscc[0]}));
}

TEST_F(VLODAcsvTest, AValueHoldingACommaOrQuoteStaysOneColumnAndALineBreakIsASpace) {
  Map("VLODA.map", "RECEIVERNAME\r\nCONTAINERNO\r\nRECEIVERTOWN");
  receiver->fields["Name"] = "  Smith, Jones & Co  ";
  receiver->fields["Suburb"] = "Line one\r\nline two";
  Process(vlo, ConNote("VLO00012345", 1));
  receiver->fields["Name"] = "The \"Corner\" Store";
  receiver->fields["Suburb"] = "TRUGANINA";
  Process(vlo, ConNote("VLO00012346", 1));
  EXPECT_EQ(Output(), CsvLine({"\"Smith, Jones & Co\"", kCsvSscc[0], "Line one  line two"}) +
                          CsvLine({"\"The \"\"Corner\"\" Store\"", kCsvSscc[0], "TRUGANINA"}));
}

TEST_F(VLODAcsvTest, PackValuesFollowTheOrderTheDespatchAndThePackType) {
  Map("VLODA.map", "SHIPNOTESTATUS\r\nPARTNERSUPPLIERNO\r\nORDERSTATUSCODE\r\nSHIPPACKCODE");
  auto whole = ConNote("VLO00012345", 3);
  Process(vlo, whole);
  // One more pack of the order in another consignment: now a part shipment.
  Pack("00093123450000100047", "CTN01", "CARTON", 1);
  despatch->fields["SupplierNo"] = "   ";
  whole->fields["OrderStatusFlag"] = Var();
  Process(vlo, whole);
  EXPECT_EQ(
      Output(),
      CsvLine({"CC", "556677", "CC", "PLT01"}) + CsvLine({"CC", "556677", "CC", "CTN25"}) +
          CsvLine({"CC", "556677", "CC", "CTN01"}) + CsvLine({"PR", "889900", "SS", "PLT01"}) +
          CsvLine({"PR", "889900", "SS", "CTN25"}) + CsvLine({"PR", "889900", "SS", "CTN01"}));
}

TEST_F(VLODAcsvTest, TheBaseNamesTheFileAndItsFolderHoldsTheMap) {
  carrier->fields["FileFolder"] = folder;
  Map("VLODA.map", "CONTAINERNO");
  Process(vlo, ConNote("VLO00012345", 1));
  EXPECT_EQ(ReadFile(folder + "_1403240930.txt").value_or(""), CsvLine({kCsvSscc[0]}));

  carrier->fields["FileFolder"] = Var();
  Process(vlo, ConNote("VLO00012345", 1));
  EXPECT_EQ(host.LogMessages().back(), "No filename provided.");
  EXPECT_EQ(host.logs.back().at("Procedure").Text(), "Open carrier message file");

  // The file can't be opened: a folder stands in its place.
  carrier->fields["FileFolder"] = folder + "VLO";
  std::filesystem::create_directory(folder + "VLO_1403240930.txt");
  Process(vlo, ConNote("VLO00012345", 1));
  EXPECT_EQ(host.LogMessages().back(), "Cannot open file " + folder + "VLO_1403240930.txt");
}

TEST_F(VLODAcsvTest, LoadTakesNoRowsAndBothLogBeforeAnyProcess) {
  Grid rows;
  EXPECT_EQ(vlo.Load("anything", rows), 0);
  EXPECT_FALSE(vlo.OpenMapFile(folder));
  EXPECT_THAT(host.LogMessages(),
              ElementsAre("No Packs found to process. Quendal.clsVLODAcsv takes consignments "
                          "through Process only.",
                          "ASN map file " + folder + " cannot be read."));
}

// A process killed at any moment while it adds consignments leaves whole
// lines of whole consignments only, and the next call adds to that file.
TEST_F(VLODAcsvTest, KilledAtAnyMomentTheFileHoldsOnlyWholeConsignments) {
  Map("VLODA.map", "CONSIGNMENTNOTENO\r\nCONTAINERNO\r\nPACKWEIGHT\r\n");
  test::ScriptedPrompt answers;
  test::PromptScope prompt{std::shared_ptr<ErrorPrompt>(&answers, [](ErrorPrompt*) {})};
  test::KillLoop loop;
  loop.write = [&](int n) {
    const std::size_t asked = answers.messages.size();
    const LogList log = Process(vlo, ConNote("V" + std::to_string(n), 2));
    return answers.messages.size() == asked && test::Logged(host, log, "compile completed.");
  };
  loop.read = [&] {
    const std::string text = Output();
    EXPECT_TRUE(text.empty() || text.ends_with("\r\n"));
    const std::vector<std::string> lines = test::CrLfLines(text);
    std::vector<int> numbers;
    EXPECT_EQ(lines.size() % 2, 0u);
    for (std::size_t i = 0; i + 1 < lines.size(); i += 2) {
      const std::string no = lines[i].substr(0, lines[i].find(','));
      EXPECT_EQ(lines[i] + "\r\n", CsvLine({no, kCsvSscc[0], "310.5"})) << "line " << i;
      EXPECT_EQ(lines[i + 1] + "\r\n", CsvLine({no, kCsvSscc[1], "8.13"})) << "line " << i + 1;
      numbers.push_back(std::stoi(no.substr(1)));
    }
    return numbers;
  };
  test::RunKillLoop(loop);
}

}  // namespace
}  // namespace quendal
