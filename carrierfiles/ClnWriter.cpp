#include "carrierfiles/ClnWriter.h"

#include "platform/FileLock.h"

#include <algorithm>
#include <array>
#include <vector>

#include "carrierfiles/ClnRecords.h"
#include "carrierfiles/ConsignmentWriter.h"
#include "frame/VB.h"
#include "frame/host/Read.h"
#include "platform/Clock.h"
#include "platform/CodePage.h"
#include "platform/DirectorySpooler.h"
#include "platform/FileLock.h"

namespace quendal {

using host::First;
using host::Read;

namespace {

constexpr std::string_view kOpenFile = "Open carrier message file";
constexpr std::string_view kProcess = "Process";

// The cube StarTrack reckons for a pack by the number of items in it.
struct CubeRow {
  double fewest;
  double most;
  double cube;  // cubic metres
};
constexpr std::array kCubes = {
    CubeRow{1, 3, 0.005},   CubeRow{4, 6, 0.009},   CubeRow{7, 15, 0.015},
    CubeRow{16, 25, 0.023}, CubeRow{26, 35, 0.027}, CubeRow{36, 50, 0.038},
    // 51 to 60 items take the cube of 36 to 50, so a pack's cube never
    // falls as its item count grows.
    CubeRow{51, 60, 0.038}, CubeRow{61, 80, 0.071},
};
// No items, a negative count or more than 80.
constexpr double kOtherCube = 0.071;

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

// Litres as record "10" carries them: a whole number up to 99999.
std::string Litres(double cubicMetres) {
  return std::to_string(RoundHalfEven(std::min(cubicMetres * 1000, 99999.0)));
}

}  // namespace

double CubeByItemCount(const Var& itemCount) {
  const double items = itemCount.NumberOr(0);
  for (const CubeRow& row : kCubes)
    if (items >= row.fewest && items <= row.most) return row.cube;
  return kOtherCube;
}

std::string ClnWriter::TargetFile(const ClnConsignment& c, const Ref<host::Carrier>& carrier,
                                  const std::string& folder) {
  const std::string ref = Read(carrier, &host::Carrier::AccountRef).Text();
  const std::string number = variant_.nameFromManifest
                                 ? c.manifestNumber.Text()
                                 : Read(c.asn, &host::ASN::ASNNumber).Text();
  // Each host text is made safe on its own, so nothing in it can lead out
  // of the folder or reach into the extension.
  const std::string newName =
      Len(ref) >= 3 ? SafeNamePart(Left(ref, 3)) + SafeNamePart(Format(Var(Right(number, 5)), "00000")) + ".CLN"
                    : SafeNamePart(ref) + SafeNamePart(number) + ".CLN";

  // A consignment dated after today, or on a day that has its folder
  // already, goes to the day's folder.
  if (const auto date = host::DateOf(c.conNote->ConNoteDate())) {
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
  if (variant_.reuseTodaysFile) {
    const std::string today = Format(Var(Today()), "Short Date");
    if (const auto files = ListFiles(folder)) {
      for (const FileEntry& file : *files)
        if (EndsWithCln(file.name) && Format(Var(file.created), "Short Date") == today)
          return folder + file.name;
    }
  }
  return folder + newName;
}

bool ClnWriter::Write(Procedure& proc, const ClnConsignment& c,
                      const std::function<bool()>& written) {
  const Ref<host::ConNote>& objConNote = c.conNote;
  const Ref<host::PackList>& lstPacks = c.packs;
  std::string no;
  Ref<host::Carrier> carrier;
  bool atl = false;
  if (!proc([&] {
        no = objConNote->ConNoteNo().Text();
        carrier = objConNote->Carrier();
        atl = variant_.authorityToLeave &&
              InStr(Read(carrier, &host::Carrier::Options).Text(), "#%ATL") > 0;
      }))
    return false;

  std::string folder;
  if (!proc([&] {
        folder = Read(carrier, &host::Carrier::FileFolder).Text();
        if (IsCarrierFolder(folder)) return true;
        owner_.LogLine(0, kOpenFile, "Invalid folder " + folder);
        return false;
      }))
    return false;

  std::string path;
  if (!proc([&] {
        path = TargetFile(c, carrier, folder);
        owner_.LogLine(0, kProcess, "ConNote " + no + ". Target file selected " + path);
      }))
    return false;

  // From the duplicate check to the append the file is this station's
  // alone: another station can neither add the same consignment in between
  // nor write its records among ours.
  FileLock lock;
  if (!proc([&] {
        if (lock.Acquire(path)) return true;
        owner_.LogLine(err::kPathFileAccess, kOpenFile, "Cannot open file " + folder);
        return false;
      }))
    return false;

  if (!proc([&] {
        if (!index_.Holds(path, NumberKey(no))) return true;
        owner_.LogLine(0, kOpenFile, "Cannot process, connoteno already exists " + no);
        return false;
      }))
    return false;

  if (!proc([&] {
        if (file_.Open(path)) return true;
        owner_.LogLine(err::kPathFileAccess, kOpenFile, "Cannot open file " + folder);
        return false;
      }))
    return false;

  // Weight in whole kilograms (at least 1 when given) and the unit of the first pack.
  std::string weight;
  std::string unit = "CTN";
  if (!proc([&] {
        const Var w = objConNote->Weight();
        const double kilograms = !w.IsNumeric() ? 0 : std::max(w.Number(), 1.0);
        const std::int64_t whole = RoundHalfEven(kilograms);
        weight = whole > 0 ? std::to_string(whole) : std::string(variant_.noWeight);
        unit = "CTN";
        if (variant_.satchelUnit &&
            InStr(UCase(Read(First(lstPacks), &host::Pack::PackType).Text()), "SATCHEL") > 0)
          unit = "SAT";
      }))
    return false;

  // Cubic in litres up to 99999: from the consignment's volume, or from
  // the packs' item counts, whose cubes the host keeps on each pack and
  // their total on the consignment.
  std::string cubic;
  if (!proc([&] {
        if (!variant_.cubeByItemCount) {
          const Var v = objConNote->Volume();
          cubic = Litres(!v.IsNumeric() ? 0 : v.Number());
          return;
        }
        double total = 0;
        if (lstPacks) {
          for (Ref<host::Pack> pack : *lstPacks) {
            pack->SetCubic(Var(CubeByItemCount(pack->ItemCount())));
            pack->Update();
            total += pack->Cubic().NumberOr(0);
          }
        }
        // Sums of cubes such as 0.005 carry binary noise the host need not keep.
        total = Round(total, 6);
        objConNote->SetCubicTotal(Var(total));
        objConNote->SetCubicOverride(Var(0));
        cubic = Litres(total);
      }))
    return false;

  std::string records;
  if (!proc([&] {
        records.clear();
        const auto stamp = file_.Stamp();
        if (stamp && stamp->size == 0) {
          const std::string name = path.substr(path.rfind(kFolderSeparator) + 1);
          const Var date = objConNote->ConNoteDate();
          records += ConsignmentWriter::CarrierLine(record::Render(cln::kHeader, {name, date, date}));
        }
      }))
    return false;

  if (!proc([&] { owner_.LogLine(0, kProcess, "ConNote " + no + " compile Started."); })) return false;

  const std::string header = records;  // a retried step starts again from here
  // The consignment's own records must keep their widths.
  record::FitCheck fit;
  std::int32_t packCount = 0;
  if (!proc([&] { packCount = lstPacks ? lstPacks->Count() : 0; })) return false;
  if (!proc([&] {
        const ReceiverBlock r = Receiver(objConNote);
        const std::string service = objConNote->Service().Text();
        records = header + ConsignmentWriter::CarrierLine(record::Render(
                               cln::kConsignment,
                               {no, r.name, r.line1, r.line2, r.suburb, r.stateCode, r.postcode,
                                Read(carrier, &host::Carrier::AccountNumber), packCount,
                                service.empty() ? std::string("EXP") : service, weight, cubic,
                                unit}));
      }))
    return false;

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
    return false;

  std::vector<std::string> added;  // SSCCs of the item records, logged once they are in the file
  long atlCounter = 0;
  for (std::int32_t i = 1; i <= packCount; ++i) {
    const std::size_t packStart = records.size();
    const std::size_t addedBefore = added.size();
    const long counterBefore = atlCounter;
    if (!proc([&] {
          // A retried pack starts again from where it began.
          records.resize(packStart);
          added.resize(addedBefore);
          atlCounter = counterBefore;
          const Ref<host::Pack> pack = lstPacks->Item(i);
          if (i == 1) {
            const Ref<host::Despatch> despatch =
                Read(First(Read(objConNote, &host::ConNote::Packs)), &host::Pack::Despatch);
            const Var notBefore = Read(despatch, &host::Despatch::NotBefore);
            const Var notAfter = Read(despatch, &host::Despatch::NotAfter);
            records += ConsignmentWriter::CarrierLine(record::Render(
                cln::kDeliveryWindow, {no, notBefore, notAfter,
                                       objConNote->DeliveryInstructions(), notBefore, notAfter}));
            const Var asnNo = Read(c.asn, &host::ASN::ASNNo);
            records += ConsignmentWriter::CarrierLine(
                record::Render(cln::kReference, {no, "S", asnNo, cln::kSendersReference, "Y"}));
            records += ConsignmentWriter::CarrierLine(
                record::Render(cln::kReference, {no, "F", asnNo, cln::kAdvanceShipNotice, "Y"}));
            records += ConsignmentWriter::CarrierLine(record::Render(
                cln::kReference, {no, "B", Read(despatch, &host::Despatch::DespatchNo),
                                  cln::kCustomerOrder, "Y"}));
            if (!dg.dgClass.empty())
              records += ConsignmentWriter::CarrierLine(record::Render(
                  cln::kDangerousGoods, {no, dg.dgClass, dg.name, dg.cartons, RoundHalfEven(dg.weight)}));
          }
          if (atl) {
            ++atlCounter;
            const std::string value = "C" + Format(Var(atlCounter), "000000000") + Spaces(10);
            records += ConsignmentWriter::CarrierLine(
                record::Render(cln::kReference, {no, "E", value, cln::kAuthorityToLeave, "N"}));
          }
          // Only a pack of another notice is skipped: a pack whose notice is not
          // known (Null) is still a carton the carrier must be told of.
          const Var packAsn = Read(pack, &host::Pack::ASNId);
          const Var asnId = Read(c.asn, &host::ASN::ID);
          if (!packAsn.IsNull() && !asnId.IsNull() && !host::SameValue(packAsn, asnId)) return;
          const std::string code = Read(Read(pack, &host::Pack::Carton), &host::Carton::Code).Text();
          const std::string tail = pallets > 0 && cartons > 0 ? "S "
                                   : InStr(code, "PLT") > 0  ? "B PAL"
                                                             : "S " + unit;
          const std::string sscc = Read(pack, &host::Pack::SSCC).Text();
          records += ConsignmentWriter::CarrierLine(record::Render(cln::kItem, {no, sscc, tail}));
          added.push_back(sscc);
        }))
      return false;
  }

  if (!proc([&] {
        if (fit.Fits()) return true;
        owner_.LogLine(0, kOpenFile, fit.Refusal(no));
        return false;
      }))
    return false;
  // The consignment goes into the file in one write, so the file never holds part of it.
  if (!proc([&] {
        const auto before = file_.Stamp();
        if (!file_.Append(records)) throw Error(err::kDeviceIO);
        index_.Appended(path, records, before, file_.Stamp());
        file_.Close();
        lock.Release();
      }))
    return false;
  // The consignment is whole in the file; only now may the caller mark it
  // done (a manifest run stamps it), so a consignment is never marked for
  // records that are not there.
  if (written && !written()) return false;
  const bool done = true;

  for (const std::string& sscc : added) {
    if (!proc([&] { owner_.LogLine(0, kProcess, "SSCC " + sscc + " added to CLN for ConNote " + no); }))
      return done;
  }

  if (!dg.dgClass.empty()) {
    for (int copy = 0; copy < 2; ++copy) {
      if (!proc([&] {
            if (!owner_.DangerouseGoodsDeclaration(objConNote))
              owner_.LogLine(0, kProcess, "Error printing dangerous goods declaration, sales order " + no);
          }))
        return done;
    }
  }

  if (!proc([&] { owner_.LogLine(0, kProcess, "ConNote " + no + " compile completed."); })) return done;
  proc([&] { file_.Close(); });
  return done;
}

}  // namespace quendal
