// The frame every label class is built on: the label interface's
// properties, the print flow (Init downloads the class's VPCL II format;
// PrintLabel reads the switch, opens the printer channel, fills the label
// values and writes the batch), the printer channel over the spooler, and
// the label values record the writers read.
//
// A label class supplies its constants (class name, format number), its
// format as a list of packets, its batch fields as a table over
// LabelValues, and, where it reads the host differently, its own
// FillValues.
#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <span>
#include <string>
#include <string_view>

#include "frame/ComponentBase.h"
#include "platform/DeviceContext.h"
#include "labels/LabelValues.h"
#include "labels/Vpcl.h"
#include "labels/Zpl.h"

namespace quendal {

// One field of a batch: its number, its data (a value as it stands, or
// built from the values), and when it is sent (always when `sent` is null).
struct BatchField {
  using Value = std::string LabelValues::*;
  using Data = std::string (*)(const LabelValues&);
  using Sent = bool (*)(const LabelValues&);

  constexpr BatchField(int number, Value value, Sent sent = nullptr)
      : number(number), value(value), sent(sent) {}
  constexpr BatchField(int number, Data data, Sent sent = nullptr)
      : number(number), data(data), sent(sent) {}

  int number;
  Value value = nullptr;
  Data data = nullptr;
  Sent sent = nullptr;
};

// What makes one label class's output its own.
struct LabelLayout {
  std::string_view formatNumber;  // "430"
  vpcl::Format format;
  std::span<const BatchField> batch;
  // The class's ZPL label, for the classes that also drive ZPL printers:
  // they print it for the language "ZPL" and download no format for it.
  zpl::Stream zpl{};
};

class LabelPrinter : public virtual LabelInterface, public ComponentBase {
 public:
  bool PrintSCMatOpen() const override { return printSCMatOpen_; }
  void SetPrintSCMatOpen(bool value) override { printSCMatOpen_ = value; }
  bool OLESubPackComponent() const override { return oleSubPackComponent_; }
  void SetOLESubPackComponent(bool value) override { oleSubPackComponent_ = value; }
  bool PrintSCMatClose() const override { return printSCMatClose_; }
  void SetPrintSCMatClose(bool value) override { printSCMatClose_ = value; }
  bool Prepack() const override { return prepack_; }
  void SetPrepack(bool value) override { prepack_ = value; }
  bool PrePackComplete() const override { return prePackComplete_; }
  void SetPrePackComplete(bool value) override { prePackComplete_ = value; }
  std::string PrePackStyle() const override { return prePackStyle_; }
  void SetPrePackStyle(const std::string& value) override { prePackStyle_ = value; }
  bool ValidateClose() const override { return validateClose_; }
  void SetValidateClose(bool value) override { validateClose_ = value; }
  void SetUser1(const std::string& value) override;
  void SetUser2(const std::string& value) override;
  void SetComponentPrint(bool value) override { componentPrint_ = value; }
  void SetComponentItem(std::int16_t value) override { componentItem_ = value; }
  void SetComponentCount(std::int16_t value) override { componentCount_ = value; }
  void SetComponentStyle(const std::string& value) override { componentStyle_ = value; }
  void SetStoreZoneDept(const std::string& value) override;
  std::string PDTFieldLength() const override;

  bool Init(const Ref<host::System>& system, const std::string& aPrinter = {}) override;
  bool PrintLabel(const Ref<host::Pack>& aPack, std::optional<std::int16_t> Qty = {},
                  std::optional<bool> ComDirect = {}) override;
  std::string VPCLIIBatchCommand() override;
  std::string PrintVPCLII() override;
  std::int32_t SpooledJobCount(std::int32_t aPrinterHandle) override;
  // Draws the last label's format and batch on the open drawn printer.
  void PrintWinPCL() override;
  bool Separator(const std::string& aPrinterId, const std::string& aMessage) override;
  std::string PDTLookupLine(const Ref<host::Job>& aJob,
                            const Ref<host::PSlipLine>& aPSlipLine) override;
  Var PackLineValid(const Var& aPSlip, const Var& aPack, const Var& aAPN, const Var& aQty = Var(),
                    std::int16_t* aError = nullptr, std::int32_t aLineId = 0) override;

  // The ZPL label for the last label's values (one copy, whatever the copy
  // count); empty for a class that does not speak ZPL.
  std::string PrintZPL();
  bool SpeaksZpl() const { return !layout_.zpl.empty(); }

  // The values of the last label, and its copy count.
  const LabelValues& Values() const { return values_; }
  std::int16_t CopyCount() const { return copies_; }
  // The drawn channel's printer resolution, twips per pixel (0 until a
  // drawn printer was opened).
  float TwipsPerPixelX() const { return twipsPerPixelX_; }
  float TwipsPerPixelY() const { return twipsPerPixelY_; }

 protected:
  // layout must outlive the object (a class's constexpr table).
  LabelPrinter(std::string_view className, const LabelLayout& layout);

