#include "carrierfiles/MapCsvWriter.h"

#include <optional>

#include "carrierfiles/CsvMap.h"
#include "frame/VB.h"
#include "frame/host/Read.h"
#include "platform/Clock.h"
#include "platform/DirectorySpooler.h"
#include "platform/FileLock.h"

namespace quendal {

using host::Read;

namespace {

constexpr std::string_view kOpenFile = "Open carrier message file";
constexpr std::string_view kOpenMap = "OpenMapFile";
constexpr std::string_view kWeightMask = "####0.0#";

}  // namespace

Var CsvPack::Of(Var (host::ConNote::*member)()) const { return Read(conNote, member); }
Var CsvPack::Of(Var (host::ASN::*member)()) const { return Read(asn, member); }
Var CsvPack::Of(Var (host::Pack::*member)()) const { return Read(pack, member); }
Var CsvPack::Of(Var (host::Receiver::*member)()) const {
  return Read(Read(pack, &host::Pack::Receiver), member);
}
Var CsvPack::Of(Var (host::Vendor::*member)()) const {
  return Read(Read(pack, &host::Pack::Vendor), member);
}
Var CsvPack::Of(Var (host::Despatch::*member)()) const {
  return Read(Read(pack, &host::Pack::Despatch), member);
}
Var CsvPack::Of(Var (host::Carton::*member)()) const {
  return Read(Read(pack, &host::Pack::Carton), member);
}
Var CsvPack::Of(Var (host::Partner::*member)()) const {
  return Read(Read(pack, &host::Pack::Partner), member);
}
Var CsvPack::Of(Var (host::Carrier::*member)()) const {
  return Read(Read(conNote, &host::ConNote::Carrier), member);
}

MapCsvWriter::MapCsvWriter(std::string_view className, std::string_view mapFileName,
                           std::span<const CsvField> catalogue)
    : ConsignmentWriter(className), mapFileName_(mapFileName), catalogue_(catalogue) {
  names_.reserve(catalogue.size());
  for (const CsvField& field : catalogue) names_.push_back(field.name);
}

bool MapCsvWriter::OpenMapFile(const std::string& sMapFileName) {
  bool result = false;
  Procedure proc = Guard("Function OpenMapFile");
  const std::string file = "ASN map file " + sMapFileName;
  std::optional<std::string> bytes;
  if (!proc([&] {
        if (FileExists(sMapFileName)) return true;
        if (FolderExists(sMapFileName))
          LogLine(err::kPathFileAccess, kOpenMap, file + " cannot be read.");
        else
          LogLine(0, kOpenMap, file + " does not exist.");
        return false;
      }))
    return result;
  // At most one byte more than a map file may hold is read, so a huge file costs nothing.
  if (!proc([&] {
        if (FileSize(sMapFileName).value_or(0) == 0) {
          LogLine(0, kOpenMap, file + " is empty.");
          return false;
        }
        bytes = ReadFileHead(sMapFileName, kMapFileLimit + 1);
        if (!bytes) {
          LogLine(err::kPathFileAccess, kOpenMap, file + " cannot be read.");
          return false;
        }
        if (bytes->size() <= kMapFileLimit) return true;
        LogLine(0, kOpenMap,
                file + " is too large: a map file holds at most " + std::to_string(kMapFileLimit) +
                    " bytes.");
        return false;
      }))
    return result;
  CsvMap map;
  if (!proc([&] {
        map = ReadCsvMap(*bytes, names_);
        if (!map.columns.empty()) return true;
        LogLine(0, kOpenMap, file + " is empty.");
        return false;
      }))
    return result;
  for (const std::string& note : map.notes)
    if (!proc([&] { LogLine(0, kOpenMap, file + " " + note); })) return result;
  columns_ = std::move(map.columns);
  mapLoaded_ = true;
  result = true;
  return result;
}

std::int32_t MapCsvWriter::Load(const std::string&, Grid&) {
  std::int32_t result = 0;
  Procedure proc = Guard("Function Load");
  proc([&] {
    LogLine(
        0, "Load",
        "No Packs found to process. " + ClassName() + " takes consignments through Process only.");
  });
  return result;
}

void MapCsvWriter::Compile(const Ref<host::ConNote>& objConNote, const Ref<host::ASN>& objASN,
                           const Ref<host::PackList>& lstPacks) {
  Procedure proc = Guard("Function Process");
  std::string base;
  if (!proc([&] {
        base = Read(objConNote->Carrier(), &host::Carrier::FileFolder).Text();
        if (!base.empty()) return true;
        LogLine(0, kOpenFile, "No filename provided.");
        return false;
      }))
    return;
  const std::size_t cut = base.rfind(kFolderSeparator);
  const std::string folder = cut == std::string::npos ? std::string() : base.substr(0, cut + 1);
  const std::string start = base.substr(folder.size());

  // Without a map there are no columns to write: the consignment waits
  // (its lines would be empty), and the next call reads the map again.
  if (!proc([&] { return mapLoaded_ || OpenMapFile(folder + mapFileName_); })) return;

  std::string path;
  if (!proc([&] {
        // The name's start is a host text: it may not lead out of the folder.
        path = folder + SafeNamePart(start) + "_" + Format(Var(Now()), "ddmmyyhhss") + ".txt";
      }))
    return;

  std::string no;
  std::int32_t packCount = 0;
  if (!proc([&] {
        no = objConNote->ConNoteNo().Text();
        packCount = lstPacks ? lstPacks->Count() : 0;
      }))
    return;

  std::string lines;
  std::vector<std::string> added;  // SSCCs of the lines, logged once they are in the file
  for (std::int32_t i = 1; i <= packCount; ++i) {
    Ref<host::Pack> pack;
    std::string sscc;
    if (!proc([&] {
          pack = lstPacks->Item(i);
          sscc = Read(pack, &host::Pack::SSCC).Text();
        }))
      return;
    const CsvPack source{system_, objConNote, objASN, pack, packCount};
    std::string line;
    for (std::size_t column = 0; column < columns_.size(); ++column) {
      if (column > 0) line += ',';
      const std::ptrdiff_t field = columns_[column];
      if (field == kNoField || !catalogue_[static_cast<std::size_t>(field)].fill) continue;
      // A field that can't be read is reported; Ignore leaves its value empty.
      if (!proc([&] {
            const std::string value =
                Trim(catalogue_[static_cast<std::size_t>(field)].fill(source).Text());
            AppendCsvValue(line, value);
          }))
        return;
    }
    lines += CarrierLine(line);
    added.push_back(std::move(sscc));
  }

  // Stations that write in the same second share the file: each appends
  // under the file's lock, so a failed write that is cut back never takes
  // another station's lines with it.
  FileLock lock;
  if (!proc([&] {
        if (lock.Acquire(path) && File().Open(path)) return true;
        LogLine(err::kPathFileAccess, kOpenFile, "Cannot open file " + path);
        return false;
      }))
    return;
  // The consignment goes into the file in one write, so the file never holds part of it.
  if (!proc([&] {
        if (!File().Append(lines)) throw Error(err::kDeviceIO);
        CloseOpenFile();
        lock.Release();
      }))
    return;
  for (const std::string& sscc : added) {
    if (!proc(
            [&] { LogLine(0, "Process Pack", "......Pack " + sscc + " added to ConNote " + no); }))
      return;
  }
  if (!proc([&] {
        LogLine(0, "Process",
                "ASN " + Read(objASN, &host::ASN::ASNNo).Text() + " VLO DA compile completed. " +
                    std::to_string(packCount) + " packs added.");
      }))
    return;
  proc([&] { CloseOpenFile(); });
}

namespace csv {

Var ShipmentCount(const CsvPack& p) { return Var(p.packCount); }
Var AsnNo(const CsvPack& p) { return p.Of(&host::ASN::ASNNo); }
Var ConNoteNo(const CsvPack& p) { return p.Of(&host::ConNote::ConNoteNo); }
Var ShipToCode(const CsvPack& p) { return p.Of(&host::Pack::StoreCode); }
Var ShipmentWeight(const CsvPack& p) { return Format(p.Of(&host::ConNote::Weight), kWeightMask); }
Var ShipmentVolume(const CsvPack& p) { return p.Of(&host::ConNote::Volume); }
Var CarrierName(const CsvPack& p) { return p.Of(&host::ConNote::CarrierPrefix); }
Var CarrierAccountRef(const CsvPack& p) { return p.Of(&host::Carrier::AccountNumber); }
Var SenderName(const CsvPack& p) { return p.Of(&host::Vendor::Name); }
Var ReceiverName(const CsvPack& p) { return p.Of(&host::Receiver::Name); }
Var ReceiverAddr1(const CsvPack& p) { return p.Of(&host::Receiver::AddressLine1); }
Var ReceiverAddr2(const CsvPack& p) { return p.Of(&host::Receiver::AddressLine2); }
Var ReceiverTown(const CsvPack& p) { return p.Of(&host::Receiver::Suburb); }
Var ReceiverState(const CsvPack& p) { return p.Of(&host::Receiver::State); }
Var ReceiverPostcode(const CsvPack& p) { return p.Of(&host::Receiver::Postcode); }
Var ReceiverContact(const CsvPack& p) { return p.Of(&host::Receiver::Extra1); }
Var OrderNo(const CsvPack& p) { return p.Of(&host::Despatch::DespatchNo); }
Var DelReference(const CsvPack& p) { return p.Of(&host::Pack::SalesOrderNo); }

}  // namespace csv

}  // namespace quendal
