#include "mvserver/SqliteHost.h"

#include <chrono>
#include <gtest/gtest.h>

#include "tests/support/TempFolder.h"

namespace quendal::mvserver {
namespace {

using test::TempFolder;

class SqliteHostTest : public ::testing::Test {
 protected:
  void SetUp() override {
    host = SqliteHost::Open(folder / "host.db");
    host->Import(test::ReadText(QUENDAL_MVSERVER_FIXTURES "/example-day.json"));
  }
  Ref<host::Pack> Pack(int id) { return host->Find<host::Pack>("Pack", id); }
  Ref<host::ConNote> ConNote(int id) { return host->Find<host::ConNote>("ConNote", id); }
  static std::vector<std::int64_t> Ids(const Ref<host::ConNotes>& list) {
    std::vector<std::int64_t> ids;
    for (auto c : *list) ids.push_back(c->ConNoteId().Whole());
    return ids;
  }
  static long ErrorOf(const std::function<void()>& f) {
    try {
      f();
    } catch (const Error& e) {
      return e.Number();
    }
    return 0;
  }

  TempFolder folder;
  std::shared_ptr<SqliteHost> host;
};

TEST_F(SqliteHostTest, ObjectMembersResolveByTheirReferences) {
  EXPECT_EQ(Pack(1002)->Carton()->Code().Text(), "PLT01");
  EXPECT_EQ(Pack(1001)->ShipTo()->CountryCode().Text(), "036");
  EXPECT_EQ(Pack(1001)->ShipTo()->Name().Text(), "Harbour Stores Chadstone");
  EXPECT_EQ(Pack(1001)->Receiver()->StoreCode().Text(), "0900");
  EXPECT_EQ(Pack(1001)->Carrier()->Options().Text(), "#%ATL");
  EXPECT_EQ(Pack(1003)->ConNote()->ConNoteNo().Text(), "NPP0000077");
  EXPECT_TRUE(Pack(1003)->ASN().IsNothing());
  EXPECT_EQ(Pack(1001)->Lines()->Item(2)->Product()->DGClass().Text(), "3.1");
  EXPECT_EQ(ConNote(102)->Orders()->Item(1)->DeliveryAddress()->Name().Text(), "J SMITH");
  // An order without a delivery address still has one, with Null members.
  EXPECT_TRUE(Pack(1001)->Order()->DeliveryAddress()->Name().IsNull());
  EXPECT_EQ(Pack(1001)->Despatch()->Vendor()->VendorCode().Text(), "ACME");
}

TEST_F(SqliteHostTest, APackWithoutACarrierGoesWithItsReceiversCarrier) {
  host->Import(R"({"Packs": [{"PackId": 2001, "ReceiverId": 2, "CarrierId": null},
                             {"PackId": 2002}]})");
  EXPECT_EQ(Pack(2001)->Carrier()->CarrierCode().Text(), "NPP");
  EXPECT_TRUE(Pack(2001)->CarrierId().IsNull());
  EXPECT_TRUE(Pack(2002)->Carrier().IsNothing());
}

TEST_F(SqliteHostTest, CollectionsKeepDocumentOrderAndAreNeverNothing) {
  auto packs = ConNote(101)->Packs();
  ASSERT_EQ(packs->Count(), 2);
  EXPECT_EQ(packs->Item(1)->PackId().Whole(), 1001);
  EXPECT_EQ(packs->Item(2)->PackId().Whole(), 1002);
  EXPECT_EQ(ErrorOf([&] { packs->Item(3); }), err::kSubscript);
  EXPECT_EQ(ErrorOf([&] { packs->Item(0); }), err::kSubscript);
  // Orders are derived from the packs (distinct, first appearance) unless listed.
  ASSERT_EQ(ConNote(101)->Orders()->Count(), 1);
  EXPECT_EQ(ConNote(101)->Orders()->Item(1)->OrderNo().Text(), "SO10045");
  host->Import(R"({"ConNotes": [{"ConNoteId": 103, "OrderIds": [2, 1]}, {"ConNoteId": 104}]})");
  ASSERT_EQ(ConNote(103)->Orders()->Count(), 2);
  EXPECT_EQ(ConNote(103)->Orders()->Item(1)->OrderNo().Text(), "SO10046");
  EXPECT_EQ(ConNote(104)->Packs()->Count(), 0);
  EXPECT_EQ(ConNote(104)->Orders()->Count(), 0);
  EXPECT_EQ(host->NewManifest()->ConNotes()->Count(), 0);
}

