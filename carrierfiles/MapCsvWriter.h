// The frame of the map-driven despatch advice: a class names its field
// catalogue and how each field is filled for a pack; the map file beside
// the output says which fields go into each line and in what order. Every
// pack becomes one comma-separated line of a file named after the carrier's
// FileFolder text and the time of the call, and a consignment's lines go
// into the file in one write.
//
// FileFolder holds a base: the folder up to its last separator, and the
// start of the output file's name after it ("/transfer/vlo/VLO" writes
// "/transfer/vlo/VLO_1403240930.txt"; "/transfer/vlo/" writes
// "/transfer/vlo/_1403240930.txt"). The map file is read from that folder
// on the first Process and kept, with the catalogue, for the object's life.
#pragma once

#include <cstdint>
#include <span>
#include <string>
#include <string_view>
#include <vector>

#include "carrierfiles/ConsignmentWriter.h"

namespace quendal {

// What the fields of one pack's line are filled from. `Of` reads a member
// of the consignment, its notice, the pack, or what the pack reaches (its
// receiver, vendor, despatch, carton, partner) or the consignment's
// carrier; a member of a missing object reads as Null.
struct CsvPack {
  const Ref<host::System>& system;
  const Ref<host::ConNote>& conNote;
  const Ref<host::ASN>& asn;
  const Ref<host::Pack>& pack;
  std::int32_t packCount;  // packs of the consignment's list

  Var Of(Var (host::ConNote::*member)()) const;
  Var Of(Var (host::ASN::*member)()) const;
  Var Of(Var (host::Pack::*member)()) const;
  Var Of(Var (host::Receiver::*member)()) const;
  Var Of(Var (host::Vendor::*member)()) const;
  Var Of(Var (host::Despatch::*member)()) const;
  Var Of(Var (host::Carton::*member)()) const;
  Var Of(Var (host::Partner::*member)()) const;
  Var Of(Var (host::Carrier::*member)()) const;
};

// A field of the catalogue: its name as a map file writes it (upper case)
// and how it is filled; Null or no filler writes an empty value.
struct CsvField {
  std::string_view name;
  Var (*fill)(const CsvPack&) = nullptr;
};

class MapCsvWriter : public ConsignmentWriter {
 public:
  // Loads the map; false (logged) when the file is missing, empty, too
  // large or unreadable, which leaves the map loaded before as it was.
  bool OpenMapFile(const std::string& sMapFileName);
  // These classes take no rows: returns 0 and logs so.
  std::int32_t Load(const std::string& a_sFileName, Grid& a_vtRows);

 protected:
  MapCsvWriter(std::string_view className, std::string_view mapFileName,
               std::span<const CsvField> catalogue);

  void Compile(const Ref<host::ConNote>& objConNote, const Ref<host::ASN>& objASN,
               const Ref<host::PackList>& lstPacks) override;

 private:
  std::string mapFileName_;
  std::span<const CsvField> catalogue_;
  std::vector<std::string_view> names_;
  // The catalogue field of each column (kNoField: written empty).
  std::vector<std::ptrdiff_t> columns_;
  bool mapLoaded_ = false;
};

// Fillers of the fields both map-driven files write the same way.
namespace csv {
Var ShipmentCount(const CsvPack& p);
Var AsnNo(const CsvPack& p);
Var ConNoteNo(const CsvPack& p);
Var ShipToCode(const CsvPack& p);
Var ShipmentWeight(const CsvPack& p);
Var ShipmentVolume(const CsvPack& p);
Var CarrierName(const CsvPack& p);
Var CarrierAccountRef(const CsvPack& p);
Var SenderName(const CsvPack& p);
Var ReceiverName(const CsvPack& p);
Var ReceiverAddr1(const CsvPack& p);
Var ReceiverAddr2(const CsvPack& p);
Var ReceiverTown(const CsvPack& p);
Var ReceiverState(const CsvPack& p);
Var ReceiverPostcode(const CsvPack& p);
Var ReceiverContact(const CsvPack& p);
Var OrderNo(const CsvPack& p);
Var DelReference(const CsvPack& p);
}  // namespace csv

}  // namespace quendal
