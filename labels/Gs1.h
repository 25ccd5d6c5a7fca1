// GS1-128 element strings as the labels carry them: the SSCC under (00),
// the ship-to postal code under (421), optionally followed by a reference
// under (90). Each comes in three forms: barcode data for VPCL II and drawn
// labels ("~201" is FNC1), barcode data for ZPL (">;" starts code set C,
// ">8" is FNC1) and the human-readable line under the barcode.
#pragma once

#include <string>
#include <string_view>

namespace quendal::gs1 {

// FNC1 in VPCL II barcode data: the printer reads the four characters as
// the character 201 and encodes it as FNC1.
inline constexpr std::string_view kVpclFnc1 = "~201";

std::string SsccData(std::string_view sscc);  // "~20100" + SSCC
std::string SsccZpl(std::string_view sscc);   // ">;>800" + SSCC
std::string SsccText(std::string_view sscc);  // "(00)" + SSCC

// country: ISO 3166 numeric ("036"); postcode as on the label.
std::string ShipToData(std::string_view country, std::string_view postcode);
std::string ShipToZpl(std::string_view country, std::string_view postcode);
std::string ShipToText(std::string_view country, std::string_view postcode);

// (421) is variable-length, so FNC1 comes again before (90). An empty
// reference leaves (90) out: the identifier without data does not scan as
// GS1, so the barcode carries the ship-to postal code alone.
std::string ShipToReferenceData(std::string_view country, std::string_view postcode,
                                std::string_view reference);
std::string ShipToReferenceZpl(std::string_view country, std::string_view postcode,
                               std::string_view reference);
std::string ShipToReferenceText(std::string_view country, std::string_view postcode,
                                std::string_view reference);

// A reference under (90) alone ("~20190" + reference, "(90)" + reference);
// empty for an empty reference.
std::string ReferenceData(std::string_view reference);
std::string ReferenceText(std::string_view reference);

}  // namespace quendal::gs1