TEST_F(SqliteHostTest, SlipLinesOfADespatchHaveNoOrderButTheirDespatch) {
  host->Import(R"({"Despatches": [{"DespatchId": 2, "DespatchNo": "PO2",
                   "SlipLines": [{"LineNo": 1}, {"LineNo": 2, "DespatchId": 1}]}]})");
  EXPECT_EQ(host->Find<host::Order>("Order", 2)->SlipLines()->Item(1)->Order()->OrderNo().Text(),
            "SO10046");
  EXPECT_TRUE(host->Find<host::Order>("Order", 1)->SlipLines()->Item(1)->Despatch().IsNothing());
  const auto keys = host->Keys("PSlipLine");  // the orders' three lines, then the despatch's two
  ASSERT_EQ(keys.size(), 5u);
  auto own = host->Find<host::PSlipLine>("PSlipLine", keys[3]);
  EXPECT_TRUE(own->Order().IsNothing());
  EXPECT_EQ(own->Despatch()->DespatchNo().Text(), "PO2");
  EXPECT_EQ(host->Find<host::PSlipLine>("PSlipLine", keys[4])->Despatch()->DespatchNo().Text(),
            "PO778812");
}

TEST_F(SqliteHostTest, UnknownMembersAndWritesToReadOnlyMembersRaise438) {
  EXPECT_EQ(ErrorOf([&] { Pack(1001)->Get("Colour"); }), err::kNoSuchMember);
  EXPECT_EQ(ErrorOf([&] { Pack(1001)->Set("SSCC", Var("1")); }), err::kNoSuchMember);
  EXPECT_EQ(ErrorOf([&] { ConNote(101)->Get("Packs").Object()->Get("Colour"); }), err::kNoSuchMember);
  EXPECT_EQ(ErrorOf([&] { host->System()->Get("Nonsense"); }), err::kNoSuchMember);
  EXPECT_EQ(ErrorOf([&] { host->NewReceiver()->Get("Save"); }), err::kNoSuchMember);
  EXPECT_EQ(ErrorOf([&] { ConNote(101)->SetManifestId(Var("abc")); }), err::kTypeMismatch);
}

TEST_F(SqliteHostTest, ManifestSaveAssignsIdAndNumberAndWriteThroughIsSeenAtOnce) {
  auto failing = host->NewManifest();
  failing->SetVendorId(1);
  failing->SetCarrierId(9);
  EXPECT_FALSE(failing->Save());
  EXPECT_EQ(failing->ManifestId().Whole(), 0);
  EXPECT_EQ(host->Count("Manifest"), 0);

  auto manifest = host->NewManifest();
  EXPECT_EQ(manifest->ManifestId().Whole(), 0);
  manifest->SetVendorId(1);
  manifest->SetCarrierId(1);
  manifest->SetManifestDate(DateTime::FromParts(2024, 3, 14, 17, 0, 0));
  ASSERT_TRUE(manifest->Save());
  EXPECT_EQ(manifest->ManifestId().Whole(), 1);
  EXPECT_EQ(manifest->ManifestNumber().Whole(), 1000123);
  EXPECT_EQ(host->System()->Get("NextManifestNumber").Whole(), 1000124);

  EXPECT_EQ(Ids(host->System()->GetManifestConNotes(1, 1)), std::vector<std::int64_t>{101});
  // The manifest class sets ManifestId without Update; the manifest sees it at once.
  auto conNote = ConNote(101);
  EXPECT_EQ(conNote->Carrier()->CarrierCode().Text(), "SRX");
  conNote->SetManifestId(manifest->ManifestId());
  EXPECT_EQ(Ids(manifest->ConNotes()), std::vector<std::int64_t>{101});
  EXPECT_TRUE(Ids(host->System()->GetManifestConNotes(1, 1)).empty());
  conNote->SetCubicTotal(1.5);
  conNote->Update(8);
  auto again = ConNote(101);
  EXPECT_EQ(again->CubicTotal().Number(), 1.5);
  EXPECT_EQ(again->Status().Whole(), 8);

  auto second = host->NewManifest();
  second->SetVendorId(1);
  second->SetCarrierId(2);
  ASSERT_TRUE(second->Save());
  EXPECT_EQ(second->ManifestId().Whole(), 2);
  EXPECT_EQ(second->ManifestNumber().Whole(), 1000124);
}

