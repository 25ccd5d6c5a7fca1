#include "labels/Elements.h"

#include "labels/Gs1.h"

namespace quendal::elements {

std::string Sscc(const LabelValues& v) { return gs1::SsccData(v.SSCC); }
std::string SsccLine(const LabelValues& v) { return gs1::SsccText(v.SSCC); }
std::string ShipTo(const LabelValues& v) { return gs1::ShipToData(v.CountryCode, v.ToPostcode); }
std::string ShipToLine(const LabelValues& v) { return gs1::ShipToText(v.CountryCode, v.ToPostcode); }
std::string ShipToStore(const LabelValues& v) {
  return gs1::ShipToReferenceData(v.CountryCode, v.ToPostcode, v.StoreText);
}
std::string ShipToStoreLine(const LabelValues& v) {
  return gs1::ShipToReferenceText(v.CountryCode, v.ToPostcode, v.StoreText);
}
std::string CentreStore(const LabelValues& v) {
  return gs1::ShipToReferenceData(v.CountryCode, v.ReceiverPostcode, v.StoreText);
}
std::string CentreStoreLine(const LabelValues& v) {
  return gs1::ShipToReferenceText(v.CountryCode, v.ReceiverPostcode, v.StoreText);
}
std::string Store(const LabelValues& v) { return gs1::ReferenceData(v.StoreText); }
std::string StoreLine(const LabelValues& v) { return gs1::ReferenceText(v.StoreText); }

}  // namespace quendal::elements
