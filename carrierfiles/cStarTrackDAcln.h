// StarTrack's consignment file: one ".CLN" file per despatch day, to which
// each Process appends one consignment (consignment, delivery window,
// reference, dangerous goods and item records), refusing a consignment
// number the file already holds. A consignment with dangerous goods also
// gets two printed declarations.
#pragma once

#include <memory>
#include <string>

#include "carrierfiles/ConsignmentIndex.h"
#include "carrierfiles/ConsignmentWriter.h"

namespace quendal {

class clsStarTrackDAcln : public ConsignmentWriter {
 public:
  clsStarTrackDAcln();

  // Prints nothing.
  bool DGDeclaration();
  // Prints the dangerous goods declaration of the consignment on the
  // System's document printer; false when it could not be printed.
  bool DangerouseGoodsDeclaration(const Ref<host::ConNote>& aConnote);

  // The duplicate check normally answers from an index of the day's file;
  // switched off it reads the whole file for every consignment.
  void SetDuplicateIndex(bool enabled) { index_.SetEnabled(enabled); }

 protected:
  void Compile(const Ref<host::ConNote>& objConNote, const Ref<host::ASN>& objASN,
               const Ref<host::PackList>& lstPacks) override;

 private:
  std::string TargetFile(const Ref<host::ConNote>& conNote, const Ref<host::ASN>& asn,
                         const Ref<host::Carrier>& carrier, const std::string& folder);

  ConsignmentIndex index_{"10", 20};
};

std::unique_ptr<Component> MakeStarTrackDAcln();

}  // namespace quendal