TEST_F(SqliteHostTest, ConsignmentsByDateMatchIdsOrCodesAndDateTexts) {
  auto system = host->System();
  EXPECT_EQ(Ids(system->GetManifestConNotes(1, 2)), std::vector<std::int64_t>{102});
  EXPECT_EQ(Ids(system->GetManifestConNotes("ACME", "SRX")), std::vector<std::int64_t>{101});
  EXPECT_EQ(Ids(system->GetConNotesByDate("2024/03/14", "2024/03/15", "ACME", "SRX")),
            std::vector<std::int64_t>{101});
  EXPECT_EQ(Ids(system->GetConNotesByDate(DateTime::FromParts(2024, 3, 14),
                                          DateTime::FromParts(2024, 3, 15), 1, 2)),
            std::vector<std::int64_t>{102});
  EXPECT_EQ(Ids(system->GetConNotesByDate("14/03/2024", "2024-03-15", "1", "NPP")),
            std::vector<std::int64_t>{102});
  // The end date is exclusive: 16:05 on the 14th is not before 16:05.
  EXPECT_TRUE(Ids(system->GetConNotesByDate("2024-03-14T00:00:00", "2024-03-14T16:05:00", 1, 2))
                  .empty());
  EXPECT_TRUE(system->GetConNotesByDate("2024/03/14", "2024/03/15", "NOBODY", "SRX").IsNothing());
  EXPECT_TRUE(system->GetConNotesByDate("2024/03/14", "2024/03/15", 1, 99).IsNothing());
  EXPECT_EQ(system->GetManifestConNotes(7, 1)->Count(), 0);
}

TEST_F(SqliteHostTest, LogEntriesGetIdsFromOneAndBindByID) {
  auto log = host->NewLog();
  log->Clear();
  log->SetSource("Quendal.clsTest");
  log->SetMessage("first");
  log->SetErrorNumber(5);
  log->Save();
  EXPECT_EQ(log->LogId().Whole(), 1);
  EXPECT_EQ(log->ID().Whole(), 1);
  log->Clear();
  EXPECT_TRUE(log->LogId().IsNull());
  log->SetMessage("second");
  log->Save();
  EXPECT_EQ(log->LogId().Whole(), 2);

  auto bound = host->NewLog();
  bound->SetID(1);
  EXPECT_EQ(bound->Message().Text(), "first");
  EXPECT_EQ(bound->LogId().Whole(), 1);
  auto none = host->NewLog();
  none->SetID(0);
  EXPECT_TRUE(none->LogId().IsNull());
  EXPECT_TRUE(none->Message().IsNull());
  ASSERT_EQ(host->LogsSince(1).size(), 1u);
  EXPECT_EQ(host->LogsSince(1)[0]->Message().Text(), "second");
  EXPECT_EQ(host->LastLogId(), 2);
}

// Packing stations share one database: one station in the middle of a read
// (a row run listing the day) must not hold up another station's write, and
// the entries both write get ids of their own.
TEST_F(SqliteHostTest, AStationsReadNeverHoldsUpAnotherStationsWrite) {
  auto other = SqliteHost::Open(folder / "host.db");
  auto save = [](SqliteHost& station, const char* message) {
    auto log = station.NewLog();
    log->SetMessage(message);
    log->Save();
    return log->LogId().Whole();
  };
  host->Db().Exec("BEGIN; SELECT count(*) FROM ConNotes;");
  const auto start = std::chrono::steady_clock::now();
  EXPECT_EQ(save(*other, "station 2"), 1);
  EXPECT_LT(std::chrono::steady_clock::now() - start, std::chrono::seconds(1));
  host->Db().Exec("COMMIT");
  EXPECT_EQ(save(*host, "station 1"), 2);
  EXPECT_EQ(save(*other, "station 2 again"), 3);
  ASSERT_EQ(host->LogsSince(0).size(), 3u);
  EXPECT_EQ(host->LogsSince(0)[2]->Message().Text(), "station 2 again");
}

