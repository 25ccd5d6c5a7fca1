#include "carrierfiles/cVicExpressDAcln.h"

#include <array>

#include "carrierfiles/ClnRecords.h"
#include "frame/VB.h"
#include "frame/host/Read.h"
#include "platform/Clock.h"
#include "platform/FileLock.h"
#include "platform/FileSystem.h"

namespace quendal {

using host::First;
using host::Read;

namespace {

using namespace record;

// Header "00N" as StarTrack's, but stamped with the time the file was
// started and of batch type "O".
constexpr std::array kHeader = {
    Literal("00N"),         TextLeft(12),  // the file's name as the carrier knows it
    Date("YYYYMMDDHHMMSS"), Literal("O"), Spaces(20),
    Date("YYYYMMDDHHMMSS"), Literal("Y"), Spaces(71),
};
static_assert(Width(kHeader) == Width(cln::kHeader));

// Consignment "10" as StarTrack's up to the weight; then the depot "VIC"
// where StarTrack has the cubic, and the unit.
constexpr std::array kConsignment = {
    Literal("10"), TextLeft(20),  // consignment number
    Spaces(8),
    CutLeft(40),  // receiver name
    Spaces(40),
    TextLeft(40),  // first address line
    TextLeft(40),  // second address line
    TextLeft(30),  // suburb
    TextLeft(1),   // state code
    TextRight(4),  // postcode
    Spaces(17),    Literal("N"),
    TextRight(8),  // account number
    Literal("S"),
    TextRight(4),  // number of packs
    TextRight(3),  // service
    TextRight(5),  // weight, whole kilograms
    Spaces(5),     Literal("VIC"), Spaces(1), Literal("N"), Spaces(4),
    TextLeft(3),  // unit: "PAL" or "CTN"
};
static_assert(Width(kConsignment) == Width(cln::kConsignment));

bool EndsWithCtn(const std::string& name) { return UCase(Right(name, 4)) == ".CTN"; }

}  // namespace

clsVicExpressDAcln::clsVicExpressDAcln() : ConsignmentWriter("clsVicExpressDAcln") {}

void clsVicExpressDAcln::Compile(const Ref<host::ConNote>& objConNote, const Ref<host::ASN>& objASN,
                                 const Ref<host::PackList>& lstPacks) {
  Procedure proc = Guard("Sub Process");
  std::string no;
  Ref<host::Carrier> carrier;
  std::string folder;
  if (!proc([&] {
        no = objConNote->ConNoteNo().Text();
        carrier = objConNote->Carrier();
        folder = Read(carrier, &host::Carrier::FileFolder).Text();
        return HasFolder(folder);
      }))
    return;

  // The day's file is the ".CTN" file created today; a new one is named
  // after the time it is started, and its header carries the name the
  // carrier knows it by: account reference, notice number, ".CLN".
  std::string path;
  std::string logicalName;
  if (!proc([&] {
        const std::string today = Format(Var(Today()), "Short Date");
        if (const auto files = ListFiles(folder)) {
          for (const FileEntry& file : *files) {
            if (EndsWithCtn(file.name) && Format(Var(file.created), "Short Date") == today) {
              path = folder + file.name;
              logicalName = file.name;
              return;
            }
          }
        }
        path = folder + "CARTON" + Format(Var(Now()), "YYYYMMDDHHMM") + ".CTN";
        logicalName = Read(carrier, &host::Carrier::AccountRef).Text() +
                      record::Fill(Zero(5), Read(objASN, &host::ASN::ASNNumber)) + ".CLN";
      }))
    return;

  // Until the consignment is in, the file is this station's alone, so the
  // header goes into an empty file once and no other records come between ours.
  FileLock lock;
  if (!proc([&] {
        if (lock.Acquire(path) && File().Open(path)) return true;
        LogLine(err::kPathFileAccess, "Open carrier message file", "Cannot open file " + folder);
        return false;
      }))
    return;

  std::string weight;
  if (!proc([&] {
        const std::int64_t whole = RoundHalfEven(TotalShipmentWeight(lstPacks));
        weight = whole > 0 ? std::to_string(whole) : "1";
      }))
    return;

  std::string records;
  if (!proc([&] {
        const auto stamp = File().Stamp();
        if (stamp && stamp->size == 0) {
          const DateTime now = Now();
          records = CarrierLine(record::Render(kHeader, {logicalName, now, now}));
        }
      }))
    return;

  // The consignment's own records must keep their widths; the header's
  // logical name is written whole by design.
  record::FitCheck fit;
  // The consignment record goes with the first pack, so a consignment
  // without packs writes nothing of its own.
  std::int32_t packCount = 0;
  if (!proc([&] { packCount = lstPacks ? lstPacks->Count() : 0; })) return;
  for (std::int32_t i = 1; i <= packCount; ++i) {
    if (!proc([&] {
          const Ref<host::Pack> pack = lstPacks->Item(i);
          std::string lines;  // added once the step is through, so a retried step adds them once
          if (i == 1) {
            const Ref<host::Receiver> r = objConNote->Receiver();
            const std::string code =
                Read(Read(pack, &host::Pack::Carton), &host::Carton::Code).Text();
            lines += CarrierLine(record::Render(
                kConsignment,
                {no, Read(r, &host::Receiver::Name), Read(r, &host::Receiver::AddressLine1),
                 Read(r, &host::Receiver::AddressLine2), Read(r, &host::Receiver::Suburb),
                 cln::StateCodeOf(Trim(Read(r, &host::Receiver::State).Text())),
                 Left(Read(r, &host::Receiver::Postcode).Text(), 4),
                 Read(carrier, &host::Carrier::AccountNumber), packCount, objConNote->Service(),
                 weight, InStr(code, "PLT") > 0 ? "PAL" : "CTN"}));
            lines += CarrierLine(record::Render(
                cln::kReference,
                {no, "S", Read(objASN, &host::ASN::ASNNo), cln::kAdvanceShipNotice, "Y"}));
            lines += CarrierLine(record::Render(
                cln::kReference,
                {no, "S", Read(Read(pack, &host::Pack::Despatch), &host::Despatch::DespatchNo),
                 cln::kCustomerOrder, "Y"}));
          }
          // Only a pack of another notice has no item record: a pack whose
          // notice is not known is still a carton the carrier must be told of.
          const Var packAsn = Read(pack, &host::Pack::ASNId);
          const Var asnId = Read(objASN, &host::ASN::ID);
          if (packAsn.IsNull() || asnId.IsNull() || host::SameValue(packAsn, asnId))
            lines +=
                CarrierLine(record::Render(cln::kItem, {no, Read(pack, &host::Pack::SSCC), "S "}));
          records += lines;
        }))
      return;
  }

  if (!proc([&] {
        if (fit.Fits()) return true;
        LogLine(0, "Open carrier message file", fit.Refusal(no));
        return false;
      }))
    return;
  // The consignment goes into the file in one write, so the file never holds part of it.
  if (!proc([&] {
        if (!File().Append(records)) throw Error(err::kDeviceIO);
      }))
    return;
  proc([&] { CloseOpenFile(); });
}

std::unique_ptr<Component> MakeVicExpressDAcln() { return std::make_unique<clsVicExpressDAcln>(); }

}  // namespace quendal
