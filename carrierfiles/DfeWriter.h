// DFE's despatch advice, written once for the despatch class and the
// manifest run: one XML document per carrier account and day, laid out as
// a serialised data set. Its root "NewDataSet" holds per consignment one
// "Table" (the consignment), its carton lines ("Table1") and one "Table2"
// per pack (the pack's label code); every value is an element's text.
//
// The day's file grows by one consignment per call. The elements already
// in the file stay as they were written; the new ones go in before the
// closing root tag through a TailJournal, so a crash leaves the file as it
// was or with the whole consignment, and the cost of a call does not grow
// with the file. A file that is not such a document (it does not parse,
// has another root, is in another encoding or does not end in its root's
// closing tag) is never touched: it is logged and the consignment goes to
// the next free name beside it ("name_2.XML", ...).
//
// The file is UTF-8 without a byte-order mark: its declaration,
// "<?xml version='1.0'?>", names no encoding, and UTF-8 is what XML reads
// then. Host texts are made well-formed ("&" and "<" escaped, control
// characters as spaces, malformed UTF-8 replaced); letters outside ASCII
// are written as they are.
#pragma once

#include <cstdint>
#include <functional>
#include <map>
#include <optional>
#include <pugixml.hpp>
#include <string>
#include <string_view>
#include <unordered_set>
#include <vector>

#include "carrierfiles/ConsignmentOwner.h"
#include "frame/FailSafe.h"
#include "frame/host/Host.h"
#include "platform/FileSystem.h"

namespace quendal {

struct DfeVariant {
  // A consignment without packs is refused ("Shipments has no packs ").
  bool refusePackless = true;
  // Cartons and pallets each get a carton line of their own ("ITEM" 1 and
  // "PALLET" 2) with the count and weight of their packs. Otherwise the
  // cartons get one "ITEM" line with the consignment's id and weight, and
  // pallets none.
  bool linePerGroup = false;
};

// What Process reads of a consignment before any element is made, and the
// tables are written from.
struct DfeValues {
  std::string connote, conNoteId, connoteDate, items, kgs, customerReference, startDate, stopDate,
      dangerousGoods, packageType, senderReference;
  std::string name, line1, line2, suburb, state, postcode;  // the receiver
  bool dangerous = false;
  std::vector<Ref<host::Pack>> packs, cartons, pallets;
};

// What GetTotals sums over a list of packs.
struct DfeTotals {
  std::int32_t packs = 0;
  std::int64_t weight = 0;  // the packs' weights, in whole kilograms
  double cubic = 0;         // the packs' cubes
  double length = 0;        // the cartons' dimensions
  double height = 0;
  double width = 0;
};

// The identifier of a consignment in every table: the last 5 characters of
// the account number, "1", and the last 7 of the consignment number, each
// zero-filled on the left.
std::string DfeConnote(const Var& accountNumber, const Var& conNoteNo);
// "KGS": the weight in whole kilograms (halves to even), 1 when that is 0
// or less or there is no weight.
std::string DfeKgs(const Var& weight);
// A delivery window's date as "YYYY-MM-DDTHH:MM:SS+10"; empty when it lies
// before `now` (the window has started) or there is no date.
std::string DfeWindowDate(const Var& date, const DateTime& now);

class DfeWriter {
 public:
  // What the writer needs of the class it writes for.
  using Owner = ConsignmentOwner;

  // The document's tables, each appended to the consignment being written
  // from the values Process gathered for it; each runs under its own
  // procedure guard, as the host may call them.
  void CreateTable();
  // The cartons' line: the consignment's id, "ITEM", the cartons' package
  // type and count, and the consignment's weight.
  void CreateTable1();
  void CreateTable1(const Var& iID, const std::string& sType, const std::string& sPackType,
                    const std::string& sItemCount, std::int64_t lweight);
  // The pack's label code. `aPackNo` is its position among the packs, which
  // the table does not show.
  void CreateTable2(const Ref<host::Pack>& objPack, std::int32_t aPackNo);
  // Sums the packs' weights and cubes and their cartons' dimensions (Totals).
  void GetTotals(const Ref<host::PackList>& lstPacks);
  const DfeTotals& Totals() const { return totals_; }

  // The consignment's elements normally go in before the closing root tag
  // in place. Switched off, the whole day's document is read, extended and
  // written again for every consignment, for comparisons.
  void SetTailReplacement(bool enabled) { tailReplacement_ = enabled; }

 protected:
  // Both must outlive the writer; `module` names the class in error reports.
  DfeWriter(const DfeVariant& variant, Owner& owner, std::string_view module);

  // Writes the consignment to the day's file in `folder` as further steps
  // of `proc`; true once its elements are in the file and `written` (when
  // given) has succeeded. `written` runs right after the file is written,
  // before the declarations are printed and completion is logged.
  bool Write(Procedure& proc, const Ref<host::ConNote>& conNote, const std::string& folder,
             const std::function<bool()>& written = {});

 private:
  // A day's file as this writer last found or left it.
  struct Known {
    std::optional<FileStamp> stamp;  // none: the file did not exist
    bool extendable = true;          // false: a file to leave alone
    std::unordered_set<std::string> connotes;
  };
  enum class Added { Written, NotExtendable, Stopped };

  static DfeValues Gather(const Ref<host::ConNote>& conNote, const Ref<host::PackList>& packs,
                          const Var& accountNumber);
  // The unguarded work of the public builders.
  void AddTable();
  void AddCartonLine(const Var& id, const std::string& type, const std::string& packType,
                     const std::string& items, const std::string& kgs);
  void AddLabelLine(const Ref<host::Pack>& pack);
  void Sum(const std::vector<Ref<host::Pack>>& packs);
  // The consignment's elements as the file holds them under its root.
  std::string Elements();
  bool AddToDayFile(const std::string& path, const std::string& no, const std::string& elements);
  // The day's file as far as this writer may extend it; null when it may not.
  Known* Inspect(const std::string& file);
  Added Insert(const std::string& file, const std::string& elements);
  Added Rewrite(const std::string& file);

  const DfeVariant& variant_;
  Owner& owner_;
  std::string module_;
  bool tailReplacement_ = true;
  DfeValues values_;
  DfeTotals totals_;
  pugi::xml_document fragment_;  // a NewDataSet holding the consignment being written
  std::map<std::string, Known> known_;
};

}  // namespace quendal
