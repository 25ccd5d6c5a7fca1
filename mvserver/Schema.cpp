#include "mvserver/Schema.h"

#include <array>

namespace quendal::mvserver {

namespace {

using enum Value;

// Fields of a reference: the id field, the referenced type and the member it resolves.
constexpr Field Ref(std::string_view name, std::string_view target, std::string_view object) {
  return Field{name, Integer, target, object};
}
constexpr Field Settable(std::string_view name, Value value) {
  return Field{name, value, {}, {}, {}, true};
}

constexpr std::array kSystem = {
    Field{"PrinterLanguage", Text}, Field{"PrinterBatchMode", Integer},
    Field{"SpoolerMode", Integer},  Field{"PDTType", Text},
    Field{"UserName", Text},        Field{"DocumentPrinter", Text},
    Settable("LastError", Integer),
    // The next number Manifest.Save hands out.
    Field{"NextManifestNumber", Integer},
};

constexpr std::array kVendor = {
    Settable("VendorId", Integer), Field{"VendorCode", Text},   Field{"Name", Text},
    Field{"AddressLine1", Text},   Field{"AddressLine2", Text}, Field{"AddressLine3", Text},
    Field{"Suburb", Text},         Field{"State", Text},        Field{"Postcode", Text},
    Field{"Country", Text},
};
constexpr std::array<std::string_view, 1> kVendorKeys = {"VendorId"};

constexpr std::array kCarrier = {
    Settable("CarrierId", Integer), Field{"CarrierCode", Text},   Field{"Name", Text},
    Field{"Options", Text},         Field{"NotifyOptions", Text}, Field{"AccountRef", Text},
    Field{"AccountNumber", Text},   Field{"FileFolder", Text},
};
constexpr std::array<std::string_view, 1> kCarrierKeys = {"CarrierId"};

constexpr std::array kPartner = {
    Settable("PartnerId", Integer),
    Field{"Code", Text},
    Field{"ShortName", Text},
    Field{"SupplierNo", Text},
};
constexpr std::array<std::string_view, 1> kPartnerKeys = {"PartnerId"};

constexpr std::array kReceiver = {
    Field{"ReceiverId", Integer},
    Settable("Code", Text),
    // A look-up key copied from packs; receivers of unknown partners are allowed.
    Settable("PartnerId", Integer),
    Field{"StoreCode", Text},
    Field{"Name", Text},
    Field{"AddressLine1", Text},
    Field{"AddressLine2", Text},
    Field{"Suburb", Text},
    Field{"City", Text},
    Field{"State", Text},
    Field{"Postcode", Text},
    Field{"CountryCode", Text},
    Ref("CarrierId", "Carrier", "Carrier"),
    Field{"CarrierServiceCode", Text},
    Field{"Extra1", Text},
    Field{"Extra2", Text},
};
constexpr std::array<std::string_view, 2> kReceiverKeys = {"Code", "PartnerId"};

constexpr std::array kProduct = {
    Field{"ProductId", Integer},   Field{"Text1", Text},         Field{"Text2", Text},
    Field{"Text3", Text},          Field{"IsDangerous", Flag},   Field{"DGClass", Text},
    Field{"UnitWeight", Number},   Field{"HasComponents", Flag}, Field{"ComponentItem", Text},
    Field{"ComponentQty", Number},
};

constexpr std::array kCarton = {
    Field{"CartonId", Integer}, Field{"Code", Text},    Field{"Weight", Number},
    Field{"Length", Number},    Field{"Width", Number}, Field{"Height", Number},
};

constexpr std::array kAddress = {
    Field{"Name", Text},   Field{"Line1", Text}, Field{"Line2", Text},     Field{"Suburb", Text},
    Field{"State", Text},  Field{"Postcode", Text}, Field{"Phone", Text},  Field{"Email", Text},
    Field{"Reference", Text}, Field{"Company", Text},
};

constexpr std::array kCustomer = {Field{"CustomerId", Integer}, Field{"Name", Text}};
constexpr std::array kCustomerNested = {Nested{"Address", Nest::Address, "Address", {}, {}}};

constexpr std::array kDespatch = {
    Field{"DespatchId", Integer},
    Field{"DespatchNo", Text},
    Field{"NotBefore", Date},
    Field{"NotAfter", Date},
    Field{"OrderDate", Date},
    Field{"CompanyCode", Text},
    Field{"SupplierNo", Text},
    Field{"DeliveryText1", Text},
    Field{"DeliveryText2", Text},
    Field{"DeliveryText3", Text},
    Field{"ZoneDeptA", Text},
    Field{"ZoneDeptB", Text},
    Field{"ZoneDeptC", Text},
    Ref("VendorId", "Vendor", "Vendor"),
    Ref("ReceiverId", "Receiver", "Receiver"),
};
// Slip lines without an order, kept under the despatch they belong to.
constexpr std::array kDespatchNested = {
    Nested{"SlipLines", Nest::Records, "PSlipLine", {}, "ParentDespatchId", {}, false}};

constexpr std::array kOrder = {
    Field{"OrderId", Integer},
    Settable("OrderNo", Text),
    Field{"StoreNo", Integer},
    Field{"VendorCode", Text},
    Ref("ReceiverId", "Receiver", "Receiver"),
};
constexpr std::array kOrderNested = {
    Nested{"DeliveryAddress", Nest::Address, "Address", {}, {}},
    Nested{"SlipLines", Nest::Records, "PSlipLine", {}, "OrderId"},
};
constexpr std::array<std::string_view, 1> kOrderKeys = {"OrderNo"};

constexpr std::array kSlipLine = {
    Field{"LineNo", Integer},
    Field{"APN", Text},
    Field{"Qty", Number},
    Field{"QtyPacked", Number},
    Ref("ProductId", "Product", "Product"),
    Ref("CustomerId", "Customer", "Customer"),
    // A line nested in a despatch belongs to that despatch unless it names another.
    Field{"DespatchId", Integer, "Despatch", "Despatch", "ParentDespatchId"},
};
constexpr std::array kSlipLineParents = {
    Parent{"OrderId", "Order", "Order"},
    Parent{"ParentDespatchId", "Despatch", {}},
};

constexpr std::array kASN = {
    Field{"ID", Integer},     Field{"ASNNo", Text},      Field{"ASNNumber", Integer},
    Field{"ASNDate", Date},   Field{"OriginCode", Text},
};

constexpr std::array kConNote = {
    Field{"ConNoteId", Integer},
    Field{"ConNoteNo", Text},
    Field{"ConNoteDate", Date},
    Field{"Service", Text},
    Field{"ServiceLevel", Text},
    Field{"CarrierPrefix", Text},
    Field{"Weight", TextOrNumber},
    Field{"Volume", TextOrNumber},
    Field{"Cube", Number},
    Settable("CubicTotal", Number),
    Settable("CubicOverride", Number),
    Field{"DeliveryInstructions", Text},
    Field{"BillOfLading", Text},
    Field{"BookingNo", Text},
    Field{"ScheduledDate", Date},
    Field{"OrderStatusFlag", Flag},
    Field{"PartnerCode", Text},
    Field{"DeliveryLocation", Text},
    Settable("ManifestId", Integer),
    Field{"Status", Integer},
    Ref("CarrierId", "Carrier", "Carrier"),
    Ref("ReceiverId", "Receiver", "Receiver"),
    Ref("VendorId", "Vendor", "Vendor"),
    Ref("PartnerId", "Partner", "Partner"),
};
constexpr std::array kConNoteNested = {
    Nested{"OrderIds", Nest::IdList, "Order", "ConNoteOrders", "ConNoteId", "OrderId"}};
constexpr std::array kConNoteCollections = {
    Collection{"Packs", Derived::Referrers, "Pack", "ConNoteId"},
    Collection{"Orders", Derived::ListOrDerived, "Order", "OrderId", "OrderIds", "Packs"},
};

constexpr std::array kPack = {
    Settable("PackId", Integer),
    Ref("ConNoteId", "ConNote", "ConNote"),
    Ref("ASNId", "ASN", "ASN"),
    // A pack without its own carrier goes with its receiver's.
    Field{"CarrierId", Integer, "Carrier", "Carrier", "Receiver"},
    Ref("VendorId", "Vendor", "Vendor"),
    Ref("ReceiverId", "Receiver", "Receiver"),
    Ref("ShipToId", "Receiver", "ShipTo"),
    Ref("OrderId", "Order", "Order"),
    Ref("DespatchId", "Despatch", "Despatch"),
    Ref("CartonId", "Carton", "Carton"),
    Ref("PartnerId", "Partner", "Partner"),
    Field{"SSCC", Text},
    Field{"StoreCode", Text},
    Field{"SalesOrderNo", Text},
    Field{"PackType", Text},
    Field{"Weight", Number},
    Field{"BuyStoreCode", Text},
    Field{"ItemCount", Integer},
    Field{"Cubic", Number},
};
constexpr std::array kPackNested = {
    Nested{"Attributes", Nest::TextMap, {}, "PackAttributes", "PackId"},
    Nested{"Lines", Nest::Records, "PackLine", {}, "PackId"},
};
constexpr std::array<std::string_view, 1> kPackKeys = {"PackId"};

constexpr std::array kPackLine = {Ref("ProductId", "Product", "Product"), Field{"Qty", Number}};
constexpr std::array kPackLineParents = {Parent{"PackId", "Pack", "Pack"}};

constexpr std::array kJob = {Field{"JobId", Integer}, Field{"Reference", Text},
                             Field{"Customer", Text}};

// The document's vendor, partner and carrier ids are looked up by the row classes, which
// report a missing one themselves; the import does not insist on them.
constexpr std::array kEDIDocument = {
    Settable("ID", SmallInteger),
    Field{"VendorId", Integer},
    Field{"PartnerId", Integer},
    Field{"CarrierId", Integer},
    Field{"OutputFolder", Text},
};
constexpr std::array<std::string_view, 1> kEDIDocumentKeys = {"ID"};

constexpr std::array kManifest = {
    Field{"ManifestId", Integer},    Field{"ManifestNumber", Integer},
    Settable("VendorId", Integer),   Settable("CarrierId", Integer),
    Settable("ManifestDate", Date),
};
constexpr std::array kManifestCollections = {
    Collection{"ConNotes", Derived::Referrers, "ConNote", "ManifestId"}};

constexpr std::array kLog = {
    Field{"LogId", Integer},           Settable("LogDate", Date),
    Settable("UserName", Text),        Settable("ComputerName", Text),
    Settable("Source", Text),          Settable("Procedure", Text),
    Settable("ErrorNumber", Integer),  Settable("Level", Integer),
    Settable("Message", Text),
};

constexpr std::array kTypes = {
    TypeDef{"System", "System", {}, kSystem, {}, {}, {}, {}, true, true},
    TypeDef{"Vendor", "Vendors", "VendorId", kVendor, {}, {}, {}, kVendorKeys},
    TypeDef{"Carrier", "Carriers", "CarrierId", kCarrier, {}, {}, {}, kCarrierKeys},
    TypeDef{"Partner", "Partners", "PartnerId", kPartner, {}, {}, {}, kPartnerKeys},
    TypeDef{"Receiver", "Receivers", "ReceiverId", kReceiver, {}, {}, {}, kReceiverKeys},
    TypeDef{"Product", "Products", "ProductId", kProduct},
    TypeDef{"Carton", "Cartons", "CartonId", kCarton},
    TypeDef{"Customer", "Customers", "CustomerId", kCustomer, kCustomerNested},
    TypeDef{"Despatch", "Despatches", "DespatchId", kDespatch, kDespatchNested},
    TypeDef{"Order", "Orders", "OrderId", kOrder, kOrderNested, {}, {}, kOrderKeys},
    TypeDef{"PSlipLine", "SlipLines", {}, kSlipLine, {}, kSlipLineParents, {}, {}, false},
    TypeDef{"ASN", "ASNs", "ID", kASN},
    TypeDef{"ConNote", "ConNotes", "ConNoteId", kConNote, kConNoteNested, {}, kConNoteCollections},
    TypeDef{"Pack", "Packs", "PackId", kPack, kPackNested, {}, {}, kPackKeys},
    TypeDef{"PackLine", "PackLines", {}, kPackLine, {}, kPackLineParents, {}, {}, false},
    TypeDef{"Job", "Jobs", "JobId", kJob},
    TypeDef{"EDIDocument", "EDIDocuments", "ID", kEDIDocument, {}, {}, {}, kEDIDocumentKeys},
    TypeDef{"Manifest", "Manifests", "ManifestId", kManifest, {}, {}, kManifestCollections, {}, true,
            false, true},
    TypeDef{"Log", "Logs", "LogId", kLog},
};

}  // namespace

std::string_view ValueName(Value value) {
  switch (value) {
    case Text:
      return "a string";
    case Integer:
      return "a 32-bit integer";
    case SmallInteger:
      return "a 16-bit integer";
    case Number:
      return "a number";
    case Flag:
      return "true or false";
    case Date:
      return "a date \"YYYY-MM-DDTHH:MM:SS\"";
    case TextOrNumber:
      return "a number or a string";
  }
  return "a value";
}

std::span<const TypeDef> Types() { return kTypes; }

const TypeDef* FindType(std::string_view type) {
  for (const auto& t : kTypes)
    if (t.type == type) return &t;
  return nullptr;
}

const TypeDef* FindTable(std::string_view table) {
  for (const auto& t : kTypes)
    if (t.table == table) return &t;
  return nullptr;
}

const Field* FindField(const TypeDef& type, std::string_view name) {
  for (const auto& f : type.fields)
    if (f.name == name) return &f;
  return nullptr;
}

std::span<const Field> AddressFields() { return kAddress; }

}  // namespace quendal::mvserver
