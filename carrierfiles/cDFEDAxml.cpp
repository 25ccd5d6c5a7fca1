#include "carrierfiles/cDFEDAxml.h"

#include "frame/host/Read.h"
#include "manifests/DangerousGoodsDeclaration.h"

namespace quendal {

namespace {

// Every consignment needs packs; the cartons share one carton line with
// the consignment's weight.
constexpr DfeVariant kDespatch{.refusePackless = true, .linePerGroup = false};

}  // namespace

clsDFEDAxml::clsDFEDAxml()
    : ConsignmentWriter("clsDFEDAxml"), DfeWriter(kDespatch, *this, ModuleName()) {}

bool clsDFEDAxml::DangerouseGoodsDeclaration(const Ref<host::ConNote>& aConnote) {
  return PrintDangerousGoodsDeclaration(DeclarationForm::DFE, system_, aConnote, ModuleName());
}

// The packs are the consignment's own, and the notice that of its first pack.
void clsDFEDAxml::Compile(const Ref<host::ConNote>& objConNote, const Ref<host::ASN>&,
                          const Ref<host::PackList>&) {
  Procedure proc = Guard("Sub Process");
  std::string folder;
  if (!proc([&] { folder = host::Read(objConNote->Carrier(), &host::Carrier::FileFolder).Text(); }))
    return;
  Write(proc, objConNote, folder);
}

std::unique_ptr<Component> MakeDFEDAxml() { return std::make_unique<clsDFEDAxml>(); }

}  // namespace quendal
