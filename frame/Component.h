// The three families through which the host drives a class: label,
// consignment and rows. A created object is a Component; the host reaches
// its family interface with as<>().
#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "frame/Var.h"
#include "frame/host/Host.h"

namespace quendal {

class Component {
 public:
  virtual ~Component() = default;
  // The programmatic identifier, "Quendal." + class name.
  virtual std::string ClassName() const = 0;
};

template <class Interface>
Interface* as(Component* component) {
  return dynamic_cast<Interface*>(component);
}
template <class Interface>
Interface* as(const std::unique_ptr<Component>& component) {
  return dynamic_cast<Interface*>(component.get());
}

// The list of log-entry ids a call hands back (vtErrorLog).
using LogList = std::vector<std::int32_t>;

// A two-dimensional table of values indexed (row, column) from 0: the
// column definitions and the rows of the row interface.
class Grid {
 public:
  Grid() = default;
  Grid(std::size_t rows, std::size_t columns) { Resize(rows, columns); }
  void Resize(std::size_t rows, std::size_t columns) {
    rows_ = rows;
    columns_ = columns;
    cells_.assign(rows * columns, Var());
  }
  std::size_t Rows() const { return rows_; }
  std::size_t Columns() const { return columns_; }
  Var& operator()(std::size_t row, std::size_t column) { return cells_.at(row * columns_ + column); }
  const Var& operator()(std::size_t row, std::size_t column) const {
    return cells_.at(row * columns_ + column);
  }

 private:
  std::size_t rows_ = 0;
  std::size_t columns_ = 0;
  std::vector<Var> cells_;
};

// A label class prints one carton label per pack on the printer named at Init.
class LabelInterface : public virtual Component {
 public:
  virtual bool PrintSCMatOpen() const = 0;
  virtual void SetPrintSCMatOpen(bool value) = 0;
  virtual bool OLESubPackComponent() const = 0;
  virtual void SetOLESubPackComponent(bool value) = 0;
  virtual bool PrintSCMatClose() const = 0;
  virtual void SetPrintSCMatClose(bool value) = 0;
  virtual bool Prepack() const = 0;
  virtual void SetPrepack(bool value) = 0;
  virtual bool PrePackComplete() const = 0;
  virtual void SetPrePackComplete(bool value) = 0;
  virtual std::string PrePackStyle() const = 0;
  virtual void SetPrePackStyle(const std::string& value) = 0;
  virtual bool ValidateClose() const = 0;
  virtual void SetValidateClose(bool value) = 0;
  virtual void SetUser1(const std::string& value) = 0;
  virtual void SetUser2(const std::string& value) = 0;
  virtual void SetComponentPrint(bool value) = 0;
  virtual void SetComponentItem(std::int16_t value) = 0;
  virtual void SetComponentCount(std::int16_t value) = 0;
  virtual void SetComponentStyle(const std::string& value) = 0;
  virtual void SetStoreZoneDept(const std::string& value) = 0;
  virtual std::string PDTFieldLength() const = 0;

  virtual bool Init(const Ref<host::System>& system, const std::string& aPrinter = {}) = 0;
  virtual bool PrintLabel(const Ref<host::Pack>& aPack, std::optional<std::int16_t> Qty = {},
                          std::optional<bool> ComDirect = {}) = 0;
  virtual std::string VPCLIIBatchCommand() = 0;
  virtual std::string PrintVPCLII() = 0;
  virtual std::int32_t SpooledJobCount(std::int32_t aPrinterHandle) = 0;
  // Draws the last label on the drawn printer opened for it ("WinPCL").
  virtual void PrintWinPCL() = 0;

