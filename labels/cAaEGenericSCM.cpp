#include "labels/cAaEGenericSCM.h"

#include "frame/VB.h"
#include "labels/AaEServices.h"

namespace quendal {

namespace {

using namespace vpcl;

constexpr std::string_view kBoxPattern = "11111111";

// The format is built for each label; it has no batch fields.
constexpr LabelLayout kLayout{"460", vpcl::Format{"AAE", 600, 400, {}}, {}};

}  // namespace

clsAaEGenericSCM::clsAaEGenericSCM() : LabelPrinter("clsAaEGenericSCM", kLayout) {}

std::unique_ptr<Component> MakeAaEGenericSCM() { return std::make_unique<clsAaEGenericSCM>(); }

// The label carries its own format, so no printer keeps one.
bool clsAaEGenericSCM::DownloadsFormat(const std::string&) const { return false; }

std::string clsAaEGenericSCM::VPCLIIBatchCommand() {
  std::string result;
  Procedure proc = Guard("Function VPCLIIBatchCommand");
  std::string format;
  if (!proc([&] { format = PrintVPCLII(); }) || format.empty()) return result;
  proc([&] {
    format += BatchOf(system_->PrinterBatchMode().Text());
    result = std::move(format);
  });
  return result;
}

bool clsAaEGenericSCM::FillValues(Procedure& proc) {
  serviceCode_.clear();
  article_.clear();
  weight_.clear();
  place_.clear();
  sender_.clear();
  if (!LabelPrinter::FillValues(proc)) return false;
  const LabelValues& v = values_;
  Ref<host::ConNote> conNote;
  std::string articleCode;
  std::int32_t place = 0;
  std::int32_t count = 0;
  return
      // One label a carton, pallets too: the batch that follows the format prints one.
      proc([&] { copies_ = 1; }) && proc([&] {
        if (!pack_->ASNId().IsNull()) conNote = pack_->ConNote();
      }) &&
      proc([&] {
        if (!conNote) return;
        serviceCode_ = ServiceCode(conNote);
        articleCode = ArticleCode(conNote);
      }) &&
      ReadPlace(proc, place, count) &&
      // The service's article code and the carton's place in its consignment.
      proc([&] {
        if (conNote) article_ = Left(articleCode + quendal::Format(Var(place), "00000"), 8);
      }) &&
      proc([&] {
        const Var weight = pack_->Weight();
        if (weight.IsNumeric()) weight_ = quendal::Format(Var(weight.Number()), "0.00") + " KG";
      }) &&
      proc([&] {
        place_ = v.ToSuburb + " " + v.ToState + " " + v.ToPostcode;
        sender_ = v.FromLine3 + " " + v.FromState;
      });
}

vpcl::Format clsAaEGenericSCM::LabelFormat() {
  const LabelValues& v = values_;
  // 600 x 400: the receiver in the top box, the service, consignment,
  // weight and carton in the middle one, the sender and references in the
  // bottom one, the carrier's name down the right-hand band, the barcode
  // and the receiver's postcode under the boxes.
  packets_ = {
      Text{550, 12, 2, 1, 1, 'B', 'L', 0, v.ToName},
      Text{532, 12, 2, 1, 1, 'B', 'L', 0, v.ToAddress1},
      Text{514, 12, 2, 1, 1, 'B', 'L', 0, v.ToAddress2},
      Text{488, 12, 3, 1, 1, 'B', 'L', 0, place_},
      Text{395, 15, 3, 3, 3, 'B', 'L', 0, serviceCode_},
      Text{445, 190, 3, 1, 1, 'B', 'L', 0, v.ConNoteNo},
      Text{415, 220, 3, 1, 1, 'B', 'L', 0, weight_},
      Text{385, 220, 3, 1, 1, 'B', 'L', 0, v.PackOfPacks},
      Text{345, 15, 1, 1, 1, 'O', 'L', 0, v.PackedLine},
      Text{305, 12, 2, 1, 1, 'B', 'L', 0, v.FromName},
      Text{289, 12, 1, 1, 1, 'O', 'L', 0, v.FromLine2},
      Text{277, 12, 1, 1, 1, 'O', 'L', 0, sender_},
      Text{250, 115, 1, 1, 1, 'B', 'L', 0, v.OrderLine},
      Text{236, 115, 1, 1, 1, 'B', 'L', 0, v.SalesOrderLine},
      Text{212, 12, 1, 1, 1, 'O', 'L', 0, v.UserText1},
      Text{198, 12, 1, 1, 1, 'O', 'L', 0, v.UserText2},
      Text{95, 12, 3, 2, 2, 'B', 'L', 0, v.ToPostcode},
      Text{55, 12, 3, 1, 1, 'B', 'L', 0, v.ToState},
      Text{18, 185, 1, 1, 1, 'B', 'L', 0, article_},
      Barcode{1, 8, 'F', 35, 179, 6, 100},
      FixedData{1, article_},
      Box{175, 351, 591, 385, 4, kBoxPattern},
      Box{470, 5, 591, 345, 4, kBoxPattern},
      Box{330, 5, 465, 345, 4, kBoxPattern},
      Box{175, 5, 325, 345, 4, kBoxPattern},
      Text{585, 357, 3, 1, 1, 'B', 'L', 3, "AUSTRALIAN AIR EXPRESS"},
      Text{575, 12, 1, 1, 1, 'O', 'L', 0, "AUSTALIAN AIR EXPRESS DELIVER TO:"},
      Text{415, 150, 1, 1, 1, 'O', 'L', 0, "WEIGHT"},
      Text{250, 12, 1, 1, 1, 'O', 'L', 0, "SENDER REF: "},
      Text{445, 150, 1, 1, 1, 'O', 'L', 0, "C/N:"},
  };
  return vpcl::Format{"AAE", 600, 400, packets_};
}

}  // namespace quendal