TEST_F(SqliteHostTest, ReceiverLoadFindsByCodeAndPartnerWithoutRenamingTheLastOne) {
  auto receiver = host->NewReceiver();
  EXPECT_TRUE(receiver->Name().IsNull());
  receiver->SetCode("0412");
  receiver->SetPartnerId(1);
  ASSERT_TRUE(receiver->Load());
  receiver->Refresh();
  EXPECT_EQ(receiver->Name().Text(), "Harbour Stores Chadstone");
  EXPECT_EQ(receiver->Carrier()->CarrierCode().Text(), "NPP");

  // The same object looks up the next store; the first record keeps its code.
  receiver->SetCode("0900");
  ASSERT_TRUE(receiver->Load());
  EXPECT_EQ(receiver->Name().Text(), "Harbour Stores DC");
  EXPECT_EQ(host->Find<host::Receiver>("Receiver", 2)->Code().Text(), "0412");

  receiver->SetCode("0412");
  receiver->SetPartnerId(Var());
  EXPECT_FALSE(receiver->Load());
  EXPECT_TRUE(receiver->Name().IsNull());
  EXPECT_EQ(receiver->Code().Text(), "0412");
}

TEST_F(SqliteHostTest, LoadByKeyBindsVendorsCarriersPartnersDocumentsOrdersAndPacks) {
  auto vendor = host->NewVendor();
  vendor->SetVendorId(1);
  ASSERT_TRUE(vendor->Load());
  EXPECT_EQ(vendor->Name().Text(), "Acme Apparel Pty Ltd");
  auto carrier = host->NewCarrier();
  carrier->SetCarrierId(2);
  ASSERT_TRUE(carrier->Load());
  EXPECT_EQ(carrier->AccountNumber().Text(), "98765");
  auto partner = host->NewPartner();
  partner->SetPartnerId(3);
  EXPECT_FALSE(partner->Load());
  auto document = host->NewEDIDocument();
  EXPECT_FALSE(document->Load());
  document->SetID(7);
  ASSERT_TRUE(document->Load());
  EXPECT_EQ(document->OutputFolder().Text(), "/srv/despatch/NPP/");
  auto order = host->NewOrder();
  order->SetOrderNo("SO10046");
  ASSERT_TRUE(order->Load());
  EXPECT_EQ(order->SlipLines()->Count(), 1);
  auto pack = host->NewPack();
  pack->SetPackId("1002");
  EXPECT_TRUE(pack->SSCC().IsNull());
  ASSERT_TRUE(pack->Load());
  EXPECT_EQ(pack->SSCC().Text(), "00093123450000000029");
}

TEST_F(SqliteHostTest, PackCubicAttributesAndCountsThroughSystem) {
  auto pack = Pack(1001);
  pack->SetCubic(0.0123456789);
  pack->Update();
  EXPECT_EQ(Pack(1001)->Cubic().Number(), 0.0123456789);
  EXPECT_EQ(pack->GetAttribute("DELIVERYREF").Text(), "DR-0412");
  EXPECT_TRUE(pack->GetAttribute("PACKERID").IsNull());
  auto system = host->System();
  EXPECT_EQ(system->OrderPackCount(pack), 2);
  EXPECT_EQ(system->OrderPackCount(Pack(1003)), 1);
  EXPECT_EQ(system->ConNotePackCount(ConNote(101)), 2);
  system->SetLastError(8101);
  EXPECT_EQ(host->System()->LastError().Whole(), 8101);
}

TEST_F(SqliteHostTest, CollectionsReachedThroughTemporariesStayAliveWhileIterated) {
  auto pack = Pack(1001);
  std::vector<std::string> classes;
  for (auto line : *pack->Lines()) classes.push_back(line->Product()->DGClass().Text());
  EXPECT_EQ(classes, (std::vector<std::string>{"", "3.1"}));
  int packs = 0;
  for (auto other : *pack->ConNote()->Packs()) packs += other->SSCC().Text().size() == 20 ? 1 : 0;
  EXPECT_EQ(packs, 2);
  // A write makes the next read fresh; the collection being iterated stays valid.
  auto manifest = host->NewManifest();
  manifest->SetVendorId(1);
  manifest->SetCarrierId(1);
  ASSERT_TRUE(manifest->Save());
  auto system = host->System();
  for (auto c : *system->GetManifestConNotes(1, 1)) c->SetManifestId(manifest->ManifestId());
  int seen = 0;
  for (auto c : *manifest->ConNotes()) {
    c->SetCubicTotal(1.0);
    seen += manifest->ConNotes()->Count();
  }
  EXPECT_EQ(seen, 1);
}

TEST_F(SqliteHostTest, NewConNotesCollectsWhatIsAdded) {
  auto list = host->NewConNotes();
  EXPECT_EQ(list->Count(), 0);
  list->Add(ConNote(102), "102");
  list->Add(ConNote(101), "101");
  EXPECT_EQ(Ids(list), (std::vector<std::int64_t>{102, 101}));
}

}  // namespace
}  // namespace quendal::mvserver
