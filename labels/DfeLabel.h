// The DFE carton label "DFESCM" (480), 800 x 400: the destination and
// service large, sender, carrier, receiver, the consignment large, order
// references and dates, the postcode large, and room for the ship-to (421)
// barcode at the bottom. The classes that print it differ in what they
// send: the ship-to barcode or not, the label in inches or in millimetres.
#pragma once

#include <array>

#include "labels/GenericLabel.h"

namespace quendal {

inline constexpr std::string_view kDfeNumber = "480";

// The destination, service and consignment at the top.
inline constexpr std::array<vpcl::Packet, 3> kDfeTop = {
    vpcl::Field{28, 34, 762, 5, 3, 1, 2, 'B', 'L'},
    vpcl::Field{29, 20, 738, 5, 3, 1, 1, 'B', 'L'},
    vpcl::Field{34, 30, 738, 190, 3, 1, 1, 'B', 'L'},
};
// Under the sender and carrier: the receiver, the consignment large, order
// references, dates and free lines, the postcode and state large.
inline constexpr std::array<vpcl::Packet, 24> kDfeMiddle = {
    vpcl::Field{30, 40, 686, 230, 1, 1, 1, 'B', 'L'},
    vpcl::Line{675, 2, 675, 398, 2},
    vpcl::Text{660, 5, 1, 2, 1, 'O', 'L', 0, "TO:"},
    vpcl::Field{6, 40, 636, 5, 1, 2, 1, 'B', 'L'},
    vpcl::Field{11, 40, 616, 5, 1, 2, 1, 'B', 'L'},
    vpcl::Field{7, 40, 596, 5, 1, 2, 1, 'B', 'L'},
    vpcl::Field{8, 50, 576, 5, 1, 2, 1, 'B', 'L'},
    vpcl::Line{560, 2, 560, 398, 2},
    vpcl::Text{545, 5, 1, 1, 1, 'O', 'L', 0, "CONNOTE:"},
    vpcl::Field{5, 13, 510, 5, 3, 2, 2, 'B', 'L'},
    vpcl::Line{495, 2, 495, 398, 2},
    vpcl::Field{20, 25, 480, 5, 1, 2, 1, 'B', 'L'},
    vpcl::Field{21, 25, 460, 5, 1, 2, 1, 'B', 'L'},
    vpcl::Field{31, 30, 480, 250, 1, 1, 1, 'O', 'L'},
    vpcl::Field{32, 30, 468, 250, 1, 1, 1, 'O', 'L'},
    vpcl::Field{33, 30, 456, 250, 1, 1, 1, 'O', 'L'},
    vpcl::Field{26, 30, 435, 5, 1, 2, 1, 'B', 'L'},
    vpcl::Field{27, 30, 415, 5, 1, 2, 1, 'B', 'L'},
    vpcl::Line{400, 2, 400, 398, 2},
    vpcl::Text{385, 5, 1, 1, 1, 'O', 'L', 0, "POSTCODE"},
    vpcl::Field{12, 4, 290, 5, 3, 4, 4, 'B', 'L'},
    vpcl::Text{385, 230, 1, 1, 1, 'O', 'L', 0, "STATE"},
    vpcl::Field{13, 3, 290, 230, 3, 3, 4, 'B', 'L'},
    vpcl::Line{235, 2, 235, 398, 2},
};
// Everything but the ship-to barcode.
inline constexpr auto kDfeBody = vpcl::Join(kDfeTop, generic::SenderBlock(710), kDfeMiddle);

// The ship-to (421) barcode and its line.
inline constexpr std::array<vpcl::Packet, 2> kDfeShipTo = {
    vpcl::Barcode{17, 27, 'V', 80, 40, 4, 130},
    vpcl::Field{18, 30, 60, 60, 1, 1, 1, 'B', 'L'},
};

inline constexpr auto kDfePackets = vpcl::Join(kDfeBody, kDfeShipTo);

// The fields of the body; with the ship-to barcode's two after them.
inline constexpr auto kDfeBatch = vpcl::Join(generic::kAddressFields, generic::kPostcodeFields,
                                             generic::kOrderFields, generic::kTailFields);
inline constexpr std::array<BatchField, 2> kDfeShipToFields = {{
    {17, elements::ShipTo},
    {18, elements::ShipToLine},
}};
inline constexpr auto kDfeShipToBatch = vpcl::Join(kDfeBatch, kDfeShipToFields);

}  // namespace quendal
