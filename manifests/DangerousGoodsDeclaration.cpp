#include "manifests/DangerousGoodsDeclaration.h"

#include <algorithm>
#include <array>
#include <string>
#include <vector>

#include "frame/FailSafe.h"
#include "frame/VB.h"
#include "frame/host/Read.h"
#include "platform/Clock.h"
#include "platform/PrintDocument.h"

namespace quendal {

using host::First;
using host::Read;

namespace {

constexpr std::string_view kTitle = "DANGEROUS GOODS SHIPPING/TRANSPORT DOCUMENT";
constexpr std::string_view kFont = "Arial";
constexpr double kPoints = 10;
constexpr Colour kShade = 0xE0E0E0;

constexpr std::array kNotes = {
    std::string_view("NOTE:"),
    std::string_view("1. A seperate shipping/transport document must be used for each consignment "
                     "containing dangerouse goods."),
    std::string_view("2. Information must be in English, easy to identify, legible and durable."),
    std::string_view("3. The classes of dangerous goods listed below must be compatibility "
                     "packed/packaged according to Australian Dangerous Goods Code."),
};

constexpr std::string_view kCertification =
    "This is to certify that abovenamed Dangerous Goods are properly classified, described, "
    "packaged, marked, labelled, and are in the proper condition for transport according to the "
    "provisions of the Australian Code for the Transport of Dangerous Goods by Road and Rail (the "
    "ADG Code).";

// What StarTrack's document says of each class it carries.
struct StarTrackGoods {
  std::string_view dgClass;
  std::string_view technicalName;
  std::string_view tradeName;
};
constexpr std::array kStarTrackGoods = {
    StarTrackGoods{"2.1", "FLAMMABLE GASES", "Aerosol, Body Spray or Shaving Cream"},
    StarTrackGoods{"3.1", "FLAMMABLE LIQUID", "Nail Polish Remover/Polish, or Perfumery"},
    StarTrackGoods{"5.1", "OXIDIZING AGENT", "Hair Peroxide/Bleach or Powdered Bleach"},
};

// What DFE's document says of each class it carries.
struct DFEGoods {
  std::string_view dgClass;
  std::string_view className;
  std::string_view technicalName;
  std::string_view tradeName;
  std::string_view packingGroup;
  std::string_view unNumber;
};
constexpr std::array kDFEGoods = {
    DFEGoods{"2.1", "FLAMMABLE GAS", "CONSUMER AEROSOLS", "COLOUR HAIRSPAY", "2", "UN1950"},
    DFEGoods{"3.1", "FLAMMABLE LIQUID", "PERFUMERY PRODUCTS", "PERFUME", "2", "UN1266"},
    DFEGoods{"5.1", "OXIDIZING AGENT", "PERSULFATES", "BLEACH", "3", "UN2984 UN1479"},
};

// The goods rows of one document.
struct Goods {
  std::string unNumber;
  std::string technicalName;
  std::string tradeName;
  std::string classDivision;
  std::string subsidiaryRisk;
  std::string packingGroup;
  std::string packages;
  std::string netWeight;
};

// Sender and receiver columns, the carrier, consignment and order.
struct Parties {
  std::vector<TableRow> rows;
  std::string carrier;
  std::string conNoteNo;
  std::string orderNo;
  std::string vendorName;
};

Parties ReadParties(const Ref<host::ConNote>& conNote) {
  Parties p;
  const Ref<host::Vendor> v = conNote->Vendor();
  Ref<host::Order> order = First(conNote->Orders());
  if (!order) order = Read(First(conNote->Packs()), &host::Pack::Order);
  const Ref<host::Address> a = Read(order, &host::Order::DeliveryAddress);
  auto text = [](const Var& value) { return value.Text(); };
  // A delivery to a store or distribution centre has no named delivery
  // address: the consignee is then the consignment's receiver.
  std::string name = text(Read(a, &host::Address::Name));
  std::string line1, line2, suburb, state, postcode;
  if (!name.empty()) {
    line1 = text(Read(a, &host::Address::Line1));
    line2 = text(Read(a, &host::Address::Line2));
    suburb = text(Read(a, &host::Address::Suburb));
    state = text(Read(a, &host::Address::State));
    postcode = text(Read(a, &host::Address::Postcode));
  } else {
    const Ref<host::Receiver> r = conNote->Receiver();
    name = text(Read(r, &host::Receiver::Name));
    line1 = text(Read(r, &host::Receiver::AddressLine1));
    line2 = text(Read(r, &host::Receiver::AddressLine2));
    suburb = text(Read(r, &host::Receiver::Suburb));
    state = text(Read(r, &host::Receiver::State));
    postcode = text(Read(r, &host::Receiver::Postcode));
  }
  p.rows = {
      {text(Read(v, &host::Vendor::Name)), name},
      {text(Read(v, &host::Vendor::AddressLine1)), line1},
      {text(Read(v, &host::Vendor::AddressLine2)), line2},
      {text(Read(v, &host::Vendor::AddressLine3)), suburb},
      {text(Read(v, &host::Vendor::State)) + "  " + text(Read(v, &host::Vendor::Postcode)),
       state + "  " + postcode},
  };
  p.carrier = text(Read(conNote->Carrier(), &host::Carrier::Name));
  p.conNoteNo = conNote->ConNoteNo().Text();
  p.orderNo = text(Read(order, &host::Order::OrderNo));
  p.vendorName = text(Read(v, &host::Vendor::Name));
  return p;
}

// A dangerous line of a pack: its pack, class and net weight.
struct DangerousLine {
  std::string sscc;
  std::string dgClass;
  double weight = 0;
};

std::vector<DangerousLine> DangerousLines(const Ref<host::ConNote>& conNote) {
  std::vector<DangerousLine> lines;
  for (Ref<host::Pack> pack : *conNote->Packs()) {
    const Ref<host::PackLines> packLines = Read(pack, &host::Pack::Lines);
    if (!packLines) continue;
    for (Ref<host::PackLine> line : *packLines) {
      const Ref<host::Product> product = Read(line, &host::PackLine::Product);
      if (!host::IsTrue(Read(product, &host::Product::IsDangerous))) continue;
      lines.push_back({Read(pack, &host::Pack::SSCC).Text(),
                       Read(product, &host::Product::DGClass).Text(),
                       Read(product, &host::Product::UnitWeight).NumberOr(0) *
                           Read(line, &host::PackLine::Qty).NumberOr(0)});
    }
  }
  return lines;
}

// One document; false when it could not be printed.
bool PrintDocumentOf(const std::string& printer, const Parties& parties, const Goods& goods,
                     const std::string& senderLine) {
  std::unique_ptr<PrintDocument> doc = NewPrintDocument();
  doc->SetPrinter(printer);
  doc->BeginDoc(std::string(kTitle));
  doc->SetFontSize(kPoints);
  const std::string font(kFont);
  auto paragraph = [&](std::string_view text) { doc->Paragraph(std::string(text), font, kPoints); };

  // The parties, in white boxes side by side.
  doc->Rectangle(700, 1500, 4500, 3800, kWhite);
  doc->Rectangle(4500, 1500, 10800, 3800, kWhite);
  doc->AddTable("<+4000|<+6000", {"SENDER:", "RECEIVER"}, parties.rows, kShade);

  paragraph("");
  paragraph("");
  for (std::string_view note : kNotes) paragraph(note);
  paragraph("");

  const std::array<TableRow, 12> rows = {{
      {"CARRIER:", parties.carrier},
      {"CONNOTENO", parties.conNoteNo},
      {"Order", parties.orderNo},
      {"UN Number", goods.unNumber},
      {"Technical/Proper Shipping Name", goods.technicalName},
      {"Trade/Common Name", goods.tradeName},
      {"DG Class/Division", goods.classDivision},
      {"DG Subsidary Risk (if any)", goods.subsidiaryRisk},
      {"Packing Group Designator (if any)", goods.packingGroup},
      {"Type of outer packaging", "Carton"},
      {"Number of outer packages of each type", goods.packages},
      {"Aggregate of each DG (Net Weight) kg", goods.netWeight},
  }};
  // Each row stands inside two white boxes, one round its label cell and
  // one round its value cell, with a margin above and below the row.
  constexpr double kMargin = 100;
  constexpr double kBoxHeight = 550;
  constexpr double kCellWidth = 5000;
  for (const TableRow& row : rows) {
    const double x = doc->CurrentX();
    const double top = doc->CurrentY();
    doc->Rectangle(x, top, x + kCellWidth, top + kBoxHeight, kWhite);
    doc->Rectangle(x + kCellWidth, top, x + 2 * kCellWidth, top + kBoxHeight, kWhite);
    doc->SetCurrentY(top + kMargin);
    doc->AddTable("<+5000|<+5000", row, {}, kShade);
    doc->SetCurrentY(std::max(doc->CurrentY() + kMargin, top + kBoxHeight));
  }

  paragraph("");
  paragraph("");
  paragraph(kCertification);
  paragraph("");
  paragraph(senderLine);
  paragraph("SENDERS SIGNATURE   ___________________________________ DATE:   " +
            Format(Var(Today()), "Short Date") + "\n");
  return doc->EndDoc();
}

}  // namespace

bool PrintDangerousGoodsDeclaration(DeclarationForm form, const Ref<host::System>& system,
                                    const Ref<host::ConNote>& aConnote, std::string_view module) {
  bool result = false;
  Procedure proc(module, "Function DangerouseGoodsDeclaration");
  std::string printer;
  Parties parties;
  std::vector<DangerousLine> lines;
  if (!proc([&] {
        printer = system->DocumentPrinter().Text();
        parties = ReadParties(aConnote);
        lines = DangerousLines(aConnote);
      }))
    return result;

  if (form == DeclarationForm::DFE) {
    // One document: every dangerous line counts; the last line's class names the goods.
    Goods goods;
    goods.subsidiaryRisk = "NONE";
    double weight = 0;
    std::string lastClass;
    std::string className;
    for (const DangerousLine& line : lines) {
      weight += line.weight;
      lastClass = line.dgClass;
      for (const DFEGoods& row : kDFEGoods) {
        if (row.dgClass != line.dgClass) continue;
        className = row.className;
        goods.unNumber = row.unNumber;
        goods.technicalName = row.technicalName;
        goods.tradeName = row.tradeName;
        goods.packingGroup = row.packingGroup;
      }
    }
    goods.classDivision = lastClass + " " + className;
    goods.packages = std::to_string(lines.size());
    goods.netWeight = NumberText(weight);
    proc([&] { result = PrintDocumentOf(printer, parties, goods, "SENDERS NAME: " + parties.vendorName); });
    return result;
  }

  // StarTrack: one document per pack and class, for that pack's lines of the class.
  std::vector<DangerousLine> documents;
  for (const DangerousLine& line : lines) {
    auto same = [&](const DangerousLine& d) { return d.sscc == line.sscc && d.dgClass == line.dgClass; };
    if (auto it = std::find_if(documents.begin(), documents.end(), same); it != documents.end())
      it->weight += line.weight;
    else
      documents.push_back(line);
  }
  std::string technicalName;
  std::string tradeName;
  for (const DangerousLine& document : documents) {
    for (const StarTrackGoods& row : kStarTrackGoods) {
      if (row.dgClass != document.dgClass) continue;
      technicalName = row.technicalName;
      tradeName = row.tradeName;
    }
    Goods goods;
    goods.technicalName = technicalName;
    goods.tradeName = tradeName;
    goods.classDivision = document.dgClass + " " + technicalName;
    goods.packages = "1";
    goods.netWeight = NumberText(document.weight);
    bool printed = false;
    if (!proc([&] {
          printed = PrintDocumentOf(printer, parties, goods,
                                    "SENDERS NAME: _________________________________________");
        }))
      return result;
    if (!printed) return result;
  }
  result = true;
  return result;
}

}  // namespace quendal
