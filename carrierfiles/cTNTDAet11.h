// TNT's ET11 file: one batch per account and day ("A" batch header, "B"
// sender), to which each Process adds one consignment ("C", "E", "F" and
// one "H" per eight packs) and moves the trailer "Z", which counts the
// file's lines, to the end again.
#pragma once

#include <memory>

#include "carrierfiles/ConsignmentWriter.h"

namespace quendal {

class clsTNTDAet11 : public ConsignmentWriter {
 public:
  clsTNTDAet11();

  // The trailer is normally replaced in place through a journal. Switched
  // off, the whole file is rewritten without its trailer (WriteFile) before
  // each consignment is appended, for comparisons.
  void SetTailReplacement(bool enabled) { tailReplacement_ = enabled; }

 protected:
  void Compile(const Ref<host::ConNote>& objConNote, const Ref<host::ASN>& objASN,
               const Ref<host::PackList>& lstPacks) override;

 private:
  bool tailReplacement_ = true;
};

std::unique_ptr<Component> MakeTNTDAet11();

}  // namespace quendal
