// The record of one carton label's values, read from the host for one pack
// and handed to the printer-language writers.
#pragma once

#include <cstdint>
#include <string>

namespace quendal {

// The values of one carton label, read from the host for one pack. Texts
// are cut to the widths the layouts leave them; a Null host value reads as
// the empty text.
struct LabelValues {
  bool AuthorityToLeave = false;
  std::string FromName;
  std::string FromLine2;
  std::string FromLine3;
  std::string FromState;
  std::string LabelCarrierId;
  std::string CarrierName;
  std::string ConNoteNo;
  std::string ServiceLine;
  std::string PostcodeServiceLine;
  std::string ToNameShort;
  std::string ToName;
  std::string ToAddress1;
  std::string ToAddress2;
  std::string ToSuburb;
  std::string ToState;
  std::string ToPostcode;
  std::string ToSuburbUpper;
  std::string CountryCode;
  std::string SSCC;
  std::string OrderLine;
  std::string SalesOrderLine;
  std::string NotBeforeLine;
  std::string NotAfterLine;
  std::string PackedLine;
  // Position of the pack in its consignment and its authority-to-leave
  // number; only authority-to-leave labels renew them.
  std::int16_t PackOrdinal = 0;
  std::string ATLNumber;
  std::string UserText1;
  std::string UserText2;
  std::string StoreZoneDept;
  // The large store reference some layouts print top right, which also
  // follows the postcode under (90) in their ship-to barcode; empty unless a
  // class fills it.
  std::string StoreText;

  // What the labels of goods for a retailer's store, sent through its
  // distribution centre, print besides; empty unless a class fills them.
  std::string BillOfLading;      // after "B/L No:"
  std::string PanelText;         // printed reversed in a box
  std::string LocationNumber;    // the delivery location's number, large
  std::string LocationCode;      // the delivery location's code, after "TO:"
  std::string ReceiverLine;      // the delivery location's line under it
  std::string ReceiverPostcode;  // the delivery location's postcode
  std::string ForName;           // the store the goods are for, after "FOR:"
  std::string ForLine;           // the store's line under it
  std::string ForPostcode;       // the store's postcode
  std::string PurchaseOrderLine; // "PO " and the retailer's order number
  // Two large texts and a line under "STORE ZONE/DEPT".
  std::string ZoneDeptA;
  std::string ZoneDeptB;
  std::string ZoneDeptC;

  // What the postal labels print besides; empty unless a class fills them.
  std::string ConsignmentNumber;     // the consignment as the postal manifest names it
  std::string ArticleId;             // the carton's article identifier, check digit included
  std::string PackOfPacks;           // "2 of 3": the carton's place among its consignment's
  std::string PacksLine;             // "3 PC": the consignment's number of cartons
  std::string DeliveryInstructions;
};

}  // namespace quendal
