#include "labels/Gs1.h"

#include <initializer_list>

namespace quendal::gs1 {

namespace {

constexpr std::string_view kZplStart = ">;";
constexpr std::string_view kZplFnc1 = ">8";

std::string Join(std::initializer_list<std::string_view> parts) {
  std::size_t size = 0;
  for (std::string_view part : parts) size += part.size();
  std::string out;
  out.reserve(size);
  for (std::string_view part : parts) out += part;
  return out;
}

}  // namespace

std::string SsccData(std::string_view sscc) { return Join({kVpclFnc1, "00", sscc}); }
std::string SsccZpl(std::string_view sscc) { return Join({kZplStart, kZplFnc1, "00", sscc}); }
std::string SsccText(std::string_view sscc) { return Join({"(00)", sscc}); }

std::string ShipToData(std::string_view country, std::string_view postcode) {
  return Join({kVpclFnc1, "421", country, postcode});
}
std::string ShipToZpl(std::string_view country, std::string_view postcode) {
  return Join({kZplStart, kZplFnc1, "421", country, postcode});
}
std::string ShipToText(std::string_view country, std::string_view postcode) {
  return Join({"(421)", country, postcode});
}

std::string ShipToReferenceData(std::string_view country, std::string_view postcode,
                                std::string_view reference) {
  if (reference.empty()) return ShipToData(country, postcode);
  return Join({kVpclFnc1, "421", country, postcode, kVpclFnc1, "90", reference});
}
std::string ShipToReferenceZpl(std::string_view country, std::string_view postcode,
                               std::string_view reference) {
  if (reference.empty()) return ShipToZpl(country, postcode);
  return Join({kZplStart, kZplFnc1, "421", country, postcode, kZplFnc1, "90", reference});
}
std::string ShipToReferenceText(std::string_view country, std::string_view postcode,
                                std::string_view reference) {
  if (reference.empty()) return ShipToText(country, postcode);
  return Join({"(421)", country, postcode, "(90)", reference});
}

std::string ReferenceData(std::string_view reference) {
  return reference.empty() ? std::string() : Join({kVpclFnc1, "90", reference});
}
std::string ReferenceText(std::string_view reference) {
  return reference.empty() ? std::string() : Join({"(90)", reference});
}

}  // namespace quendal::gs1