  // Prints a separator label between groups of cartons (a new store, item
  // or location) on the named printer: up to five lines of the message,
  // whose lines are separated by line breaks. False when the printer does
  // not open.
  virtual bool Separator(const std::string& aPrinterId, const std::string& aMessage) = 0;
  // The line a portable data terminal loads for one packing-slip line of a
  // job, in the form System.PDTType names; empty for an unknown type.
  virtual std::string PDTLookupLine(const Ref<host::Job>& aJob,
                                    const Ref<host::PSlipLine>& aPSlipLine) = 0;
  // Whether aQty (Null: 1) of the scanned article aAPN may be packed into
  // aPack (a Pack, a pack id, or Null for any pack) from the packing slip
  // aPSlip (an Order, or an order number). System.LastError tells why not:
  // 8101 the slip could not be examined, 8106 the pack is not of that
  // order, 8102 no line carries the article, 8103 every such line is full,
  // 0 it may be packed; aError receives it too. A non-zero aLineId limits
  // the match to that line. Returns the matching PSlipLine (Null when none)
  // for an Order, the line's LineNo (0 when none) for an order number.
  virtual Var PackLineValid(const Var& aPSlip, const Var& aPack, const Var& aAPN,
                            const Var& aQty = Var(), std::int16_t* aError = nullptr,
                            std::int32_t aLineId = 0) = 0;
};

// Label classes that print a whole pack list as one job, with separators.
class PackListInterface : public virtual Component {
 public:
  // The separator's format and batch as text, for inclusion in a longer job.
  virtual std::string RatioSeparator(const std::string& aMessage) = 0;
  // The label of every pack of the list in one job, in list order or
  // sorted by style, with a separator before each new order when wanted.
  virtual bool PrintAllLabels(const Ref<host::PackList>& aPackList, bool bSeperator,
                              bool bStyleSort) = 0;
};

// A label class that also prints a format and batch the host hands over as text.
class PrintFileInterface : public virtual Component {
 public:
  // Sends the format as it is (drawn printers draw format and batch
  // instead), then the batch; false when nothing reached a printer.
  virtual bool PrintFile(const std::string& aFormat, const std::string& aBatch) = 0;
};

// The BigW label classes keep a setting for the host: whether an SSCC needs
// an advance shipping notice. The class stores it and gives it back; it
// does not act on it.
class AsnRequiredInterface : public virtual Component {
 public:
  virtual bool ASNRequiredForSSCC() const = 0;
  virtual void SetASNRequiredForSSCC(bool value) = 0;
};

// Members shared by consignment and row classes.
class LifecycleInterface {
 public:
  virtual ~LifecycleInterface() = default;
  virtual bool PROCESSALL() const = 0;
  virtual void SetPROCESSALL(bool value) = 0;
  // A new host Log bound to the last entry this object wrote (ID 0 before any).
  virtual Ref<host::Log> Log() = 0;
  // Closes an output file the object holds open.
  virtual void Cancel() = 0;
  virtual bool Term() = 0;
};

// A consignment class appends one consignment per Process call to its carrier's file.
class ConsignmentInterface : public virtual Component, public virtual LifecycleInterface {
 public:
  virtual void Process(const Ref<host::System>& objSystem, const Ref<host::ConNote>& objConNote,
                       const Ref<host::ASN>& objASN, const Ref<host::PackList>& lstPacks,
                       LogList& vtErrorLog) = 0;
};

// A row class lists consignments as grid rows and writes the chosen rows.
class RowInterface : public virtual Component, public virtual LifecycleInterface {
 public:
  virtual bool Init(const Ref<host::System>& system, std::int16_t EDIDocId, Grid& Columns) = 0;
  virtual std::int32_t Load(const std::string& a_sFileName, Grid& a_vtRows) = 0;
  virtual std::int32_t Process(std::int32_t a_lRowNum, LogList& vtErrorLog) = 0;
};

// The consolidated manifest ("Consignment Summary Print") that the driver
// signs at pickup, offered by the manifest and end-of-day classes that print it.
class ConsolidatedManifestInterface : public virtual Component {
 public:
  // Results of ConsolidatedManifestPrint.
  static constexpr std::int16_t kProduced = 0;
  static constexpr std::int16_t kNoList = 1;      // the host gave no consignment list
  static constexpr std::int16_t kEmptyList = 2;   // the list holds no consignment
  static constexpr std::int16_t kNotProduced = 3; // the document could not be printed or kept

  // Prints the summary of the class's consignments: those of its own
  // manifest, or those dated aBeginDate to aEndDate (inclusive) of the
  // vendor and carrier codes. aReportOption 1 prints straight to the
  // System's document printer; 0 and 2 keep the document for the user to
  // see (ConsolidatedManifestFile). A non-empty aHTMLFileName also gets an
  // HTML copy.
  virtual std::int16_t ConsolidatedManifestPrint(const std::string& aBeginDate,
                                                 const std::string& aEndDate,
                                                 const std::string& aVendorId,
                                                 const std::string& aCarrierId,
                                                 std::int16_t aReportOption,
                                                 const std::string& aHTMLFileName) = 0;
  // Where the last summary kept for the user to see was written (a PDF); empty when none.
  virtual std::string ConsolidatedManifestFile() const = 0;
};

}  // namespace quendal
