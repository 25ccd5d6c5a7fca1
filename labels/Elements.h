// The GS1-128 element strings of a carton label, built from its values: as
// barcode data for VPCL II and drawn labels ("~201" is FNC1) and as the
// line printed under the barcode. A batch table names the ones its format
// carries.
#pragma once

#include <string>

#include "labels/LabelValues.h"

namespace quendal::elements {

// (00): the pack's SSCC.
std::string Sscc(const LabelValues& v);
std::string SsccLine(const LabelValues& v);
// (421): the delivery address's postal code, after its country.
std::string ShipTo(const LabelValues& v);
std::string ShipToLine(const LabelValues& v);
// (421)(90): the same, followed by the store's reference (StoreText).
std::string ShipToStore(const LabelValues& v);
std::string ShipToStoreLine(const LabelValues& v);
// (421)(90) of a label through a distribution centre: the centre's postcode
// (ReceiverPostcode), then the store's number.
std::string CentreStore(const LabelValues& v);
std::string CentreStoreLine(const LabelValues& v);
// (90): the store's reference alone.
std::string Store(const LabelValues& v);
std::string StoreLine(const LabelValues& v);

}  // namespace quendal::elements
