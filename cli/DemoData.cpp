#include "cli/DemoData.h"

#include <array>
#include <cstdio>
#include <algorithm>
#include <set>

#include "frame/Catalogue.h"

namespace quendal::cli {

namespace {

// Account settings of the carriers the demo knows by name; others get made-up ones.
struct CarrierAccount {
  std::string_view name;
  std::string_view code;
  std::string_view accountNumber;
  std::string_view options;
  std::string_view notifyOptions;
  std::string_view service;
};

constexpr std::array kAccounts = {
    CarrierAccount{"StarTrack", "STE", "10023456", "#%ATL", "", "EXP"},
    CarrierAccount{"TNT", "TNT", "30012345", "", "", "O/N 1ST CLASS"},
    CarrierAccount{"Mayne", "MAY", "20034567", "", "", "RD"},
    CarrierAccount{"Ipec", "IPE", "50045678", "", "", "ROAD"},
    CarrierAccount{"VicExpress", "VEX", "60056789", "", "", "MET"},
    CarrierAccount{"VLO", "VLO", "70067890", "", "", "GEN"},
    CarrierAccount{"Toll", "TOL", "80078901", "", "", "GEN"},
    CarrierAccount{"AaE", "AAE", "90089012", "", "", "OVERNIGHT"},
    CarrierAccount{"DFE", "DFE", "40217", "", "", "OVN"},
    CarrierAccount{"Hunter", "HUN", "11090123", "", "", "GEN"},
    CarrierAccount{"Allied Express", "ALX", "12001234", "", "", "ROAD"},
    CarrierAccount{"IFS", "IFS", "13012345", "", "", "GEN"},
    CarrierAccount{"Australia Post", "AUP", "14023456", "", "#%noemail", "PP"},
    CarrierAccount{"Australia Post eParcel", "EPC", "15034567", "EP", "", "7E55"},
};

struct Store {
  std::string_view code;
  int partner;  // 1 Harbour Stores, 2 Meridian
  std::string_view name, line1, suburb, city, state, postcode;
};

// Distribution centres first (receivers 1 and 2), then stores.
constexpr std::array kStores = {
    Store{"0900", 1, "Harbour Stores DC", "1 Distribution Way", "TRUGANINA", "MEL", "VIC", "3029"},
    Store{"9001", 2, "Meridian DC", "20 Warehouse Circuit", "EASTERN CREEK", "SYD", "NSW", "2766"},
    Store{"0412", 1, "Harbour Stores Chadstone", "Shop 210", "CHADSTONE", "MEL", "VIC", "3148"},
    Store{"0415", 1, "Harbour Stores Doncaster", "Shop 1-045", "DONCASTER", "MEL", "VIC", "3108"},
    Store{"0230", 1, "Harbour Stores Bondi", "500 Oxford Street", "BONDI JUNCTION", "SYD", "NSW", "2022"},
    Store{"1102", 2, "Meridian Brisbane", "91 Queen Street", "BRISBANE", "BNE", "QLD", "4000"},
    Store{"1140", 2, "Meridian Adelaide", "77 Rundle Mall", "ADELAIDE", "ADL", "SA", "5000"},
    Store{"1175", 2, "Meridian Perth", "200 Murray Street", "PERTH", "PER", "WA", "6000"},
};

struct Product {
  std::string_view text1, text2, text3, dgClass;
  double unitWeight;
};

constexpr std::array kProducts = {
    Product{"CLASSIC TEE", "WHITE", "M", "", 0.2},
    Product{"DENIM JEANS", "INDIGO", "32", "", 0.7},
    Product{"WOOL JUMPER", "NAVY", "L", "", 0.5},
    Product{"CANVAS SNEAKER", "BLACK", "9", "", 0.9},
    Product{"CERAMIC MUG", "STONE", "EACH", "", 0.35},
    Product{"AEROSOL DEODORANT", "150ML", "EACH", "2.1", 0.18},
    Product{"NAIL POLISH REMOVER", "100ML", "EACH", "3.1", 0.12},
    Product{"POOL CHLORINE TABLETS", "1KG", "TUB", "5.1", 1.1},
};
constexpr int kFirstDangerous = 6;  // product ids 6..8

struct Carton {
  std::string_view code;
  double weight, length, width, height;
};
constexpr std::array kCartons = {
    Carton{"CTN01", 0.45, 0.40, 0.30, 0.25},
    Carton{"CTN02", 0.60, 0.60, 0.40, 0.40},
    Carton{"PLT01", 25.0, 1.20, 1.00, 1.40},
    Carton{"SAT01", 0.05, 0.35, 0.25, 0.05},
};
constexpr int kPallet = 3, kSatchel = 4;

// The columns a site lists for each map-driven despatch advice, one field
// name per line as a Windows editor saves them.
struct MapFile {
  std::string_view carrier, name, text;
};
constexpr std::array kMapFiles = {
    MapFile{"VLO", "VLODA.map",
            "SHIPNOTENO\r\nSHIPNOTEDATE\r\nSHIPNOTETIME\r\nSHIPNOTESTATUS\r\nCONSIGNMENTNOTENO\r\n"
            "ORDERNO\r\nORDERSTATUSCODE\r\nPARTNERSUPPLIERNO\r\nCARRIERNAME\r\nCARRIERACCOUNTREF\r\n"
            "RECEIVERNAME\r\nRECEIVERADDR1\r\nRECEIVERTOWN\r\nRECEIVERSTATE\r\nRECEIVERPOSTCODE\r\n"
            "SHIPTOCODE\r\nCONTAINERNO\r\nSHIPPACKCODE\r\nPACKAGETYPECODE\r\nPACKWEIGHT\r\n"
            "SHIPMENTCOUNT\r\nSHIPMENTWEIGHT\r\n"},
    MapFile{"TNT", "TransactionDA.map",
            "SHIPNOTENO\r\nCONSIGNMENTNOTENO\r\nORDERNO\r\nDELREFERENCE\r\nCARRIERACCOUNTREF\r\n"
            "CARRIERSERVICECODE\r\nSENDERNAME\r\nRECEIVERNAME\r\nRECEIVERADDR1\r\nRECEIVERTOWN\r\n"
            "RECEIVERSTATE\r\nRECEIVERPOSTCODE\r\nRECEIVERPHONE\r\nSHIPMENTCOUNT\r\nSHIPMENTWEIGHT\r\n"
            "SHIPMENTVOLUME\r\nDESCRIPTION\r\nSPECIALREFERENCE1\r\n"},
};

std::string Padded(std::int64_t value, int width) {
  std::string text = std::to_string(value);
  return std::string(text.size() < static_cast<std::size_t>(width) ? width - text.size() : 0, '0') + text;
}

std::string Iso(DateTime d) { return d.Iso(); }

}  // namespace

std::string DemoSscc(std::int64_t serial) {
  const std::string digits = "0" + std::string("9312345") + Padded(serial, 9);
  int sum = 0;
  for (std::size_t i = 0; i < digits.size(); ++i) {
    const int digit = digits[digits.size() - 1 - i] - '0';
    sum += digit * (i % 2 == 0 ? 3 : 1);
  }
  return "00" + digits + std::to_string((10 - sum % 10) % 10);
}

DemoData BuildDemoData(const std::string& root, DateTime now, int consignments) {
  DemoData data;
  data.documentPrinter = "Despatch Office Laser";
  json& doc = data.document;
  const DateTime today = now.DateOnly();

  doc["System"] = {{"PrinterLanguage", "VPCLII"}, {"PrinterBatchMode", 1},   {"SpoolerMode", 2},
                   {"PDTType", "Denso"},          {"UserName", "demo"},      {"DocumentPrinter", data.documentPrinter},
                   {"LastError", 0},              {"NextManifestNumber", 1000001}};
  doc["Vendors"] = json::array({{{"VendorId", 1}, {"VendorCode", "KES"}, {"Name", "Kestrel Apparel Pty Ltd"},
                                 {"AddressLine1", "Unit 7"}, {"AddressLine2", "40 Industry Drive"},
                                 {"AddressLine3", "DANDENONG SOUTH"}, {"Suburb", "DANDENONG SOUTH"},
                                 {"State", "VIC"}, {"Postcode", "3175"}, {"Country", "Australia"}}});

  // One carrier for every carrier the catalogue names, in catalogue order.
  std::vector<std::string> names;
  for (const auto& entry : Catalogue()) {
    const std::string name(entry.carrier);
    if (name != "any" && std::find(names.begin(), names.end(), name) == names.end()) names.push_back(name);
  }
  doc["Carriers"] = json::array();
  doc["EDIDocuments"] = json::array();
  std::vector<std::string> services;
  for (std::size_t i = 0; i < names.size(); ++i) {
    const auto id = static_cast<std::int32_t>(i + 1);
    CarrierAccount account{names[i], {}, {}, {}, {}, "GEN"};
    std::string code = "C" + Padded(id, 2);
    std::string number = "9" + Padded(id, 7);
    for (const auto& known : kAccounts)
      if (known.name == names[i]) {
        account = known;
        code = std::string(known.code);
        number = std::string(known.accountNumber);
      }
    const std::string folder = root + "/carriers/" + code + "/";
    // DFE's despatch advice and its manifest run write the same day's file
    // name; the run writes to a folder of its own, so the demo shows both.
    const std::string outputFolder = names[i] == "DFE" ? folder + "manifest/" : folder;
    json carrier = {{"CarrierId", id},           {"CarrierCode", code},
                    {"Name", names[i]},          {"Options", nullptr},
                    {"NotifyOptions", nullptr},  {"AccountRef", code + "01"},
                    {"AccountNumber", number},   {"FileFolder", folder}};
    if (!account.options.empty()) carrier["Options"] = account.options;
    if (!account.notifyOptions.empty()) carrier["NotifyOptions"] = account.notifyOptions;
    doc["Carriers"].push_back(carrier);
    doc["EDIDocuments"].push_back(
        {{"ID", id}, {"VendorId", 1}, {"PartnerId", 1}, {"CarrierId", id}, {"OutputFolder", outputFolder}});
    data.carriers.push_back({id, id, names[i], names[i] + " Labels", folder, outputFolder});
    services.emplace_back(account.service);
  }
  const auto carrierCount = static_cast<int>(names.size());
  for (const DemoCarrier& carrier : data.carriers)
    for (const MapFile& map : kMapFiles)
      if (map.carrier == carrier.name)
        data.files.push_back({carrier.folder + std::string(map.name), std::string(map.text)});

  doc["Partners"] = json::array({{{"PartnerId", 1}, {"Code", "HBS"}, {"ShortName", "HARBOUR"}, {"SupplierNo", "556677"}},
                                 {{"PartnerId", 2}, {"Code", "MDS"}, {"ShortName", "MERIDIAN"}, {"SupplierNo", "889900"}}});
  doc["Receivers"] = json::array();
  for (std::size_t i = 0; i < kStores.size(); ++i) {
    const Store& s = kStores[i];
    doc["Receivers"].push_back({{"ReceiverId", i + 1}, {"Code", s.code}, {"PartnerId", s.partner},
                                {"StoreCode", s.code}, {"Name", s.name}, {"AddressLine1", s.line1},
                                {"AddressLine2", i < 2 ? "Gate 2" : "Rear loading dock"}, {"Suburb", s.suburb}, {"City", s.city},
                                {"State", s.state}, {"Postcode", s.postcode}, {"CountryCode", "036"},
                                {"CarrierId", static_cast<int>(i) % carrierCount + 1},
                                {"CarrierServiceCode", i < 2 ? "EXP" : "STD"},
                                {"Extra1", i < 2 ? "Dock Manager" : "Store Manager"},
                                {"Extra2", "03 9000 " + std::string(s.code)}});
  }
  doc["Products"] = json::array();
  for (std::size_t i = 0; i < kProducts.size(); ++i) {
    const Product& p = kProducts[i];
    json product = {{"ProductId", i + 1}, {"Text1", p.text1}, {"Text2", p.text2}, {"Text3", p.text3},
                    {"IsDangerous", !p.dgClass.empty()}, {"DGClass", nullptr}, {"UnitWeight", p.unitWeight},
                    {"HasComponents", false}};
    if (!p.dgClass.empty()) product["DGClass"] = p.dgClass;
    doc["Products"].push_back(product);
  }
  doc["Cartons"] = json::array();
  for (std::size_t i = 0; i < kCartons.size(); ++i) {
    const Carton& c = kCartons[i];
    doc["Cartons"].push_back({{"CartonId", i + 1}, {"Code", c.code}, {"Weight", c.weight},
                              {"Length", c.length}, {"Width", c.width}, {"Height", c.height}});
  }
  doc["Customers"] = json::array({{{"CustomerId", 1}, {"Name", "Harbour Stores Online"},
                                   {"Address", {{"Company", "Harbour Stores Ltd"}, {"Name", "Online Orders"},
                                                {"Line1", "PO Box 100"}, {"Suburb", "MELBOURNE"},
                                                {"State", "VIC"}, {"Postcode", "3000"}}}}});
  doc["Jobs"] = json::array({{{"JobId", 1}, {"Reference", "WAVE-" + Padded(today.Month(), 2) + Padded(today.Day(), 2) + "-A"},
                              {"Customer", "HBS001"}}});

  doc["Despatches"] = json::array();
  doc["Orders"] = json::array();
  doc["ASNs"] = json::array();
  doc["ConNotes"] = json::array();
  doc["Packs"] = json::array();
  std::int64_t packId = 10001;
  // A quarter of an hour apart, closer when a day of that many would run past 18:00.
  const int spacing = std::min(15 * 60, 10 * 3600 / std::max(consignments, 1));
  for (int i = 0; i < consignments; ++i) {
    // Every carrier twice, the last two consignments for the first carriers again.
    const int carrierIndex = i % carrierCount;
    const DemoCarrier& carrier = data.carriers[static_cast<std::size_t>(carrierIndex)];
    const std::string& code = doc["Carriers"][carrierIndex]["CarrierCode"].get_ref<const std::string&>();
    const int storeIndex = 2 + i % 6;
    const Store& store = kStores[static_cast<std::size_t>(storeIndex)];
    const bool viaDc = i % 3 == 0;
    const int receiverId = viaDc ? store.partner : storeIndex + 1;
    const bool postal = carrier.name.starts_with("Australia Post");
    const int conNoteId = 101 + i;
    const int orderId = 1 + i;
    const int packCount = 1 + (i * 7 + 3) % 9;
    const bool pallet = !postal && i % 5 == 1;
    const bool dangerous = i % 6 == 2;
    const DateTime at = today.AddSeconds(8 * 3600 + i * spacing);

    doc["Despatches"].push_back({{"DespatchId", orderId}, {"DespatchNo", "PO" + Padded(778800 + i, 6)},
                                 {"NotBefore", Iso(today.AddDays(1).AddSeconds(8 * 3600))},
                                 {"NotAfter", Iso(today.AddDays(5).AddSeconds(17 * 3600))},
                                 {"OrderDate", Iso(today.AddDays(-4))}, {"CompanyCode", store.partner == 1 ? "HBS01" : "MDS01"},
                                 {"SupplierNo", store.partner == 1 ? "556677" : "889900"},
                                 {"ZoneDeptA", Padded(10 + i % 4, 2)}, {"ZoneDeptB", "A" + std::to_string(1 + i % 4)},
                                 {"ZoneDeptC", i % 2 ? "WOMENSWEAR" : "HOMEWARES"},
                                 {"VendorId", 1}, {"ReceiverId", receiverId}});
    json order = {{"OrderId", orderId}, {"OrderNo", "SO" + Padded(20045 + i, 5)},
                  {"StoreNo", std::stoi(std::string(store.code))}, {"VendorCode", store.partner == 1 ? "556677" : "889900"},
                  {"ReceiverId", receiverId},
                  {"SlipLines", json::array({{{"LineNo", 1}, {"APN", "93123450" + Padded(10 + i % 5, 5)},
                                              {"ProductId", 1 + i % 5}, {"Qty", 12 * packCount},
                                              {"QtyPacked", 12 * packCount}, {"CustomerId", 1}}})}};
    if (postal)
      order["DeliveryAddress"] = {{"Name", i % 2 ? "J SMITH" : "A NGUYEN"}, {"Line1", std::to_string(5 + i) + " Sample Street"},
                                  {"Suburb", "RICHMOND"}, {"State", "VIC"}, {"Postcode", "3121"},
                                  {"Phone", "0400 000 " + Padded(i, 3)}, {"Email", "customer" + std::to_string(i) + "@example.com"},
                                  {"Reference", "WEB-" + std::to_string(5500 + i)}};
    doc["Orders"].push_back(order);
    doc["ASNs"].push_back({{"ID", orderId}, {"ASNNo", "ASN" + Padded(4500 + i, 7)}, {"ASNNumber", 4500 + i},
                           {"ASNDate", Iso(at.AddSeconds(-1800))}, {"OriginCode", "MEL"}});

    double weight = 0, cube = 0;
    for (int p = 0; p < packCount; ++p) {
      const int cartonId = pallet && p == 0 ? kPallet : postal ? kSatchel : 1 + (i + p) % 2;
      const Carton& carton = kCartons[static_cast<std::size_t>(cartonId - 1)];
      const int productId = 1 + (i + p) % 5;
      const int qty = cartonId == kPallet ? 60 : cartonId == kSatchel ? 2 : 12;
      json lines = json::array({{{"ProductId", productId}, {"Qty", qty}}});
      double packWeight = carton.weight + qty * kProducts[static_cast<std::size_t>(productId - 1)].unitWeight;
      if (dangerous && p == 0) {
        const int dg = kFirstDangerous + (i / 6) % 3;
        lines.push_back({{"ProductId", dg}, {"Qty", 4}});
        packWeight += 4 * kProducts[static_cast<std::size_t>(dg - 1)].unitWeight;
      }
      packWeight = static_cast<double>(static_cast<long long>(packWeight * 100 + 0.5)) / 100;
      weight += packWeight;
      cube += carton.length * carton.width * carton.height;
      const std::string packType = cartonId == kPallet ? "PALLET" : cartonId == kSatchel ? "SATCHEL" : "CARTON";
      doc["Packs"].push_back({{"PackId", packId}, {"ConNoteId", conNoteId}, {"ASNId", orderId},
                              {"CarrierId", carrier.carrierId}, {"VendorId", 1}, {"ReceiverId", receiverId},
                              {"ShipToId", storeIndex + 1}, {"OrderId", orderId}, {"DespatchId", orderId},
                              {"CartonId", cartonId}, {"PartnerId", store.partner},
                              {"SSCC", DemoSscc(packId)}, {"StoreCode", viaDc && p % 2 ? "DC" : std::string(store.code)},
                              {"SalesOrderNo", order["OrderNo"]}, {"PackType", packType}, {"Weight", packWeight},
                              {"BuyStoreCode", store.code}, {"ItemCount", qty}, {"Cubic", nullptr},
                              {"Attributes", {{"STYLE", "ST-" + Padded(productId, 3)}, {"EAN/UPC", "93123450" + Padded(10 + productId, 5)},
                                              {"USER", "demo"}, {"JOBID", "J" + std::to_string(5000 + i)},
                                              {"DESCRIPTION", kProducts[static_cast<std::size_t>(productId - 1)].text1},
                                              {"DELIVERYREF", "DR-" + std::string(store.code)}}},
                              {"Lines", lines}});
      ++packId;
    }
    const double roundedWeight = static_cast<double>(static_cast<long long>(weight * 100 + 0.5)) / 100;
    const double roundedCube = static_cast<double>(static_cast<long long>(cube * 1000 + 0.5)) / 1000;
    const Store& deliverTo = kStores[static_cast<std::size_t>(receiverId - 1)];
    // Every fourth consignment goes express, and so does each postal carrier's second one, so
    // that both of the postal labels print.
    doc["ConNotes"].push_back({{"ConNoteId", conNoteId}, {"ConNoteNo", code + Padded(12345 + i, 8)},
                               {"ConNoteDate", Iso(at)}, {"Service", services[static_cast<std::size_t>(carrierIndex)]},
                               {"ServiceLevel", i % 4 == 3 || (postal && i >= carrierCount) ? "EXPRESS" : "STANDARD"}, {"CarrierPrefix", code},
                               {"Weight", roundedWeight}, {"Volume", roundedCube}, {"Cube", roundedCube},
                               {"CubicTotal", nullptr}, {"CubicOverride", nullptr},
                               {"DeliveryInstructions", viaDc ? "Deliver to dock 3" : "Rear loading bay"},
                               {"BillOfLading", "BOL" + std::to_string(7700 + i)}, {"BookingNo", "BK" + std::to_string(2200 + i)},
                               {"ScheduledDate", Iso(today.AddDays(1).AddSeconds(9 * 3600))},
                               {"OrderStatusFlag", i % 4 != 1}, {"PartnerCode", store.partner == 1 ? "HBS" : "MDS"},
                               {"DeliveryLocation", std::string(deliverTo.code) + " " + std::string(deliverTo.suburb)},
                               {"ManifestId", nullptr}, {"Status", nullptr},
                               {"CarrierId", carrier.carrierId}, {"ReceiverId", receiverId}, {"VendorId", 1},
                               {"PartnerId", store.partner}});
  }
  doc["Manifests"] = json::array();
  doc["Logs"] = json::array();
  return data;
}

}  // namespace quendal::cli
