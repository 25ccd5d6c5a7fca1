// StarTrack's consignment file: one ".CLN" file per despatch day, to which
// each Process appends one consignment (consignment, delivery window,
// reference, dangerous goods and item records), refusing a consignment
// number the file already holds. A consignment with dangerous goods also
// gets two printed declarations.
#pragma once

#include <memory>
#include <string>

#include "carrierfiles/ClnWriter.h"
#include "carrierfiles/ConsignmentWriter.h"

namespace quendal {

class clsStarTrackDAcln : public ConsignmentWriter, private ClnWriter::Owner {
 public:
  clsStarTrackDAcln();

  // Prints nothing.
  bool DGDeclaration();
  // Prints the dangerous goods declaration of the consignment on the
  // System's document printer; false when it could not be printed.
  bool DangerouseGoodsDeclaration(const Ref<host::ConNote>& aConnote) override;

  // The duplicate check normally answers from an index of the day's file;
  // switched off it reads the whole file for every consignment.
  void SetDuplicateIndex(bool enabled) { cln_.SetDuplicateIndex(enabled); }

 protected:
  void Compile(const Ref<host::ConNote>& objConNote, const Ref<host::ASN>& objASN,
               const Ref<host::PackList>& lstPacks) override;
  void CloseOpenFile() override { cln_.Close(); }

 private:
  void LogLine(long errorNumber, std::string_view procedure, std::string_view message) override {
    ConsignmentWriter::LogLine(errorNumber, procedure, message);
  }

  ClnWriter cln_;
};

std::unique_ptr<Component> MakeStarTrackDAcln();

}  // namespace quendal
