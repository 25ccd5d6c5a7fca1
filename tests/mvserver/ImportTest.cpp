#include <gtest/gtest.h>

#include <cmath>
#include <nlohmann/json.hpp>

#include "mvserver/SqliteHost.h"
#include "tests/support/TempFolder.h"

namespace quendal::mvserver {
namespace {

using nlohmann::json;
using test::TempFolder;

std::string ExampleDay() { return test::ReadText(QUENDAL_MVSERVER_FIXTURES "/example-day.json"); }

// Every row of every table, as text: equal dumps mean an unchanged database.
std::string Dump(Database& db) {
  std::vector<std::string> tables;
  {
    Use s(db.Prepare("SELECT name FROM sqlite_master WHERE type = 'table' ORDER BY name"));
    while (s->Step()) tables.push_back(s->Text(0));
  }
  std::string dump;
  for (const auto& table : tables) {
    dump += "[" + table + "]\n";
    Use s(db.Prepare("SELECT * FROM \"" + table + "\" ORDER BY rowid"));
    while (s->Step()) {
      for (int i = 0; i < s->ColumnCount(); ++i) dump += s->Text(i) + "|";
      dump += "\n";
    }
  }
  return dump;
}

// A JSON value and what the host returned for it agree in value and kind.
void ExpectSame(const json& expected, const Var& actual, const std::string& path) {
  SCOPED_TRACE(path);
  switch (expected.type()) {
    case json::value_t::null:
      EXPECT_TRUE(actual.IsNull());
      break;
    case json::value_t::boolean:
      EXPECT_EQ(actual.type(), Var::Type::Flag);
      EXPECT_EQ(actual.Flag(), expected.get<bool>());
      break;
    case json::value_t::string:
      if (actual.IsDate()) {
        EXPECT_EQ(actual.Date().Iso(), expected.get<std::string>());
      } else {
        EXPECT_EQ(actual.type(), Var::Type::Text);
        EXPECT_EQ(actual.Text(), expected.get<std::string>());
      }
      break;
    case json::value_t::number_integer:
    case json::value_t::number_unsigned:
      ASSERT_TRUE(actual.IsNumberType());
      EXPECT_EQ(actual.Number(), expected.get<double>());
      break;
    case json::value_t::number_float:
      ASSERT_EQ(actual.type(), Var::Type::Number);
      EXPECT_NEAR(actual.Number(), expected.get<double>(), 1e-12);
      break;
    default:
      FAIL() << "unexpected JSON value";
  }
}

void ExpectFields(const json& record, host::Object& object, const std::string& path,
                  std::initializer_list<std::string_view> nested = {}) {
  for (const auto& [name, value] : record.items()) {
    if (std::find(nested.begin(), nested.end(), name) != nested.end()) continue;
    ExpectSame(value, object.Get(name), path + "." + name);
  }
}

TEST(ImportTest, EveryFieldOfTheExampleDayReadsBackThroughTheHostObjects) {
  TempFolder folder;
  auto host = SqliteHost::Open(folder / "host.db");
  const ImportSummary summary = host->Import(ExampleDay());
  EXPECT_EQ(summary.total, 1 + 1 + 2 + 1 + 2 + 2 + 2 + 1 + 1 + 2 + 1 + 2 + 3 + 1 + 1);

  const json doc = json::parse(ExampleDay());
  ExpectFields(doc["System"], *host->System(), "System");

  const std::pair<const char*, const char*> keyed[] = {
      {"Vendors", "Vendor"},     {"Carriers", "Carrier"},   {"Partners", "Partner"},
      {"Receivers", "Receiver"}, {"Products", "Product"},   {"Cartons", "Carton"},
      {"Customers", "Customer"}, {"Despatches", "Despatch"}, {"Orders", "Order"},
      {"ASNs", "ASN"},           {"ConNotes", "ConNote"},   {"Packs", "Pack"},
      {"Jobs", "Job"},           {"EDIDocuments", "EDIDocument"}};
  for (const auto& [table, type] : keyed) {
    const auto keys = host->Keys(type);
    ASSERT_EQ(keys.size(), doc[table].size()) << table;
    for (std::size_t i = 0; i < keys.size(); ++i) {
      const json& record = doc[table][i];
      auto object = host->Find(type, keys[i]);
      ASSERT_TRUE(object);
      const std::string path = std::string(table) + "[" + std::to_string(i) + "]";
      ExpectFields(record, *object, path,
                   {"Address", "DeliveryAddress", "SlipLines", "Lines", "Attributes"});
    }
  }

  // Nested parts: addresses, slip lines, pack lines and attributes.
  auto customer = host->Find<host::Customer>("Customer", 1);
  ExpectFields(doc["Customers"][0]["Address"], *customer->Address(), "Customers[0].Address");
  for (int o = 0; o < 2; ++o) {
    auto order = host->Find<host::Order>("Order", o + 1);
    const json& slips = doc["Orders"][o]["SlipLines"];
    auto lines = order->SlipLines();
    ASSERT_EQ(lines->Count(), static_cast<int>(slips.size()));
    for (int i = 0; i < lines->Count(); ++i) {
      auto line = lines->Item(i + 1);
      ExpectSame(slips[i]["LineNo"], line->LineNo(), "LineNo");
      ExpectSame(slips[i]["APN"], line->APN(), "APN");
      ExpectSame(slips[i]["Qty"], line->Qty(), "Qty");
      ExpectSame(slips[i]["QtyPacked"], line->QtyPacked(), "QtyPacked");
      ExpectSame(slips[i]["ProductId"], line->Product()->Get("ProductId"), "Product");
      EXPECT_EQ(line->Customer()->Name().Text(), "Harbour Stores Online");
      EXPECT_EQ(line->Order()->OrderNo().Text(), order->OrderNo().Text());
    }
  }
  ExpectFields(doc["Orders"][1]["DeliveryAddress"], *host->Find<host::Order>("Order", 2)->DeliveryAddress(),
               "Orders[1].DeliveryAddress");
  EXPECT_EQ(host->Find<host::Order>("Order", 2)->SlipLines()->Item(1)->Despatch()->DespatchNo().Text(),
            "PO778812");

  for (std::size_t p = 0; p < 3; ++p) {
    const json& record = doc["Packs"][p];
    auto pack = host->Find<host::Pack>("Pack", record["PackId"].get<int>());
    auto lines = pack->Lines();
    ASSERT_EQ(lines->Count(), static_cast<int>(record["Lines"].size()));
    for (int i = 0; i < lines->Count(); ++i) {
      ExpectSame(record["Lines"][i]["Qty"], lines->Item(i + 1)->Qty(), "Lines.Qty");
      ExpectSame(record["Lines"][i]["ProductId"], lines->Item(i + 1)->Product()->Get("ProductId"),
                 "Lines.Product");
      EXPECT_EQ(lines->Item(i + 1)->Pack()->PackId().Whole(), record["PackId"].get<int>());
    }
    if (record.contains("Attributes"))
      for (const auto& [key, value] : record["Attributes"].items())
        ExpectSame(value, pack->GetAttribute(key), "Attributes." + key);
  }
  EXPECT_TRUE(host->Find<host::Pack>("Pack", 1002)->GetAttribute("USER").IsNull());
  EXPECT_TRUE(host->Find<host::Pack>("Pack", 1001)->GetAttribute("style").IsNull());
  EXPECT_EQ(host->Count("Manifest"), 0);
  EXPECT_EQ(host->Count("Log"), 0);
}

TEST(ImportTest, ASecondDocumentAddsToTheDatabaseAndMayReferToItsRecords) {
  TempFolder folder;
  auto host = SqliteHost::Open(folder / "host.db");
  host->Import(ExampleDay());
  host->Import(R"({"Packs": [{"PackId": 1004, "ConNoteId": 101, "ReceiverId": 1, "SSCC": "X"}],
                  "System": {"UserName": "packer2"}})");
  auto conNote = host->Find<host::ConNote>("ConNote", 101);
  ASSERT_EQ(conNote->Packs()->Count(), 3);
  EXPECT_EQ(conNote->Packs()->Item(3)->SSCC().Text(), "X");
  // The System object takes the fields given and keeps the others.
  EXPECT_EQ(host->System()->UserName().Text(), "packer2");
  EXPECT_EQ(host->System()->PrinterLanguage().Text(), "VPCLII");
}

TEST(ImportTest, ARejectedDocumentNamesThePathAndLeavesTheDatabaseAsItWas) {
  const std::pair<const char*, const char*> cases[] = {
      {R"({"Vendors": [)", "invalid JSON: "},
      // What the document holds is quoted with its control characters escaped.
      {"{\"Vendors\": [\x7F",
       "invalid JSON: parse error at line 1, column 14: syntax error while parsing value - invalid "
       "literal; last read: '\"Vendors\": [\\x7F'"},
      {R"({"ConNotes": [{"ConNoteId": 5, "ConNoteDate": "1\u001b[31m\n"}]})",
       "ConNotes[0].ConNoteDate: malformed date \"1\\x1B[31m\\x0A\""},
      {"{\"Vendors\x7F\": []}", "Vendors\\x7F: unknown collection"},
      {R"({"Packs": [{"PackId": 5, "Weight": 1e999}]})",
       "invalid JSON: number overflow parsing '1e999'"},
      {R"([1, 2])", "(top level): expected an object, got an array"},
      {R"({"Widgets": []})", "Widgets: unknown collection"},
      {R"({"Vendors": {"VendorId": 5}})", "Vendors: expected an array, got an object"},
      {R"({"Vendors": [{"VendorId": 5, "Name": 12}]})",
       "Vendors[0].Name: expected a string, got an integer"},
      {R"({"Receivers": [{"ReceiverId": 5, "Postcode": 3029}]})",
       "Receivers[0].Postcode: expected a string, got an integer"},
      {R"({"Products": [{"ProductId": 5, "IsDangerous": "yes"}]})",
       "Products[0].IsDangerous: expected true or false, got a string"},
      {R"({"Packs": [{"PackId": 5, "ItemCount": 1.5}]})",
       "Packs[0].ItemCount: expected a 32-bit integer, got a number with a fraction"},
      {R"({"Packs": [{"PackId": 5, "ItemCount": 4294967296}]})", "Packs[0].ItemCount: "},
      {R"({"EDIDocuments": [{"ID": 40000}]})", "EDIDocuments[0].ID: "},
      {R"({"Vendors": [{"VendorId": 5}], "Packs": [{"PackId": 5, "Colour": "red"}]})",
       "Packs[0].Colour: unknown field of Pack"},
      {R"({"Packs": [{"PackId": 5, "Lines": [{"ProductId": 1, "Size": 2}]}]})",
       "Packs[0].Lines[0].Size: unknown field of PackLine"},
      {R"({"Orders": [{"OrderId": 5, "DeliveryAddress": {"Town": "X"}}]})",
       "Orders[0].DeliveryAddress.Town: unknown field of Address"},
      {R"({"ConNotes": [{"ConNoteId": 5, "ConNoteDate": "14/03/2024"}]})",
       "ConNotes[0].ConNoteDate: malformed date \"14/03/2024\""},
      {R"({"ConNotes": [{"ConNoteId": 5, "ConNoteDate": "2024-02-30T10:00:00"}]})",
       "ConNotes[0].ConNoteDate: malformed date"},
      {R"({"Vendors": [{"VendorId": 5}, {"VendorId": 6}, {"VendorId": 5}]})",
       "Vendors[2].VendorId: duplicate VendorId 5 (also Vendors[0])"},
      {R"({"Vendors": [{"VendorId": 1}]})", "Vendors[0].VendorId: VendorId 1 already exists"},
      {R"({"Vendors": [{"Name": "no id"}]})", "Vendors[0].VendorId: required"},
      {R"({"Vendors": [{"VendorId": 5}], "Packs": [{"PackId": 5}, {"PackId": 6}, {"PackId": 7},
          {"PackId": 8, "ConNoteId": 77}]})",
       "Packs[3].ConNoteId: no ConNote 77"},
      {R"({"Packs": [{"PackId": 5, "Lines": [{"ProductId": 1}, {"ProductId": 9}]}]})",
       "Packs[0].Lines[1].ProductId: no Product 9"},
      {R"({"ConNotes": [{"ConNoteId": 5, "OrderIds": [1, 8]}]})",
       "ConNotes[0].OrderIds[1]: no Order 8"},
      {R"({"Packs": [{"PackId": 5, "Attributes": {"STYLE": 7}}]})",
       "Packs[0].Attributes.STYLE: expected a string, got an integer"},
      {R"({"Despatches": [{"DespatchId": 5, "SlipLines": [{"LineNo": 1, "CustomerId": 4}]}]})",
       "Despatches[0].SlipLines[0].CustomerId: no Customer 4"},
  };
  TempFolder folder;
  auto host = SqliteHost::Open(folder / "host.db");
  host->Import(ExampleDay());
  const std::string before = Dump(host->Db());
  for (const auto& [document, message] : cases) {
    SCOPED_TRACE(document);
    try {
      host->Import(document);
      ADD_FAILURE() << "accepted";
    } catch (const ImportError& e) {
      EXPECT_TRUE(std::string(e.what()).starts_with(message)) << e.what();
    }
    EXPECT_EQ(Dump(host->Db()), before);
  }
  // The host still reads what it held (no stale rows from a rolled-back import).
  EXPECT_EQ(host->Find("Vendor", 5), nullptr);
  EXPECT_EQ(host->Keys("Pack").size(), 3u);
}

TEST(ImportTest, OpeningRefusesFilesThatAreNotThisHostsDatabase) {
  TempFolder folder;
  test::WriteText(folder / "text.db", "this is not a database, just some text of some length......");
  EXPECT_THROW(SqliteHost::Open(folder / "text.db"), OpenError);
  {
    Database other(folder / "other.db");
    other.Exec("CREATE TABLE Things (a)");
  }
  EXPECT_THROW(SqliteHost::Open(folder / "other.db"), OpenError);
  {
    Database newer(folder / "newer.db");
    newer.Exec("CREATE TABLE Things (a); PRAGMA user_version = 99");
  }
  try {
    SqliteHost::Open(folder / "newer.db");
    ADD_FAILURE() << "opened";
  } catch (const OpenError& e) {
    EXPECT_NE(std::string(e.what()).find("newer Quendal"), std::string::npos);
  }
  EXPECT_THROW(SqliteHost::Open(folder / "missing/folder/host.db"), OpenError);
  // A database created once opens again with its data.
  SqliteHost::Open(folder / "host.db")->Import(ExampleDay());
  EXPECT_EQ(SqliteHost::Open(folder / "host.db")->Count("Pack"), 3);
}

}  // namespace
}  // namespace quendal::mvserver