  // Reads the host objects of the current pack into values_ and sets the
  // copy count, each read a step of the calling procedure (PrintLabel), so
  // that a failing read is reported against it and Retry or Ignore act on
  // that one read. False when the operator left at a failure (Abort).
  virtual bool FillValues(Procedure& proc);
  // Whether Init downloads the format for this printer language.
  virtual bool DownloadsFormat(const std::string& language) const;
  // Writes the label in a language other than "WinPCL" and "VPCLII" to the
  // open channel ("ZPL" for a class with a ZPL label); false when the class
  // does not speak it.
  virtual bool WriteOtherLanguage(const std::string& language);
  // The format of the current label: the layout's own, unless the class
  // picks one by the label's values or builds it from them.
  virtual vpcl::Format LabelFormat();
  // What Init sends to a printer that keeps formats: the format.
  virtual std::string FormatDownload();
  // What one label's VPCL II job sends: the batch.
  virtual std::string LabelJob();
  // The current label's batch, with the printer's batch mode.
  std::string BatchOf(std::string_view batchMode) const;

  // The 1-based place of the pack with this id among the packs; 0 when it
  // is not among them.
  static std::int32_t PlaceAmong(host::PackList& packs, const Var& packId);
  // The current pack's place among its consignment's packs and their
  // number, and "k of N" in the values, as a step of the caller's
  // procedure. A pack its consignment does not list yet counts as joining
  // it last; a pack without a consignment has place and number 0 and no
  // "k of N".
  bool ReadPlace(Procedure& proc, std::int32_t& place, std::int32_t& count);

  // Gives up the channel when the procedure holding it ends early (or has
  // nothing to print), so that no half-written or empty job is queued.
  class ChannelScope {
   public:
    explicit ChannelScope(LabelPrinter& printer) : printer_(printer) {}
    ~ChannelScope() { printer_.AbandonChannel(); }
    ChannelScope(const ChannelScope&) = delete;
    ChannelScope& operator=(const ChannelScope&) = delete;

   private:
    LabelPrinter& printer_;
  };
  // Drops a job left open, so that no printer stays open.
  void AbandonChannel();
  // True while a job is open on a printer (raw or drawn).
  bool ChannelOpen() const { return handle_ != 0 || dc_ != nullptr; }
  bool RawChannelOpen() const { return handle_ != 0; }

  // Draws a VPCL II format and batch on the open drawn printer (nothing
  // when no drawn printer is open), under the calling procedure's guard.
  void DrawOnChannel(std::string_view format, std::string_view batch);

  // The printer channel: one job per call, opened and closed inside it.
  bool OpenPtr();
  void ClosePtr();
  // The text as single-byte code page bytes, in one write to the open job.
  void WriteChannel(std::string_view text);
  bool WriteLabel();

  // The delivery address fields (ToNameShort to ToPostcode), as steps of
  // the caller's procedure: the addressed store is looked up for every
  // label, and the pack's order's delivery address replaces it when it
  // names someone.
  bool ReadDeliveryAddress(Procedure& proc);

  Ref<host::Pack> pack_;
  LabelValues values_;
  std::int16_t copies_ = 0;
  std::string printerName_;
  std::string formatNumber_;
  // The class's printing switch in the settings: its name without the project.
  std::string switchName_;
  std::string user1_;
  std::string user2_;
  std::string storeZoneDept_;
  bool componentPrint_ = false;
  std::int16_t componentItem_ = 0;
  std::int16_t componentCount_ = 0;
  std::string componentStyle_;

 private:
  bool IsDrawn() const;

  const LabelLayout& layout_;
  bool printSCMatOpen_ = false;
  bool oleSubPackComponent_ = false;
  bool printSCMatClose_ = false;
  bool prepack_ = false;
  bool prePackComplete_ = false;
  std::string prePackStyle_;
  bool validateClose_ = false;

  std::int32_t handle_ = 0;
  std::int32_t job_ = 0;
  // The drawn channel's page, while a drawn job is open.
  std::unique_ptr<DeviceContext> dc_;
  float twipsPerPixelX_ = 0;
  float twipsPerPixelY_ = 0;
};

// A label class that also prints a format and batch given as text: the
// format is sent as it stands, then the batch, or both are drawn.
class PrintFileLabelPrinter : public LabelPrinter, public PrintFileInterface {
 public:
  bool PrintFile(const std::string& aFormat, const std::string& aBatch) override;

 protected:
  using LabelPrinter::LabelPrinter;
};

// A label class that also prints a whole pack list as one job, with
// separators between orders (and styles): the frame's RatioSeparator and
// PrintAllLabels, offered to the host.
class PackListLabelPrinter : public LabelPrinter, public PackListInterface {
 public:
  std::string RatioSeparator(const std::string& aMessage) override;
  bool PrintAllLabels(const Ref<host::PackList>& aPackList, bool bSeperator,
                      bool bStyleSort) override;

 protected:
  using LabelPrinter::LabelPrinter;
};

}  // namespace quendal
