// The record grammar of StarTrack's consignment file (".CLN"), shared by
// the classes that write it: the record layouts, the state codes and the
// dangerous goods names.
#pragma once

#include <array>
#include <string_view>

#include "carrierfiles/FixedRecord.h"

namespace quendal::cln {

using namespace record;

// File header "00N": file name, consignment date and time (twice), batch
// type "G" and the flag "Y".
constexpr std::array kHeader = {
    Literal("00N"), TextLeft(12), Date("YYYYMMDDHHMMSS"), Literal("G"), Spaces(20),
    Date("YYYYMMDDHHMMSS"), Literal("Y"), Spaces(71),
};
static_assert(Width(kHeader) == 136);

// Consignment "10": number, receiver name and address, state code,
// postcode, account, pack count, service, weight, cubic and unit.
constexpr std::array kConsignment = {
    Literal("10"), TextLeft(20),  // consignment number
    Spaces(8),
    TextLeft(40),  // receiver name
    Spaces(40),
    TextLeft(40),  // first address line
    TextLeft(40),  // second address line
    TextLeft(30),  // suburb
    TextLeft(1),   // state code
    TextRight(4),  // postcode
    Spaces(17),    Literal("N"),
    TextRight(8),  // account number
    Literal("S"),
    TextRight(4),  // number of packs
    TextRight(3),  // service
    TextRight(5),  // weight, whole kilograms
    TextRight(5),  // cubic
    Spaces(4),     Literal("N"), Spaces(4),
    TextLeft(3),  // unit: "SAT" or "CTN"
};
static_assert(Width(kConsignment) == 281);

// Delivery window "13": the first pack's not-before and not-after dates in
// words and as digits, and the start of the delivery instructions.
constexpr std::array kDeliveryWindow = {
    Literal("13"),          TextLeft(20),  // consignment number
    Literal("Not Before: "), Date("DD-MMM-YYYY  "),
    Literal("Not After: "),  Date("DD-MMM-YYYY   "),
    CutLeft(25),  // delivery instructions
    Date("YYYYMMDDHHMM"),   Date("YYYYMMDDHHMM"),
};
static_assert(Width(kDeliveryWindow) == 121);

// Reference "15": type, value, label and flag.
constexpr std::array kReference = {
    Literal("15"), TextLeft(20),  // consignment number
    TextLeft(1),                  // reference type
    TextLeft(20),                 // reference value
    TextLeft(30),                 // reference label
    TextLeft(1),                  // flag
};
static_assert(Width(kReference) == 74);

// Reference types, values' labels and flags.
inline constexpr std::string_view kSendersReference = "Senders Reference             ";
inline constexpr std::string_view kAdvanceShipNotice = "Advance Ship Notice Number    ";
inline constexpr std::string_view kCustomerOrder = "Customer Order Number         ";
inline constexpr std::string_view kAuthorityToLeave = "ATL                           ";
static_assert(kSendersReference.size() == 30 && kAdvanceShipNotice.size() == 30 &&
              kCustomerOrder.size() == 30 && kAuthorityToLeave.size() == 30);

// Dangerous goods "19": class, name, cartons holding dangerous goods and
// their net weight.
constexpr std::array kDangerousGoods = {
    Literal("19"), TextLeft(20),  // consignment number
    Spaces(15),
    TextLeft(7),   // DG class
    TextLeft(35),  // DG name
    Spaces(35),    Literal("CARTON"), Spaces(21),
    Zero(4),  // cartons
    Zero(5),  // net weight, whole kilograms
};
static_assert(Width(kDangerousGoods) == 150);

// Item "20": the pack's SSCC, then its handling tail. An SSCC is 20
// characters; a missing one is spaces, so the tail keeps its place.
constexpr std::array kItem = {
    Literal("20"), TextLeft(20),  // consignment number
    TextLeft(20),                 // SSCC
    TextLeft(0),                  // "S " alone, "B PAL" or "S " + unit
};

// StarTrack's one-character state codes; any other state is a space.
struct StateCode {
  std::string_view state;
  std::string_view code;
};
constexpr std::array kStateCodes = {
    StateCode{"NSW", "2"}, StateCode{"VIC", "3"}, StateCode{"QLD", "4"}, StateCode{"SA", "5"},
    StateCode{"WA", "6"},  StateCode{"TAS", "7"}, StateCode{"NT", "0"},  StateCode{"ACT", "A"},
};

constexpr std::string_view StateCodeOf(std::string_view trimmedState) {
  for (const StateCode& row : kStateCodes)
    if (row.state == trimmedState) return row.code;
  return " ";
}

// The names the carrier prints for the dangerous goods classes it carries.
struct DangerousGoodsName {
  std::string_view dgClass;
  std::string_view name;
};
constexpr std::array kDangerousGoodsNames = {
    DangerousGoodsName{"2.1", "FLAMMABLE GASES"},
    DangerousGoodsName{"3.1", "FLAMMABLE LIQUID"},
    DangerousGoodsName{"5.1", "OXIDIZING AGENT"},
};

// The name of a class, or nullptr-like empty view when the class is not carried.
constexpr std::string_view DangerousGoodsNameOf(std::string_view dgClass) {
  for (const DangerousGoodsName& row : kDangerousGoodsNames)
    if (row.dgClass == dgClass) return row.name;
  return {};
}

}  // namespace quendal::cln
