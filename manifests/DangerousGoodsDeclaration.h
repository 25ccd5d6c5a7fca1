// The dangerous goods shipping/transport document that travels with a
// consignment holding dangerous goods, printed on the System's document
// printer. Two forms:
//  - StarTrack: one document per pack and dangerous goods class;
//  - DFE: one document for the whole consignment, with UN numbers and
//    packing groups.
#pragma once

#include <string_view>

#include "frame/host/Host.h"

namespace quendal {

enum class DeclarationForm { StarTrack, DFE };

// Prints the documents of the consignment; true when every document was
// printed (and when there is none to print). A failure (unknown printer,
// host error) gives false, host errors through the error report of
// `module`, "Function DangerouseGoodsDeclaration".
bool PrintDangerousGoodsDeclaration(DeclarationForm form, const Ref<host::System>& system,
                                    const Ref<host::ConNote>& aConnote, std::string_view module);

}  // namespace quendal
