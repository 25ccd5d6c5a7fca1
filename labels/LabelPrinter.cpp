#include "labels/LabelPrinter.h"

#include <algorithm>
#include <chrono>
#include <cstdint>
#include <cstring>
#include <thread>

#include "frame/Error.h"
#include "frame/VB.h"
#include "labels/VpclLabel.h"
#include "labels/WinPrintDraw.h"
#include "platform/Clock.h"
#include "platform/CodePage.h"
#include "platform/Machine.h"
#include "platform/Settings.h"
#include "platform/Spooler.h"

namespace quendal {

namespace {

constexpr std::string_view kWinPCL = "WinPCL";
constexpr std::string_view kVPCLII = "VPCLII";
constexpr std::string_view kZPL = "ZPL";
// A queue this long counts as full: the next job waits until it drops.
constexpr std::int32_t kQueueFull = 999;
// Between two looks at a full queue: long enough not to busy the processor,
// short enough that the label follows the queue closely.
constexpr auto kQueuePoll = std::chrono::milliseconds(100);

// Two pack ids are the same pack when both are set and equal as numbers
// (or as texts when either is not numeric).
bool SamePackId(const Var& a, const Var& b) {
  if (a.IsNull() || b.IsNull()) return false;
  if (a.IsNumeric() && b.IsNumeric()) return a.Number() == b.Number();
  return a.Text() == b.Text();
}

float TwoDecimals(double value) { return static_cast<float>(Round(value, 2)); }

// A host object several steps of one label read: the first step that needs
// it reads it from the pack, later ones reuse it. Nothing is not kept, so a
// step retried after the host set the member reads it again.
template <class T, class Read>
T& Kept(Ref<T>& kept, Read read) {
  if (!kept) kept = read();
  return *kept;
}

}  // namespace

LabelPrinter::LabelPrinter(std::string_view className, const LabelLayout& layout)
    : ComponentBase(className), formatNumber_(layout.formatNumber), layout_(layout) {
  const std::string name = ComponentBase::ClassName();
  switchName_ = name.substr(name.find('.') + 1);
}

void LabelPrinter::SetUser1(const std::string& value) {
  Guard("Property (Let) User1")([&] { user1_ = Left(value, 30); });
}

void LabelPrinter::SetUser2(const std::string& value) {
  Guard("Property (Let) User2")([&] { user2_ = Left(value, 30); });
}

void LabelPrinter::SetStoreZoneDept(const std::string& value) {
  Guard("Property (Let) StoreZoneDept")([&] { storeZoneDept_ = Left(value, 30); });
}

bool LabelPrinter::IsDrawn() const { return system_->PrinterLanguage().Text() == kWinPCL; }

bool LabelPrinter::DownloadsFormat(const std::string& language) const {
  return language != kWinPCL && !(language == kZPL && SpeaksZpl());
}

bool LabelPrinter::WriteOtherLanguage(const std::string& language) {
  if (language != kZPL || !SpeaksZpl()) return false;
  if (handle_ != 0) WriteChannel(PrintZPL());
  return true;
}

std::string LabelPrinter::PrintZPL() {
  std::string result;
  Procedure proc = Guard("Function PrintZPL");
  proc([&] { result = zpl::Render(layout_.zpl, values_); });
  return result;
}

bool LabelPrinter::Init(const Ref<host::System>& system, const std::string& aPrinter) {
  bool result = false;
  Procedure proc = Guard("Function Init");
  if (!proc([&] {
        printSCMatOpen_ = true;
        oleSubPackComponent_ = false;
        printSCMatClose_ = false;
        validateClose_ = false;
        prepack_ = false;
        componentPrint_ = false;
        system_ = system;
      }))
    return result;
  // Without a printer the object still formats labels.
  if (aPrinter.empty()) return result = true;
  printerName_ = aPrinter;
  formatNumber_ = layout_.formatNumber;

  std::string language;
  if (!proc([&] { language = system_->PrinterLanguage().Text(); })) return result;
  if (!DownloadsFormat(language)) return result = true;

  ChannelScope scope(*this);
  bool opened = false;
  if (!proc([&] { opened = OpenPtr(); }) || !opened) return result;
  std::string format;
  if (!proc([&] { format = FormatDownload(); })) return result;
  if (!proc([&] { WriteChannel(format); })) return result;
  if (!proc([&] { ClosePtr(); })) return result;
  return result = true;
}

bool LabelPrinter::PrintLabel(const Ref<host::Pack>& aPack, std::optional<std::int16_t> Qty,
                              std::optional<bool> ComDirect) {
  bool result = false;
  Procedure proc = Guard("Function PrintLabel");
  // The per-user printing switch of this class, on unless the host turned it off.
  bool printing = false;
  if (!proc([&] {
        printing = TextToFlag(GetSetting("Merivane", "Settings", switchName_, "True"));
      }))
    return result;
  if (!printing) return result;

  ChannelScope scope(*this);
  if (!proc([&] { pack_ = aPack; })) return result;
  if (!proc([&] { copies_ = Qty.value_or(1); })) return result;
  // Sent directly by the host: no job; the values stay for VPCLIIBatchCommand.
  if (!ComDirect.value_or(false)) {
    bool opened = false;
    if (!proc([&] { opened = OpenPtr(); }) || !opened) return result;
  }
  if (!FillValues(proc)) return result;
  proc([&] { result = WriteLabel(); });
  return result;
}

std::string LabelPrinter::PrintVPCLII() {
  std::string result;
  Procedure proc = Guard("Function PrintVPCLII");
  proc([&] { result = vpcl::RenderFormat(formatNumber_, LabelFormat()); });
  return result;
}

vpcl::Format LabelPrinter::LabelFormat() { return layout_.format; }

std::string LabelPrinter::FormatDownload() { return PrintVPCLII(); }

std::string LabelPrinter::LabelJob() { return VPCLIIBatchCommand(); }

std::string LabelPrinter::VPCLIIBatchCommand() {
  std::string result;
  Procedure proc = Guard("Function VPCLIIBatchCommand");
  std::string batchMode;
  if (!proc([&] { batchMode = system_->PrinterBatchMode().Text(); })) return result;
  proc([&] { result = BatchOf(batchMode); });
  return result;
}

std::string LabelPrinter::BatchOf(std::string_view batchMode) const {
  vpcl::Batch batch(formatNumber_, copies_, batchMode);
  for (const BatchField& field : layout_.batch) {
    if (field.sent && !field.sent(values_)) continue;
    if (field.value)
      batch.Field(field.number, values_.*field.value);
    else
      batch.Field(field.number, field.data(values_));
  }
  return std::move(batch).Finish();
}

bool LabelPrinter::ReadPlace(Procedure& proc, std::int32_t& place, std::int32_t& count) {
  place = 0;
  count = 0;
  return proc([&] {
    if (pack_->ASNId().IsNull()) return;
    const Ref<host::PackList> packs = pack_->ConNote()->Packs();
    count = packs->Count();
    place = PlaceAmong(*packs, pack_->PackId());
    if (place == 0) place = ++count;
    values_.PackOfPacks = std::to_string(place) + " of " + std::to_string(count);
  });
}

std::int32_t LabelPrinter::PlaceAmong(host::PackList& packs, const Var& packId) {
  const std::int32_t count = packs.Count();
  for (std::int32_t i = 1; i <= count; ++i)
    if (SamePackId(packs.Item(i)->PackId(), packId)) return i;
  return 0;
}

std::int32_t LabelPrinter::SpooledJobCount(std::int32_t aPrinterHandle) {
  std::int32_t result = 0;
  Procedure proc = Guard("Function SpooledJobCount");
  if (aPrinterHandle == 0) return result;
  proc([&] {
    const std::int32_t count = CurrentSpooler().JobCount(aPrinterHandle, kQueueFull);
    result = count < 0 ? 0 : (count > kQueueFull ? kQueueFull : count);
  });
  return result;
}

bool LabelPrinter::OpenPtr() {
  bool result = false;
  Procedure proc = Guard("Function OpenPtr");
  bool drawn = false;
  if (!proc([&] { drawn = IsDrawn(); })) return result;
  if (!drawn) {
    if (!proc([&] {
          long error = 0;
          handle_ = CurrentSpooler().OpenPrinter(printerName_, error);
          // The label goes on without a printer: it is logged and lost.
          if (handle_ == 0)
            WriteLog(0, "OpenPtr",
                     "Error " + std::to_string(error) + "Unable to open printer " + printerName_);
        }))
      return result;
  } else {
    // The drawn printer must be installed under exactly this name.
    bool installed = false;
    if (!proc([&] {
          for (const InstalledPrinter& printer : CurrentSpooler().InstalledPrinters()) {
            if (printer.name != printerName_) continue;
            twipsPerPixelX_ = TwoDecimals(printer.twipsPerPixelX);
            twipsPerPixelY_ = TwoDecimals(printer.twipsPerPixelY);
            installed = true;
            break;
          }
        }))
      return result;
    if (!installed) return result;
    if (!proc([&] {
          long error = 0;
          dc_ = CurrentSpooler().CreateDC(printerName_, error);
          if (!dc_)
            WriteLog(0, "OpenPtr",
                     "Error " + std::to_string(error) + "Unable to open printer " + printerName_);
        }))
      return result;
  }
  if (!proc([&] { PumpMessages(); })) return result;
  // Hold the job back while the printer's queue is full.
  if (!proc([&] {
        // Mode 2 never waits; any other mode, an unset one included, waits.
        const Var mode = system_->SpoolerMode();
        if (!mode.IsNull() && mode.IsNumeric() && mode.Number() == 2) return;
        while (SpooledJobCount(handle_) >= kQueueFull) {
          std::this_thread::sleep_for(kQueuePoll);
          PumpMessages();
        }
      }))
    return result;
  if (!proc([&] {
        if (handle_ != 0) job_ = CurrentSpooler().StartDoc(handle_, ClassName());
        if (dc_ && dc_->StartDoc(ClassName())) dc_->StartPage();
      }))
    return result;
  return result = true;
}

void LabelPrinter::ClosePtr() {
  Procedure proc = Guard("Sub ClosePtr");
  if (dc_) {
    if (!proc([&] {
          dc_->EndPage();
          dc_->EndDoc();
        }))
      return;
    dc_.reset();
  }
  if (handle_ == 0) return;
  if (!proc([&] { CurrentSpooler().EndDoc(handle_); })) return;
  proc([&] {
    CurrentSpooler().ClosePrinter(handle_);
    handle_ = 0;
    job_ = 0;
  });
}

void LabelPrinter::AbandonChannel() {
  dc_.reset();  // a drawn document that never ended sends nothing
  if (handle_ == 0) return;
  const std::int32_t handle = handle_;
  handle_ = 0;
  job_ = 0;
  try {
    CurrentSpooler().ClosePrinter(handle);
  } catch (...) {
    // The job was given up already; nothing else depends on this close.
  }
}

void LabelPrinter::WriteChannel(std::string_view text) {
  if (handle_ == 0) return;
  // Plain ASCII is the same in the code page: written as it is.
  bool ascii = true;
  std::size_t i = 0;
  for (; ascii && i + 8 <= text.size(); i += 8) {
    std::uint64_t word;
    std::memcpy(&word, text.data() + i, sizeof word);
    ascii = (word & 0x8080808080808080ULL) == 0;
  }
  for (; ascii && i < text.size(); ++i) ascii = static_cast<unsigned char>(text[i]) < 0x80;
  if (ascii)
    CurrentSpooler().Write(handle_, text);
  else
    CurrentSpooler().Write(handle_, ToCodePage(text));
}

void LabelPrinter::PrintWinPCL() {
  Procedure proc = Guard("Sub PrintWinPCL");
  std::string format;
  std::string batch;
  // The format and the batch alone, even for a class whose batch command
  // carries its format along.
  if (!proc([&] {
        format = PrintVPCLII();
        batch = BatchOf(system_->PrinterBatchMode().Text());
      }))
    return;
  proc([&] { DrawOnChannel(format, batch); });
}

void LabelPrinter::DrawOnChannel(std::string_view format, std::string_view batch) {
  if (!dc_) return;
  DrawLabel(*dc_, twipsPerPixelX_, twipsPerPixelY_, LayOutLabel(ReadVpclLabel(format, batch)));
}

bool PrintFileLabelPrinter::PrintFile(const std::string& aFormat, const std::string& aBatch) {
  bool result = false;
  Procedure proc = Guard("Function PrintFile");
  std::string language;
  if (!proc([&] { language = system_->PrinterLanguage().Text(); })) return result;
  ChannelScope scope(*this);
  bool opened = false;
  if (!proc([&] { opened = OpenPtr(); }) || !opened) return result;
  // A printer that did not open has been logged; what was handed over is
  // not printed, and the host is told so.
  if (!ChannelOpen()) return result;
  if (!proc([&] {
        if (language != kWinPCL && RawChannelOpen()) WriteChannel(aFormat);
      }))
    return result;
  if (!proc([&] {
        if (language == kWinPCL) {
          DrawOnChannel(aFormat, aBatch);
        } else if (language == kVPCLII) {
          if (RawChannelOpen()) WriteChannel(aBatch);
        } else {
          WriteLog(0, "WriteLabel", language + " unknown.");
        }
      }))
    return result;
  if (!proc([&] { ClosePtr(); })) return result;
  return result = true;
}

bool LabelPrinter::WriteLabel() {
  bool result = false;
  Procedure proc = Guard("Function WriteLabel");
  std::string language;
  if (!proc([&] { language = system_->PrinterLanguage().Text(); })) return result;
  if (!proc([&] {
        if (language == kWinPCL) {
          PrintWinPCL();
          return;
        }
        if (language == kVPCLII) {
          if (handle_ != 0) WriteChannel(LabelJob());
          return;
        }
        if (!WriteOtherLanguage(language)) WriteLog(0, "WriteLabel", language + " unknown.");
      }))
    return result;
  if (!proc([&] { ClosePtr(); })) return result;
  return result = true;
}

bool LabelPrinter::FillValues(Procedure& proc) {
  LabelValues& v = values_;
  // Start from empty values, so that a value skipped at a failure (Ignore)
  // prints empty instead of the previous carton's. The pack's position and
  // authority-to-leave number carry over, as only such labels renew them.
  {
    LabelValues fresh;
    fresh.PackOrdinal = v.PackOrdinal;
    fresh.ATLNumber = std::move(v.ATLNumber);
    v = std::move(fresh);
  }
  bool carrierIdNull = false;
  bool noAsn = false;
  std::string serviceLevel;
  Ref<host::Carrier> carrier;
  Ref<host::Vendor> vendor;
  Ref<host::ConNote> conNote;
  Ref<host::Despatch> despatch;
  const auto Carrier = [&]() -> host::Carrier& {
    return Kept(carrier, [&] { return pack_->Carrier(); });
  };
  const auto Vendor = [&]() -> host::Vendor& {
    return Kept(vendor, [&] { return pack_->Vendor(); });
  };
  const auto ConNote = [&]() -> host::ConNote& {
    return Kept(conNote, [&] { return pack_->ConNote(); });
  };
  const auto Despatch = [&]() -> host::Despatch& {
    return Kept(despatch, [&] { return pack_->Despatch(); });
  };
  const bool filled =
      proc([&] { v.AuthorityToLeave = InStr(Carrier().Options().Text(), "#%ATL") > 0; }) &&
      proc([&] { v.FromName = Left(Vendor().Name().Text(), 25); }) &&
      proc([&] { v.FromLine2 = Left(Vendor().AddressLine2().Text(), 25); }) &&
      proc([&] { v.FromLine3 = Left(Vendor().AddressLine3().Text(), 25); }) &&
      proc([&] { v.FromState = Left(Vendor().State().Text(), 3); }) &&
      proc([&] {
        const Var id = pack_->CarrierId();
        carrierIdNull = id.IsNull();
        v.LabelCarrierId = carrierIdNull ? pack_->Receiver()->CarrierId().Text() : id.Text();
      }) &&
      proc([&] {
        v.CarrierName = Left(carrierIdNull ? pack_->Receiver()->Carrier()->Name().Text()
                                           : Carrier().Name().Text(),
                             20);
      }) &&
      // Without an advance shipping notice there is no consignment to print.
      proc([&] { noAsn = pack_->ASNId().IsNull(); }) &&
      proc([&] {
        if (!noAsn) v.ConNoteNo = Left(ConNote().ConNoteNo().Text(), 13);
      }) &&
      proc([&] {
        if (!noAsn) v.ServiceLine = "SERVICE:" + ConNote().Service().Text();
      }) &&
      proc([&] {
        if (!noAsn) serviceLevel = ConNote().ServiceLevel().Text();
      }) &&
      ReadDeliveryAddress(proc) &&
      proc([&] { v.ToSuburbUpper = UCase(v.ToSuburb); }) &&
      proc([&] { v.PostcodeServiceLine = v.ToPostcode + " " + serviceLevel; }) &&
      proc([&] { v.CountryCode = Left(pack_->ShipTo()->CountryCode().Text(), 3); }) &&
      proc([&] {
        v.UserText1 = Left(user1_, 30);
        v.UserText2 = Left(user2_, 30);
        v.StoreZoneDept = storeZoneDept_;
      }) &&
      proc([&] { v.SSCC = Right(pack_->SSCC().Text(), 18); }) &&
      proc([&] { v.OrderLine = "PO " + Left(Despatch().DespatchNo().Text(), 22); }) &&
      proc([&] {
        const std::string salesOrder = pack_->SalesOrderNo().Text();
        v.SalesOrderLine = Trim(salesOrder).empty() ? std::string() : "SO " + salesOrder;
      }) &&
      // A pallet gets a label on each side and a spare.
      proc([&] { copies_ = InStr(pack_->Carton()->Code().Text(), "PLT") > 0 ? 5 : 1; }) &&
      proc([&] {
        v.NotBeforeLine = "Not Before  " + Format(Despatch().NotBefore(), "dd/mm/yy");
      }) &&
      proc([&] {
        v.NotAfterLine = "Not After   " + Format(Despatch().NotAfter(), "dd/mm/yy");
      }) &&
      proc([&] { v.PackedLine = "Date Packed " + Format(Var(Today()), "dd/mm/yy"); });
  if (!filled) return false;
  if (!v.AuthorityToLeave) return true;
  return proc([&] {
           // The pack's place among its consignment's packs; the last place
           // when it is not among them.
           const Ref<host::PackList> packs = ConNote().Packs();
           std::int32_t ordinal = PlaceAmong(*packs, pack_->PackId());
           if (ordinal == 0) ordinal = packs->Count();
           if (ordinal > INT16_MAX || ordinal < INT16_MIN) throw Error(err::kOverflow);
           v.PackOrdinal = static_cast<std::int16_t>(ordinal);
         }) &&
         proc([&] { v.ATLNumber = "C" + Format(Var(v.PackOrdinal), "000000000"); });
}

bool LabelPrinter::ReadDeliveryAddress(Procedure& proc) {
  LabelValues& v = values_;
  Ref<host::Receiver> store;
  std::string code;
  bool fromOrder = false;
  std::string name, line1, line2, suburb, state, postcode;
  return proc([&] { store = host::CurrentLibrary().NewReceiver(); }) &&
         // The pack's own store code, unless it names the distribution
         // centre (or nothing) and the receiver has a store code of its own.
         proc([&] {
           const std::string packStore = pack_->StoreCode().Text();
           const std::string receiverStore = pack_->Receiver()->StoreCode().Text();
           code = ((packStore.empty() || packStore == "DC") && Len(receiverStore) > 1)
                      ? receiverStore
                      : packStore;
         }) &&
         proc([&] { store->SetCode(Var(code)); }) &&
         proc([&] { store->SetPartnerId(pack_->PartnerId()); }) &&
         proc([&] {
           if (store->Load()) store->Refresh();
         }) &&
         proc([&] { fromOrder = !Trim(pack_->Order()->DeliveryAddress()->Name().Text()).empty(); }) &&
         proc([&] {
           if (fromOrder) {
             const Ref<host::Address> address = pack_->Order()->DeliveryAddress();
             name = address->Name().Text();
             line1 = address->Line1().Text();
             line2 = address->Line2().Text();
             suburb = address->Suburb().Text();
             state = address->State().Text();
             postcode = address->Postcode().Text();
           } else {
             name = store->Name().Text();
             line1 = store->AddressLine1().Text();
             line2 = store->AddressLine2().Text();
             suburb = store->Suburb().Text();
             state = store->State().Text();
             postcode = store->Postcode().Text();
           }
         }) &&
         proc([&] {
           v.ToNameShort = UCase(Left(Trim(name), 25));
           v.ToName = UCase(Left(Trim(name), 40));
           v.ToAddress1 = UCase(Left(Trim(line1), 40));
           v.ToAddress2 = UCase(Left(line2, 40));
           v.ToSuburb = UCase(Left(suburb, 34));
           v.ToState = UCase(Left(state, 3));
           v.ToPostcode = fromOrder ? UCase(Left(postcode, 4)) : Left(postcode, 4);
         });
}

}  // namespace quendal
