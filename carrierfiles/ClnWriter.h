// StarTrack's consignment procedure, written once for every class that
// writes ".CLN" files: the per-consignment despatch class and the manifest
// and end-of-day runs. The writer takes one consignment with its notice and
// packs, picks the file, refuses a consignment number the file already
// holds, builds all of the consignment's records (header when the file is
// new, consignment, delivery window, references, dangerous goods, items),
// appends them in one write and prints the dangerous goods declarations.
// What tells the classes apart is a ClnVariant.
#pragma once

#include <functional>
#include <string>
#include <string_view>

#include "carrierfiles/ConsignmentIndex.h"
#include "frame/FailSafe.h"
#include "frame/host/Host.h"
#include "platform/FileSystem.h"

namespace quendal {

struct ClnVariant {
  // A new file is named after the manifest number; otherwise after the notice's number.
  bool nameFromManifest = false;
  // A ".CLN" file created today in the carrier folder takes the consignment.
  bool reuseTodaysFile = true;
  // Record "10"'s weight when the consignment has none ("" leaves five spaces).
  std::string_view noWeight;
  // "#%ATL" in the carrier's options adds an authority-to-leave reference per pack.
  bool authorityToLeave = true;
  // The unit is "SAT" when the first pack is a satchel; otherwise always "CTN".
  bool satchelUnit = true;
  // The cube comes from the packs' item counts (and is stored on the packs
  // and the consignment) rather than from the consignment's volume.
  bool cubeByItemCount = false;
};

// One consignment as the writer takes it.
struct ClnConsignment {
  Ref<host::ConNote> conNote;
  Ref<host::ASN> asn;
  Ref<host::PackList> packs;
  Var manifestNumber;  // names a new file when the variant says so
};

// The cube of a pack holding `itemCount` items, in cubic metres.
double CubeByItemCount(const Var& itemCount);

class ClnWriter {
 public:
  // What the writer needs of the class it writes for.
  class Owner {
   public:
    virtual ~Owner() = default;
    // Writes one host log entry and hands its id to the caller.
    virtual void LogLine(long errorNumber, std::string_view procedure, std::string_view message) = 0;
    // Prints the consignment's dangerous goods declaration; false when it could not.
    virtual bool DangerouseGoodsDeclaration(const Ref<host::ConNote>& aConnote) = 0;
  };

  // Both must outlive the writer.
  ClnWriter(const ClnVariant& variant, Owner& owner) : variant_(variant), owner_(owner) {}

  // Writes the consignment as further steps of `proc`; true once its
  // records are in the file and `written` (when given) has succeeded.
  // `written` runs right after the append, before the SSCCs are logged,
  // the declarations printed and completion logged; false from it ends the
  // work there.
  bool Write(Procedure& proc, const ClnConsignment& consignment,
             const std::function<bool()>& written = {});

  // Closes the file a call left open.
  void Close() { file_.Close(); }
  // The duplicate check normally answers from an index of the file;
  // switched off it reads the whole file for every consignment.
  void SetDuplicateIndex(bool enabled) { index_.SetEnabled(enabled); }

 private:
  std::string TargetFile(const ClnConsignment& consignment, const Ref<host::Carrier>& carrier,
                         const std::string& folder);

  const ClnVariant& variant_;
  Owner& owner_;
  ConsignmentIndex index_{"10", 20};
  AppendingFile file_;
};

}  // namespace quendal
