// Carrier record layouts as text: the layout file is the text form of the
// record builder's field lists, so a site can bring a carrier file in line
// with the carrier's current file description without a new build.
//
//   # comments start with "#"; blank lines are ignored
//   format fixed                 (or: format delimited tab | format delimited ",")
//   record consignment           (header, consignment, pack or trailer)
//     "40"                       a literal; "" inside writes one quote
//     date "YYMMDD" ConNote.ConNoteDate
//     cut 12 ConNote.ConNoteNo   exactly 12 characters
//     number "0000.0" ConNote.Weight or "000000"
//     spaces 20
//
// A header record is written when the file is new, consignment records once
// per consignment, pack records once per pack, and trailer records stay the
// last lines of the file: each consignment replaces them.
#pragma once

#include <cstdint>
#include <deque>
#include <memory>
#include <span>
#include <string>
#include <string_view>
#include <vector>

#include "carrierfiles/FixedRecord.h"
#include "frame/host/Host.h"

namespace quendal {

// A layout file larger than this is refused: a real one is a few kilobytes.
inline constexpr std::size_t kLayoutFileLimit = 64 * 1024;

enum class RecordWhen : std::uint8_t { Header, Consignment, Pack, Trailer };

// The host object a value is read from. In consignment, header and trailer
// records Pack, Carton, Despatch, Order and DeliveryAddress are those of the
// consignment's first pack; in pack records those of the pack.
enum class ValueRoot : std::uint8_t {
  ConNote,
  ASN,
  Pack,
  Carton,
  Despatch,
  Order,
  DeliveryAddress,
  Receiver,
  Carrier,
  Vendor,
  Partner,
  Computed,
};

// Values the library works out for the consignment.
enum class ComputedValue : std::uint8_t {
  ServiceCode,     // the carrier's service code (the trimmed service where it has no table)
  PackCount,       // packs of the consignment
  PackNo,          // the pack's position in the consignment (pack records only)
  TotalWeight,     // carton weights, or the pack's weight where its carton has none
  Now,             // the date and time of writing
  ManifestNumber,  // the run's manifest number (empty outside a manifest run)
  FileName,        // the carrier file's name, without folder
};

struct ValueSource {
  ValueRoot root = ValueRoot::ConNote;
  std::string_view member;  // the host member's name; empty for computed values
  ComputedValue computed = ComputedValue::Now;
};

struct LayoutRecord {
  RecordWhen when = RecordWhen::Consignment;
  std::vector<record::Field> fields;
  std::vector<ValueSource> sources;  // one per field that takes a value, in order
};

// A layout read from its text. Its fields' texts live in the layout itself,
// so it is shared, never copied.
class Layout {
 public:
  Layout() = default;
  Layout(const Layout&) = delete;
  Layout& operator=(const Layout&) = delete;

  bool delimited = false;
  char delimiter = '\t';
  std::vector<LayoutRecord> records;

  bool Has(RecordWhen when) const;
  std::size_t Count(RecordWhen when) const;
  // Keeps a text for the layout's fields to refer to.
  std::string_view Keep(std::string text) { return texts_.emplace_back(std::move(text)); }

 private:
  std::deque<std::string> texts_;
};

// Where a layout file went wrong: 1-based line and column of the text.
struct LayoutProblem {
  int line = 0;
  int column = 0;
  std::string message;
};

struct LayoutRead {
  std::shared_ptr<const Layout> layout;  // null when the text was refused
  LayoutProblem problem;
};

// Reads a layout file's bytes (UTF-8, with or without byte-order mark; any
// line ends). Every value it names must be known; nothing is guessed.
LayoutRead ReadLayout(std::string_view bytes);

// "FILE line L column C: message".
std::string ProblemText(std::string_view file, const LayoutProblem& problem);

// What one consignment offers to its records.
struct LayoutValues {
  Ref<host::ConNote> conNote;
  Ref<host::ASN> asn;
  Ref<host::PackList> packs;
  std::string serviceCode;
  std::int32_t packCount = 0;
  double totalWeight = 0;
  DateTime now;
  Var manifestNumber;
  std::string fileName;
};

// The record as one line (UTF-8, without line end) for the pack (Nothing:
// the first pack) at position packNo.
std::string RenderRecord(const Layout& layout, const LayoutRecord& record,
                         const LayoutValues& values, const Ref<host::Pack>& pack,
                         std::int32_t packNo);

// The layout the library ships for a class ("clsIpecDA1250"), empty when
// it ships none; and the classes it ships layouts for.
std::string_view DefaultLayout(std::string_view className);
std::vector<std::string_view> DefaultLayoutClasses();

}  // namespace quendal
