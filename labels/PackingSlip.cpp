// Packing-slip work at a portable data terminal: the lookup line the
// terminal loads for a slip line, and the check whether a scanned article
// may go into a pack.
#include <array>
#include <numeric>

#include "frame/VB.h"
#include "frame/host/Read.h"
#include "labels/LabelPrinter.h"

namespace quendal {

namespace {

using host::Read;

// The fixed-width line's fields, in order; the terminal's record is 244
// characters, the fields taking the first 196 and spaces the rest.
constexpr std::array<int, 16> kDensoWidths = {7, 6, 10, 22, 20, 13, 20, 13, 20, 20, 10, 6, 6, 1, 16, 6};
constexpr int kDensoRecord = 244;
static_assert(std::accumulate(kDensoWidths.begin(), kDensoWidths.end(), 0) <= kDensoRecord);

// Why System.LastError holds what it holds while a pack line is checked.
constexpr int kSlipNotExamined = 8101;
constexpr int kPackNotOfOrder = 8106;
constexpr int kArticleNotOnSlip = 8102;
constexpr int kLineFull = 8103;
constexpr int kMayPack = 0;

// One slip line's values as the terminal shows them.
struct SlipValues {
  std::string vendorCode, customer, lineNo, orderNo, reference, storeNo, receiverName, apn, text1,
      text2, text3, qty, componentItem, componentQty;
};

// A line break or tab would split the terminal's record: they become spaces.
std::string OneLine(std::string text) {
  for (char& c : text)
    if (static_cast<unsigned char>(c) < 0x20 || c == 0x7F) c = ' ';
  return text;
}

std::string DensoLine(const SlipValues& s) {
  const std::array<const std::string*, 16> fields = {
      &s.vendorCode, &s.customer, &s.lineNo, &s.orderNo, &s.reference, &s.storeNo,
      &s.receiverName, &s.apn, &s.text1, &s.text2, &s.text3, &s.qty, nullptr, nullptr,
      &s.componentItem, &s.componentQty};
  static const std::string kSpaces;
  static const std::string kZero = "0";
  std::string line;
  for (std::size_t i = 0; i < fields.size(); ++i) {
    // Field 13 is spaces and field 14 the digit 0.
    const std::string& value = fields[i] ? *fields[i] : (i == 13 ? kZero : kSpaces);
    const std::string cut = Left(OneLine(value), kDensoWidths[i]);
    line += cut + Spaces(kDensoWidths[i] - Len(cut));
  }
  return line + Spaces(kDensoRecord - Len(line));
}

std::string VeltrinLine(const SlipValues& s) {
  // A comma inside a value would move every later value one place on.
  const auto value = [](const std::string& text) { return Replace(OneLine(text), ",", " "); };
  const std::array<std::string, 11> values = {
      s.vendorCode, s.lineNo, s.customer, s.orderNo, s.reference, s.storeNo, Trim(s.apn), s.qty,
      s.text1, Left(s.componentItem, 16), Left(s.componentQty, 6)};
  std::string line;
  for (std::size_t i = 0; i < values.size(); ++i) line += (i ? "," : "") + value(values[i]);
  return line;
}

}  // namespace

std::string LabelPrinter::PDTFieldLength() const {
  std::string widths;
  for (int width : kDensoWidths) widths += (widths.empty() ? "" : ",") + std::to_string(width);
  return widths;
}

std::string LabelPrinter::PDTLookupLine(const Ref<host::Job>& aJob,
                                        const Ref<host::PSlipLine>& aPSlipLine) {
  std::string result;
  Procedure proc = Guard("Function PDTLookupLine");
  std::string type;
  if (!proc([&] { type = system_->PDTType().Text(); })) return result;
  const bool denso = type == "Denso";
  if (!denso && type != "Veltrin6030") return result;

  SlipValues s;
  // The slip line's own order when it has one; else its despatch.
  Ref<host::Order> order;
  Ref<host::Despatch> despatch;
  Ref<host::Receiver> receiver;
  Ref<host::Product> product;
  bool components = false;
  const bool read =
      proc([&] { order = aPSlipLine->Order(); }) &&
      proc([&] {
        if (!order) despatch = aPSlipLine->Despatch();
        receiver = order ? Read(order, &host::Order::Receiver)
                         : Read(despatch, &host::Despatch::Receiver);
      }) &&
      proc([&] {
        s.vendorCode = order ? order->VendorCode().Text()
                             : Read(Read(despatch, &host::Despatch::Vendor), &host::Vendor::VendorCode).Text();
      }) &&
      proc([&] { s.customer = aJob->Customer().Text(); }) &&
      proc([&] { s.lineNo = aPSlipLine->LineNo().Text(); }) &&
      proc([&] {
        s.orderNo = order ? order->OrderNo().Text() : Read(despatch, &host::Despatch::DespatchNo).Text();
      }) &&
      proc([&] { s.reference = aJob->Reference().Text(); }) &&
      proc([&] {
        Var store = order ? order->StoreNo() : Var();
        if (Trim(store.Text()).empty()) store = Read(receiver, &host::Receiver::StoreCode);
        s.storeNo = Format(store, "0000");
      }) &&
      proc([&] { s.receiverName = Read(receiver, &host::Receiver::Name).Text(); }) &&
      proc([&] { s.apn = aPSlipLine->APN().Text(); }) &&
      proc([&] { product = aPSlipLine->Product(); }) &&
      proc([&] {
        s.text1 = Read(product, &host::Product::Text1).Text();
        s.text2 = Read(product, &host::Product::Text2).Text();
        s.text3 = Read(product, &host::Product::Text3).Text();
      }) &&
      proc([&] { s.qty = aPSlipLine->Qty().Text(); }) &&
      proc([&] { components = host::IsTrue(Read(product, &host::Product::HasComponents)); }) &&
      proc([&] {
        if (!components) return;
        s.componentItem = product->ComponentItem().Text();
        s.componentQty = product->ComponentQty().Text();
      });
  if (!read) return result;
  proc([&] { result = denso ? DensoLine(s) : VeltrinLine(s); });
  return result;
}

Var LabelPrinter::PackLineValid(const Var& aPSlip, const Var& aPack, const Var& aAPN,
                                const Var& aQty, std::int16_t* aError, std::int32_t aLineId) {
  Procedure proc = Guard("Function PackLineValid");
  // Asked with an order, the answer is the slip line (Null for none); asked
  // with an order number, the line's number (0 for none).
  const bool byNumber = !aPSlip.IsObject();
  Var result = byNumber ? Var(0) : Var();
  const auto lastError = [&](int code) { system_->SetLastError(Var(code)); };
  Ref<host::Order> order;
  Ref<host::Pack> pack;
  bool packGiven = false;
  double qty = 1;
  std::string apn;
  [[maybe_unused]] const bool checked =
      proc([&] { lastError(kSlipNotExamined); }) &&
      proc([&] {
        if (!byNumber) {
          order = host::Object::As<host::Order>(aPSlip);
          return;
        }
        Ref<host::Order> loaded = host::CurrentLibrary().NewOrder();
        loaded->SetOrderNo(aPSlip);
        if (loaded->Load()) order = loaded;
      }) &&
      // A slip that can't be found can't be examined.
      static_cast<bool>(order) &&
      proc([&] {
        packGiven = aPack.IsObject() || !(aPack.IsNull() || Trim(aPack.Text()).empty() ||
                                          (aPack.IsNumeric() && aPack.Number() == 0));
        if (aPack.IsObject()) {
          pack = host::Object::As<host::Pack>(aPack);
        } else if (packGiven) {
          // A pack number that names no pack belongs to no order.
          Ref<host::Pack> loaded = host::CurrentLibrary().NewPack();
          loaded->SetPackId(aPack);
          if (loaded->Load()) pack = loaded;
        }
      }) &&
      proc([&] {
        qty = aQty.IsNull() ? 1 : aQty.Number();
        apn = aAPN.Text();
      }) &&
      proc([&] { lastError(kPackNotOfOrder); }) &&
      proc([&] {
        if (!packGiven) return true;
        const Ref<host::Order> packOrder = pack ? pack->Order() : Ref<host::Order>();
        return packOrder && host::SameValue(packOrder->OrderNo(), order->OrderNo());
      }) &&
      proc([&] { lastError(kMayPack); }) && proc([&] { lastError(kArticleNotOnSlip); }) &&
      proc([&] {
        // The first line of the article that still has room.
        const Ref<host::SlipLines> lines = order->SlipLines();
        for (const Ref<host::PSlipLine>& line : *lines) {
          if (aLineId != 0 && !host::SameValue(line->LineNo(), Var(aLineId))) continue;
          if (line->APN().Text() != apn) continue;
          lastError(kLineFull);
          if (line->QtyPacked().NumberOr(0) + qty <= line->Qty().NumberOr(0)) {
            lastError(kMayPack);
            result = byNumber ? line->LineNo() : Var(line.ptr());
            return;
          }
        }
      });
  if (aError)
    proc([&] { *aError = static_cast<std::int16_t>(system_->LastError().NumberOr(kSlipNotExamined)); });
  return result;
}

}  // namespace quendal
