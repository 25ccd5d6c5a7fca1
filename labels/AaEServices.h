// The AaE label's service tables: the consignment's service name, trimmed
// and matched exactly (case-sensitive), gives the service code printed on
// the label and the article code of its barcode. Any other service gives
// empty texts.
#pragma once

#include <string>

#include "frame/host/Host.h"

namespace quendal {

std::string ServiceCode(const Ref<host::ConNote>& conNote);
std::string ArticleCode(const Ref<host::ConNote>& conNote);

}  // namespace quendal
