#include "carrierfiles/cStarTrackDAcln.h"

#include <algorithm>
#include <vector>

#include "carrierfiles/ClnRecords.h"
#include "frame/VB.h"
#include "frame/host/Read.h"
#include "manifests/DangerousGoodsDeclaration.h"
#include "platform/Clock.h"
#include "platform/CodePage.h"
#include "platform/DirectorySpooler.h"

namespace quendal {

using host::First;
using host::Read;

namespace {

constexpr std::string_view kOpenFile = "Open carrier message file";
constexpr std::string_view kProcess = "Process";

// Name, address lines, suburb, state code and postcode of record "10".
struct ReceiverBlock {
  std::string name;
  std::string line1;
  std::string line2;
  std::string suburb;
  std::string stateCode;
  std::string postcode;
};

// The receiver comes from the first pack's delivery address when that has a
// name, else from the consignment's receiver.
ReceiverBlock Receiver(const Ref<host::ConNote>& conNote) {
  const Ref<host::Pack> firstPack = First(Read(conNote, &host::ConNote::Packs));
  const Ref<host::Address> a =
      Read(Read(firstPack, &host::Pack::Order), &host::Order::DeliveryAddress);
  const Ref<host::Despatch> despatch = Read(firstPack, &host::Pack::Despatch);
  const Ref<host::Receiver> r = Read(conNote, &host::ConNote::Receiver);

  const std::string aName = Read(a, &host::Address::Name).Text();
  const std::string rName = Read(r, &host::Receiver::Name).Text();
  const std::string rLine1 = Read(r, &host::Receiver::AddressLine1).Text();
  const std::string rLine2 = Read(r, &host::Receiver::AddressLine2).Text();
  const bool deliveryTexts = !Trim(Read(despatch, &host::Despatch::DeliveryText1).Text()).empty() ||
                             !Trim(Read(despatch, &host::Despatch::DeliveryText2).Text()).empty() ||
                             !Trim(Read(despatch, &host::Despatch::DeliveryText3).Text()).empty();

  ReceiverBlock block;
  if (aName.empty() && deliveryTexts) {
    // The receiver's first line goes before its name and again as the first line.
    block.name = rName.empty() ? std::string() : rLine1 + " " + rName;
    block.line1 = rLine1;
    block.line2 = rLine2;
    block.suburb = Read(r, &host::Receiver::Suburb).Text();
  } else if (!aName.empty()) {
    block.name = aName;
    const std::string line1 = Read(a, &host::Address::Line1).Text();
    const std::string line2 = Read(a, &host::Address::Line2).Text();
    block.line1 = line1.empty() ? line2 : line1;
    block.line2 = line1.empty() ? std::string() : line2;
    block.suburb = Read(a, &host::Address::Suburb).Text();
  } else {
    // At most 40 characters of the name and a space, within the 40 of the field.
    block.name = rName.empty() ? std::string() : Left(Left(rName, 40) + " ", 40);
    block.line1 = rLine1.empty() ? rLine2 : rLine1;
    block.line2 = rLine1.empty() ? std::string() : rLine2;
    block.suburb = Read(r, &host::Receiver::Suburb).Text();
  }
  // The name field holds 40 characters whichever source fills it; a longer
  // name would shift every later field of the record.
  block.name = Left(block.name, 40);
  const std::string aState = Read(a, &host::Address::State).Text();
  if (!aState.empty()) {
    block.stateCode = cln::StateCodeOf(Trim(aState));
    block.postcode = Read(a, &host::Address::Postcode).Text();
  } else {
    block.stateCode = cln::StateCodeOf(Trim(Read(r, &host::Receiver::State).Text()));
    block.postcode = Read(r, &host::Receiver::Postcode).Text();
  }
  return block;
}

// Dangerous goods over the packs: the last dangerous line's class, the
// carried name of the last class that has one, the packs holding
// dangerous lines (counted when the SSCC changes) and their net weight.
struct DangerousGoods {
  std::string dgClass;
  std::string name;
  long cartons = 0;
  double weight = 0;
};

DangerousGoods ScanDangerousGoods(const Ref<host::PackList>& packs) {
  DangerousGoods dg;
  if (!packs) return dg;
  std::string previousSscc;
  for (Ref<host::Pack> pack : *packs) {
    const Ref<host::PackLines> lines = Read(pack, &host::Pack::Lines);
    if (!lines) continue;
    for (Ref<host::PackLine> line : *lines) {
      const Ref<host::Product> product = Read(line, &host::PackLine::Product);
      if (!host::IsTrue(Read(product, &host::Product::IsDangerous))) continue;
      dg.dgClass = Read(product, &host::Product::DGClass).Text();
      const std::string sscc = Read(pack, &host::Pack::SSCC).Text();
      if (sscc != previousSscc) ++dg.cartons;
      previousSscc = sscc;
      dg.weight += Read(product, &host::Product::UnitWeight).NumberOr(0) *
                   Read(line, &host::PackLine::Qty).NumberOr(0);
      if (const std::string_view name = cln::DangerousGoodsNameOf(dg.dgClass); !name.empty())
        dg.name = std::string(name);
    }
  }
  return dg;
}

bool EndsWithCln(const std::string& name) { return UCase(Right(name, 4)) == ".CLN"; }

// "10" + the consignment number as the item records carry it: the duplicate mark.
std::string NumberKey(const std::string& conNoteNo) {
  return ToCodePage(record::Fill(record::TextLeft(20), Var(conNoteNo)));
}

}  // namespace

clsStarTrackDAcln::clsStarTrackDAcln() : ConsignmentWriter("clsStarTrackDAcln") {}

bool clsStarTrackDAcln::DGDeclaration() { return false; }

bool clsStarTrackDAcln::DangerouseGoodsDeclaration(const Ref<host::ConNote>& aConnote) {
  return PrintDangerousGoodsDeclaration(DeclarationForm::StarTrack, system_, aConnote,
                                        ModuleName());
}

std::string clsStarTrackDAcln::TargetFile(const Ref<host::ConNote>& conNote,
                                          const Ref<host::ASN>& asn,
                                          const Ref<host::Carrier>& carrier,
                                          const std::string& folder) {
  const std::string ref = Read(carrier, &host::Carrier::AccountRef).Text();
  const std::string number = Read(asn, &host::ASN::ASNNumber).Text();
  // Each host text is made safe on its own, so nothing in it can lead out
  // of the folder or reach into the extension.
  const std::string newName =
      Len(ref) >= 3 ? SafeNamePart(Left(ref, 3)) + SafeNamePart(Format(Var(Right(number, 5)), "00000")) + ".CLN"
                    : SafeNamePart(ref) + SafeNamePart(number) + ".CLN";

  // A consignment dated after today, or on a day that has its folder
  // already, goes to the day's folder.
  if (const auto date = host::DateOf(conNote->ConNoteDate())) {
    const std::string dated = folder + Format(Var(*date), "YYYY-MM-DD");
    const bool later = Format(Var(*date), "YYYYMMDD") > Format(Var(Today()), "YYYYMMDD");
    if (later || FolderExists(dated)) {
      if (FolderExists(dated)) {
        if (const auto files = ListFiles(dated)) {
          for (const FileEntry& file : *files)
            if (EndsWithCln(file.name)) return dated + kFolderSeparator + file.name;
        }
      } else {
        CreateFolder(dated);
      }
      return dated + kFolderSeparator + newName;
    }
  }
  // In the main folder, the file created today.
  const std::string today = Format(Var(Today()), "Short Date");
  if (const auto files = ListFiles(folder)) {
    for (const FileEntry& file : *files)
      if (EndsWithCln(file.name) && Format(Var(file.created), "Short Date") == today)
        return folder + file.name;
  }
  return folder + newName;
}

void clsStarTrackDAcln::Compile(const Ref<host::ConNote>& objConNote, const Ref<host::ASN>& objASN,
                                const Ref<host::PackList>& lstPacks) {
  Procedure proc = Guard("Sub Process");
  std::string no;
  if (!proc([&] {
        no = objConNote->ConNoteNo().Text();
        LogLine(0, kProcess, "ConNote " + no + ". ActiveX called " + ClassName());
      }))
    return;

  Ref<host::Carrier> carrier;
  bool atl = false;
  if (!proc([&] {
        carrier = objConNote->Carrier();
        atl = InStr(Read(carrier, &host::Carrier::Options).Text(), "#%ATL") > 0;
      }))
    return;

  std::string folder;
  if (!proc([&] {
        folder = Read(carrier, &host::Carrier::FileFolder).Text();
        return CheckFolder(folder);
      }))
    return;

  std::string path;
  if (!proc([&] {
        path = TargetFile(objConNote, objASN, carrier, folder);
        LogLine(0, kProcess, "ConNote " + no + ". Target file selected " + path);
      }))
    return;

  if (!proc([&] {
        if (!index_.Holds(path, NumberKey(no))) return true;
        LogLine(0, kOpenFile, "Cannot process, connoteno already exists " + no);
        return false;
      }))
    return;

  if (!proc([&] {
        if (File().Open(path)) return true;
        LogLine(err::kPathFileAccess, kOpenFile, "Cannot open file " + folder);
        return false;
      }))
    return;

  // Weight in whole kilograms (at least 1 when given), cubic in litres up
  // to 99999, and the unit of the first pack.
  std::string weight;
  std::string cubic;
  std::string unit = "CTN";
  const Ref<host::Pack> firstListed = First(lstPacks);
  if (!proc([&] {
        const Var w = objConNote->Weight();
        const double kilograms = !w.IsNumeric() ? 0 : std::max(w.Number(), 1.0);
        const std::int64_t whole = RoundHalfEven(kilograms);
        weight = whole > 0 ? std::to_string(whole) : std::string();
        const Var v = objConNote->Volume();
        cubic = std::to_string(RoundHalfEven(!v.IsNumeric() ? 0 : std::min(v.Number() * 1000, 99999.0)));
        if (InStr(UCase(Read(firstListed, &host::Pack::PackType).Text()), "SATCHEL") > 0) unit = "SAT";
      }))
    return;

  std::string records;
  if (!proc([&] {
        const auto stamp = File().Stamp();
        if (stamp && stamp->size == 0) {
          const std::string name = path.substr(path.rfind(kFolderSeparator) + 1);
          const Var date = objConNote->ConNoteDate();
          records += CarrierLine(record::Render(cln::kHeader, {name, date, date}));
        }
      }))
    return;

  if (!proc([&] { LogLine(0, kProcess, "ConNote " + no + " compile Started."); })) return;

  const std::int32_t packCount = lstPacks ? lstPacks->Count() : 0;
  if (!proc([&] {
        const ReceiverBlock r = Receiver(objConNote);
        const std::string service = objConNote->Service().Text();
        records += CarrierLine(record::Render(
            cln::kConsignment,
            {no, r.name, r.line1, r.line2, r.suburb, r.stateCode, r.postcode,
             Read(carrier, &host::Carrier::AccountNumber), packCount,
             service.empty() ? std::string("EXP") : service, weight, cubic, unit}));
      }))
    return;

  DangerousGoods dg;
  long pallets = 0;
  long cartons = 0;
  if (!proc([&] {
        dg = ScanDangerousGoods(lstPacks);
        pallets = cartons = 0;
        for (std::int32_t i = 1; i <= packCount; ++i) {
          const Ref<host::Carton> carton = Read(lstPacks->Item(i), &host::Pack::Carton);
          if (Read(carton, &host::Carton::Code).Text() == "PLT01")
            ++pallets;
          else
            ++cartons;
        }
      }))
    return;

  std::vector<std::string> added;  // SSCCs of the item records, logged once they are in the file
  long atlCounter = 0;
  for (std::int32_t i = 1; i <= packCount; ++i) {
    if (!proc([&] {
          const Ref<host::Pack> pack = lstPacks->Item(i);
          if (i == 1) {
            const Ref<host::Despatch> despatch =
                Read(First(Read(objConNote, &host::ConNote::Packs)), &host::Pack::Despatch);
            const Var notBefore = Read(despatch, &host::Despatch::NotBefore);
            const Var notAfter = Read(despatch, &host::Despatch::NotAfter);
            records += CarrierLine(record::Render(
                cln::kDeliveryWindow, {no, notBefore, notAfter,
                                       objConNote->DeliveryInstructions(), notBefore, notAfter}));
            const Var asnNo = Read(objASN, &host::ASN::ASNNo);
            records += CarrierLine(
                record::Render(cln::kReference, {no, "S", asnNo, cln::kSendersReference, "Y"}));
            records += CarrierLine(
                record::Render(cln::kReference, {no, "F", asnNo, cln::kAdvanceShipNotice, "Y"}));
            records += CarrierLine(record::Render(
                cln::kReference, {no, "B", Read(despatch, &host::Despatch::DespatchNo),
                                  cln::kCustomerOrder, "Y"}));
            if (!dg.dgClass.empty())
              records += CarrierLine(record::Render(
                  cln::kDangerousGoods, {no, dg.dgClass, dg.name, dg.cartons, RoundHalfEven(dg.weight)}));
          }
          if (atl) {
            ++atlCounter;
            const std::string value = "C" + Format(Var(atlCounter), "000000000") + Spaces(10);
            records += CarrierLine(
                record::Render(cln::kReference, {no, "E", value, cln::kAuthorityToLeave, "N"}));
          }
          // Only a pack of another notice is skipped: a pack whose notice is not
          // known (Null) is still a carton the carrier must be told of.
          const Var packAsn = Read(pack, &host::Pack::ASNId);
          const Var asnId = Read(objASN, &host::ASN::ID);
          if (!packAsn.IsNull() && !asnId.IsNull() && !host::SameValue(packAsn, asnId)) return;
          const std::string code = Read(Read(pack, &host::Pack::Carton), &host::Carton::Code).Text();
          const std::string tail = pallets > 0 && cartons > 0 ? "S "
                                   : InStr(code, "PLT") > 0  ? "B PAL"
                                                             : "S " + unit;
          const std::string sscc = Read(pack, &host::Pack::SSCC).Text();
          records += CarrierLine(record::Render(cln::kItem, {no, sscc, tail}));
          added.push_back(sscc);
        }))
      return;
  }

  // The consignment goes into the file in one write, so the file never holds part of it.
  if (!proc([&] {
        const auto before = File().Stamp();
        if (!File().Append(records)) throw Error(err::kDeviceIO);
        index_.Appended(path, records, before, File().Stamp());
      }))
    return;
  for (const std::string& sscc : added) {
    if (!proc([&] { LogLine(0, kProcess, "SSCC " + sscc + " added to CLN for ConNote " + no); }))
      return;
  }

  if (!dg.dgClass.empty()) {
    for (int copy = 0; copy < 2; ++copy) {
      if (!proc([&] {
            if (!DangerouseGoodsDeclaration(objConNote))
              LogLine(0, kProcess, "Error printing dangerous goods declaration, sales order " + no);
          }))
        return;
    }
  }

  if (!proc([&] { LogLine(0, kProcess, "ConNote " + no + " compile completed."); })) return;
  proc([&] { CloseOpenFile(); });
}

std::unique_ptr<Component> MakeStarTrackDAcln() { return std::make_unique<clsStarTrackDAcln>(); }

}  // namespace quendal
