#include "carrierfiles/cStarTrackDAcln.h"

#include "manifests/DangerousGoodsDeclaration.h"

namespace quendal {

namespace {

// The day's file, named after the notice; no weight leaves the field blank.
constexpr ClnVariant kDespatch{
    .nameFromManifest = false,
    .reuseTodaysFile = true,
    .noWeight = "",
    .authorityToLeave = true,
    .satchelUnit = true,
    .cubeByItemCount = false,
};

}  // namespace

clsStarTrackDAcln::clsStarTrackDAcln()
    : ConsignmentWriter("clsStarTrackDAcln"), cln_(kDespatch, *this) {}

bool clsStarTrackDAcln::DGDeclaration() { return false; }

bool clsStarTrackDAcln::DangerouseGoodsDeclaration(const Ref<host::ConNote>& aConnote) {
  return PrintDangerousGoodsDeclaration(DeclarationForm::StarTrack, system_, aConnote,
                                        ModuleName());
}

void clsStarTrackDAcln::Compile(const Ref<host::ConNote>& objConNote, const Ref<host::ASN>& objASN,
                                const Ref<host::PackList>& lstPacks) {
  Procedure proc = Guard("Sub Process");
  if (!proc([&] {
        LogLine(0, "Process",
                "ConNote " + objConNote->ConNoteNo().Text() + ". ActiveX called " + ClassName());
      }))
    return;
  cln_.Write(proc, {objConNote, objASN, lstPacks, Var()});
}

std::unique_ptr<Component> MakeStarTrackDAcln() { return std::make_unique<clsStarTrackDAcln>(); }

}  // namespace quendal
