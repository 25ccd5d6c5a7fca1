#include "labels/AustPostLabel.h"

#include "frame/Error.h"
#include "frame/VB.h"
#include "labels/Graphics.h"
#include "labels/Gs1.h"
#include "labels/WinPrint.h"
#include "manifests/PcmsDocument.h"

namespace quendal {

namespace {

using namespace vpcl;

// The graphic's header: number 99, named "AP"; its rows follow as stored.
constexpr std::string_view kGraphicHeader = "{G,99,A,R,G,1080,489,0,\"AP\"|";

// The carrier's name beside its graphic, one head per service.
constexpr std::array<Packet, 6> kParcelHead = {
    Graphic{99, 532, 241},
    Text{580, 5, 3, 1, 1, 'B', 'L', 0, "AUSTRALIA"},
    Text{560, 5, 3, 1, 1, 'B', 'L', 0, "POST"},
    Text{535, 5, 3, 1, 1, 'B', 'L', 0, "eParcel"},
    Text{545, 92, 1, 1, 1, 'B', 'L', 0, "TM"},
    Line{525, 2, 525, 398, 4},
};
constexpr std::array<Packet, 5> kExpressHead = {
    Graphic{99, 545, 243},
    Text{580, 5, 3, 1, 1, 'B', 'L', 0, "AUSTRALIA"},
    Text{560, 5, 3, 1, 1, 'B', 'L', 0, "POST"},
    Text{535, 5, 3, 1, 1, 'W', 'L', 0, "EXPRESS POST"},
    Line{525, 2, 525, 398, 4},
};

// Under the head, the same for both services: the delivery address and
// instructions, the consignment and the carton's place in it, the article
// identifier with its barcode, the SSCC barcode, the sender.
constexpr std::array<Packet, 31> kBody = {
    Text{512, 5, 1, 1, 1, 'O', 'L', 0, "DELIVER TO"},
    Field{1, 40, 492, 15, 2, 1, 1, 'B', 'L'},
    Field{2, 40, 475, 15, 2, 1, 1, 'B', 'L'},
    Field{3, 40, 458, 15, 2, 1, 1, 'B', 'L'},
    Field{4, 40, 432, 15, 3, 1, 1, 'B', 'L'},
    Line{420, 2, 420, 398, 2},
    Text{408, 5, 1, 1, 1, 'O', 'L', 0, "DELIVERY INSTRUCTIONS"},
    Field{5, 60, 393, 5, 1, 1, 1, 'B', 'L'},
    Field{6, 40, 376, 5, 2, 1, 1, 'B', 'L'},
    Line{365, 2, 365, 398, 2},
    Text{352, 5, 1, 1, 1, 'O', 'L', 0, "CON NO"},
    Field{7, 20, 328, 5, 3, 1, 1, 'B', 'L'},
    Text{352, 250, 1, 1, 1, 'O', 'L', 0, "PARCEL"},
    Field{9, 10, 352, 310, 1, 1, 1, 'B', 'L'},
    Field{8, 12, 328, 250, 3, 1, 1, 'B', 'L'},
    Line{318, 2, 318, 398, 2},
    Text{303, 5, 1, 1, 1, 'O', 'L', 0, "AP Article ID:"},
    Field{10, 30, 303, 120, 1, 1, 1, 'B', 'L'},
    Barcode{11, 30, 'V', 185, 40, 8, 105},
    Text{170, 5, 1, 1, 1, 'O', 'L', 0, "AP Article ID:"},
    Field{12, 30, 170, 120, 1, 1, 1, 'B', 'L'},
    Line{160, 2, 160, 398, 2},
    Field{13, 40, 147, 5, 1, 1, 1, 'B', 'L'},
    Barcode{14, 21, 'V', 50, 40, 4, 88},
    Text{35, 5, 1, 1, 1, 'O', 'L', 0, "SENDER"},
    Field{15, 25, 35, 70, 1, 1, 1, 'O', 'L'},
    Field{16, 25, 23, 70, 1, 1, 1, 'O', 'L'},
    Field{17, 30, 11, 70, 1, 1, 1, 'O', 'L'},
    Field{18, 25, 35, 250, 1, 1, 1, 'O', 'L'},
    Field{19, 25, 23, 250, 1, 1, 1, 'O', 'L'},
    Field{20, 30, 11, 250, 1, 1, 1, 'O', 'L'},
};
constexpr auto kParcelPackets = Join(kParcelHead, kBody);
constexpr auto kExpressPackets = Join(kExpressHead, kBody);
constexpr vpcl::Format kParcel{"APEP", 600, 400, kParcelPackets};
constexpr vpcl::Format kExpress{"APEX", 600, 400, kExpressPackets};

using V = const LabelValues&;
constexpr std::array<BatchField, 20> kBatch = {{
    {1, &LabelValues::ToName},
    {2, &LabelValues::ToAddress1},
    {3, &LabelValues::ToAddress2},
    {4, [](V v) { return v.ToSuburb + " " + v.ToState + " " + v.ToPostcode; }},
    {5, &LabelValues::DeliveryInstructions},
    {6, [](V) { return std::string("SIGNATURE ON DELIVERY REQUIRED"); }},
    {7, &LabelValues::ConsignmentNumber},
    {8, &LabelValues::PackOfPacks},
    {9, &LabelValues::PacksLine},
    {10, &LabelValues::ArticleId},
    {11, &LabelValues::ArticleId},
    {12, &LabelValues::ArticleId},
    {13, [](V v) { return "SSCC: " + gs1::SsccText(v.SSCC); }},
    {14, [](V v) { return gs1::SsccData(v.SSCC); }},
    {15, &LabelValues::FromName},
    {16, &LabelValues::FromLine2},
    {17, [](V v) { return v.FromLine3 + " " + v.FromState; }},
    {18, &LabelValues::OrderLine},
    {19, &LabelValues::SalesOrderLine},
    {20, &LabelValues::PackedLine},
}};

constexpr LabelLayout kLayout{"952", kParcel, kBatch};

}  // namespace

AustPostLabelPrinter::AustPostLabelPrinter(std::string_view className)
    : LabelPrinter(className, kLayout) {}

bool AustPostLabelPrinter::FillValues(Procedure& proc) {
  express_ = false;
  if (!LabelPrinter::FillValues(proc)) return false;
  LabelValues& v = values_;
  Ref<host::ConNote> conNote;
  std::int32_t place = 0;
  std::int32_t count = 0;
  return
      // The address goes into quoted fields: no double quotes in it.
      proc([&] {
        for (std::string* part : {&v.ToNameShort, &v.ToName, &v.ToAddress1, &v.ToAddress2,
                                  &v.ToSuburb, &v.ToState, &v.ToPostcode, &v.ToSuburbUpper})
          *part = RemoveInvalidChar(*part);
      }) &&
      proc([&] {
        if (!pack_->ASNId().IsNull()) conNote = pack_->ConNote();
      }) &&
      // Express parcels get the express label; any other service level
      // the parcel one. The manifest charges the consignment as express on
      // the same test.
      proc([&] { express_ = conNote && conNote->ServiceLevel().Text() == "EXPRESS"; }) &&
      // The consignment number as the manifest builds it: the carrier's
      // account and the end of the consignment note's number.
      proc([&] {
        if (!conNote) return;
        Ref<host::Carrier> carrier = conNote->Carrier();
        if (!carrier) carrier = pack_->Carrier();
        v.ConsignmentNumber = pcms::ConsignmentNumber(carrier->AccountRef(), conNote->ConNoteNo());
      }) &&
      proc([&] {
        if (conNote) v.DeliveryInstructions = Left(conNote->DeliveryInstructions().Text(), 60);
      }) &&
      ReadPlace(proc, place, count) &&
      // The k-th carton carries the k-th article of the consignment's
      // manifest entry, so that what the depot scans is what was lodged.
      proc([&] {
        if (!conNote) return;
        v.ArticleId = CreateBarcode(v.ConsignmentNumber, pcms::ArticleCode(place));
        v.PacksLine = std::to_string(count) + " PC";
      });
}

vpcl::Format AustPostLabelPrinter::LabelFormat() { return express_ ? kExpress : kParcel; }

std::string AustPostLabelPrinter::FormatDownload() {
  std::string download;
  const std::string path = GraphicPath(kAustPostGraphicFile);
  if (const std::optional<std::string> rows = ReadGraphic(path)) {
    download.append(kGraphicHeader).append(*rows).append("}");
  } else {
    // The labels still print, only without the carrier's graphic.
    WriteLog(err::kFileNotFound, "Init", "Graphic 99 not sent: cannot read " + path);
  }
  download += PrintVPCLII();
  held_ = RawChannelOpen() ? LabelFormat().name : std::string_view();
  return download;
}

std::string AustPostLabelPrinter::LabelJob() {
  const std::string_view name = LabelFormat().name;
  if (name == held_) return VPCLIIBatchCommand();
  std::string job = held_.empty() ? FormatDownload() : PrintVPCLII();
  held_ = name;
  return job + VPCLIIBatchCommand();
}

}  // namespace quendal
