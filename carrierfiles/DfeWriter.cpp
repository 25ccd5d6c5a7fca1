#include "carrierfiles/DfeWriter.h"

#include <algorithm>
#include <filesystem>
#include <span>

#include "carrierfiles/ConsignmentWriter.h"
#include "carrierfiles/TailJournal.h"
#include "frame/Error.h"
#include "frame/VB.h"
#include "frame/host/Read.h"
#include "manifests/XmlWriting.h"
#include "platform/Clock.h"
#include "platform/DirectorySpooler.h"
#include "platform/FileLock.h"

namespace quendal {

using host::Read;

namespace {

constexpr std::string_view kOpenFile = "Open carrier message file";
constexpr std::string_view kProcess = "Process";

constexpr const char* kRoot = "NewDataSet";
constexpr const char* kComment = "DFE Despatch Advice file created by Merivane.";
// A new file: declaration, comment and the root's start tag, then the
// consignments' elements, then the root's end tag.
constexpr std::string_view kDeclaration = "<?xml version='1.0'?>\r\n";
const std::string kHead =
    std::string(kDeclaration) + "<!--" + kComment + "-->\r\n<" + kRoot + ">\r\n";
const std::string kTail = std::string("</") + kRoot + ">\r\n";

// Names beside an unreadable day file that are tried before giving up.
constexpr int kMaxBeside = 999;

// One element of a table: its text is a member of the values, or fixed.
template <class Values>
struct Field {
  const char* element;
  std::string Values::*value;  // null: the fixed text
  const char* fixed;
};

template <class Values>
void AppendTable(pugi::xml_node root, const char* table, std::span<const Field<Values>> fields,
                 const Values& values) {
  pugi::xml_node node = root.append_child(table);
  for (const Field<Values>& field : fields)
    xml::AppendText(node, field.element, field.value ? values.*field.value : field.fixed);
}

// A carton line and a pack's label line, as CreateTable1 and CreateTable2 take them.
struct CartonLine {
  std::string id, connote, senderReference, packageType, items, kgs, type;
};
struct LabelLine {
  std::string id, connote, sscc;
};

// The zero-filled last `width` characters of a text.
std::string LastZeroFilled(const std::string& text, long width) {
  const std::string last = Right(text, width);
  return std::string(static_cast<std::size_t>(std::max(0L, width - Len(last))), '0') + last;
}

std::string WholeKilograms(std::int64_t kilograms) {
  return std::to_string(kilograms > 0 ? kilograms : 1);
}

// "YYYY-MM-DDTHH:MM:SS+10": local time at the carrier's fixed offset.
std::string DfeTime(const DateTime& at) {
  return Format(Var(at), "yyyy-mm-dd") + "T" + Format(Var(at), "hh:nn:ss") + "+10";
}

// The day's document read whole.
struct DayDocument {
  pugi::xml_document xml;
  pugi::xml_node root;
};

// The encoding a file's declaration names; empty when it names none.
std::string DeclaredEncoding(std::string_view bytes) {
  if (bytes.starts_with("\xEF\xBB\xBF")) bytes.remove_prefix(3);
  if (!bytes.starts_with("<?xml")) return {};
  const std::string_view declaration = bytes.substr(0, bytes.find("?>"));
  const std::size_t at = declaration.find("encoding");
  if (at == std::string_view::npos) return {};
  const std::size_t open = declaration.find_first_of("'\"", at);
  if (open == std::string_view::npos) return "?";
  const std::size_t close = declaration.find(declaration[open], open + 1);
  if (close == std::string_view::npos) return "?";
  return LCase(declaration.substr(open + 1, close - open - 1));
}

// The tree of a day's file this writer may extend: UTF-8, one root
// "NewDataSet" and nothing after it; null otherwise. Whitespace that is an
// element's whole text is kept, so a value of spaces reads back as it was.
std::unique_ptr<DayDocument> ParseDay(std::string_view bytes) {
  const std::string encoding = DeclaredEncoding(bytes);
  if (!encoding.empty() && encoding != "utf-8" && encoding != "utf8") return nullptr;
  auto day = std::make_unique<DayDocument>();
  const pugi::xml_parse_result parsed = xml::LoadDayFile(
      day->xml, bytes,
      pugi::parse_default | pugi::parse_comments | pugi::parse_pi | pugi::parse_ws_pcdata_single);
  if (!parsed || parsed.encoding != pugi::encoding_utf8) return nullptr;
  for (pugi::xml_node top : day->xml.children()) {
    if (top.type() != pugi::node_element) continue;
    if (day->root || std::string_view(top.name()) != kRoot) return nullptr;
    day->root = top;
  }
  if (!day->root || day->root != day->xml.last_child()) return nullptr;
  return day;
}

std::unordered_set<std::string> ConnotesOf(pugi::xml_node root) {
  std::unordered_set<std::string> connotes;
  for (pugi::xml_node table : root.children("Table"))
    connotes.emplace(table.child("Connote").text().get());
  return connotes;
}

// Where the root's end tag starts in the file's last bytes: the last thing
// in the file but whitespace.
std::optional<std::size_t> ClosingTag(std::string_view end) {
  const std::size_t last = end.find_last_not_of(" \t\r\n");
  if (last == std::string_view::npos || end[last] != '>') return std::nullopt;
  const std::size_t open = end.rfind('<', last);
  if (open == std::string_view::npos) return std::nullopt;
  std::string_view tag = end.substr(open + 1, last - open - 1);
  const std::string name = std::string("/") + kRoot;
  if (!tag.starts_with(name)) return std::nullopt;
  tag.remove_prefix(name.size());
  if (tag.find_first_not_of(" \t\r\n") != std::string_view::npos) return std::nullopt;
  return open;
}

// The consignment's table, in the order the carrier reads its columns.
constexpr Field<DfeValues> kTable[] = {
    {"ReceiverName", &DfeValues::name, nullptr},
    {"ReceiverAddress1", &DfeValues::line1, nullptr},
    {"ReceiverAddress2", &DfeValues::line2, nullptr},
    {"ReceiverAddress3", nullptr, ""},
    {"ReceiverCity", &DfeValues::suburb, nullptr},
    {"ReceiverState", &DfeValues::state, nullptr},
    {"ReceiverPostcode", &DfeValues::postcode, nullptr},
    {"Connote", &DfeValues::connote, nullptr},
    {"ConnoteDate", &DfeValues::connoteDate, nullptr},
    {"Special", nullptr, ""},
    {"Items", &DfeValues::items, nullptr},
    {"Pallets", nullptr, "0"},
    {"KGS", &DfeValues::kgs, nullptr},
    {"Cubic", nullptr, ""},
    {"Service", nullptr, ""},
    {"CustomerReference", &DfeValues::customerReference, nullptr},
    {"StartDate", &DfeValues::startDate, nullptr},
    {"StopDate", &DfeValues::stopDate, nullptr},
    {"Class", nullptr, ""},
    {"InsuranceAmount", nullptr, "0.00"},
    {"DangerousGoods", &DfeValues::dangerousGoods, nullptr},
};

// A carton line: how many packages of a type, and their weight.
constexpr Field<CartonLine> kTable1[] = {
    {"ConnoteDetailsId", &CartonLine::id, nullptr},
    {"Connote", &CartonLine::connote, nullptr},
    {"SenderReference", &CartonLine::senderReference, nullptr},
    {"PackageType", &CartonLine::packageType, nullptr},
    {"Items", &CartonLine::items, nullptr},
    {"KGS", &CartonLine::kgs, nullptr},
    {"Length", nullptr, ""},
    {"Width", nullptr, ""},
    {"Height", nullptr, ""},
    {"Quantity", nullptr, ""},
    {"Cubic", nullptr, ""},
    {"Type", &CartonLine::type, nullptr},
};

// A pack's label code.
constexpr Field<LabelLine> kTable2[] = {
    {"ConnoteDetailsId", &LabelLine::id, nullptr},
    {"Connote", &LabelLine::connote, nullptr},
    {"LabelTrackCode", &LabelLine::sscc, nullptr},
};

}  // namespace

std::string DfeConnote(const Var& accountNumber, const Var& conNoteNo) {
  return LastZeroFilled(accountNumber.Text(), 5) + "1" + LastZeroFilled(conNoteNo.Text(), 7);
}

std::string DfeKgs(const Var& weight) {
  const double kilograms = weight.NumberOr(0);
  // A weight beyond any load is not a number a file could carry; it counts as none.
  if (!(kilograms > 0 && kilograms < 1e15)) return WholeKilograms(0);
  return WholeKilograms(RoundHalfEven(kilograms));
}

std::string DfeWindowDate(const Var& date, const DateTime& now) {
  const std::optional<DateTime> at = host::DateOf(date);
  if (!at || *at < now) return {};
  return DfeTime(*at);
}

DfeWriter::DfeWriter(const DfeVariant& variant, Owner& owner, std::string_view module)
    : variant_(variant), owner_(owner), module_(module) {
  fragment_.append_child(kRoot);
}

DfeValues DfeWriter::Gather(const Ref<host::ConNote>& conNote, const Ref<host::PackList>& packs,
                            const Var& accountNumber) {
  DfeValues v;
  if (packs)
    for (Ref<host::Pack> pack : *packs) v.packs.push_back(pack);
  for (const Ref<host::Pack>& pack : v.packs) {
    const bool pallet = UCase(Read(pack, &host::Pack::PackType).Text()) == "PALLET";
    (pallet ? v.pallets : v.cartons).push_back(pack);
  }
  v.items = std::to_string(v.cartons.size());
  for (const Ref<host::Pack>& pack : v.packs) {
    const Ref<host::PackLines> lines = Read(pack, &host::Pack::Lines);
    if (!lines) continue;
    for (Ref<host::PackLine> line : *lines)
      if (host::IsTrue(Read(Read(line, &host::PackLine::Product), &host::Product::IsDangerous)))
        v.dangerous = true;
  }
  v.dangerousGoods = v.dangerous ? "True" : "False";

  const Ref<host::Pack> first = v.packs.empty() ? Ref<host::Pack>() : v.packs.front();
  const Ref<host::Despatch> despatch = Read(first, &host::Pack::Despatch);
  const DateTime now = Now();
  v.startDate = DfeWindowDate(Read(despatch, &host::Despatch::NotBefore), now);
  v.stopDate = DfeWindowDate(Read(despatch, &host::Despatch::NotAfter), now);
  v.customerReference = Left("PONo " + Read(despatch, &host::Despatch::DespatchNo).Text(), 20);

  const Ref<host::Order> order = Read(first, &host::Pack::Order);
  const Ref<host::Address> address = Read(order, &host::Order::DeliveryAddress);
  v.name = Read(address, &host::Address::Name).Text();
  if (!v.name.empty()) {
    v.line1 = Read(address, &host::Address::Line1).Text();
    v.line2 = Read(address, &host::Address::Line2).Text();
    v.suburb = Read(address, &host::Address::Suburb).Text();
    v.state = Read(address, &host::Address::State).Text();
    v.postcode = Read(address, &host::Address::Postcode).Text();
  } else {
    const Ref<host::Receiver> receiver = Read(order, &host::Order::Receiver);
    v.name = Read(receiver, &host::Receiver::Name).Text();
    v.line1 = Read(receiver, &host::Receiver::AddressLine1).Text();
    v.line2 = Read(receiver, &host::Receiver::AddressLine2).Text();
    v.suburb = Read(receiver, &host::Receiver::Suburb).Text();
    v.state = Read(receiver, &host::Receiver::State).Text();
    v.postcode = Read(receiver, &host::Receiver::Postcode).Text();
  }
  // The carton line describes cartons: its package type is the first
  // carton's, even when a pallet comes first.
  v.packageType = Read(v.cartons.empty() ? first : v.cartons.front(), &host::Pack::PackType).Text();
  v.senderReference = Read(Read(first, &host::Pack::ASN), &host::ASN::ASNNo).Text();

  v.connote = DfeConnote(accountNumber, conNote->ConNoteNo());
  v.conNoteId = conNote->ConNoteId().Text();
  const std::optional<DateTime> date = host::DateOf(conNote->ConNoteDate());
  v.connoteDate = date ? DfeTime(*date) : std::string();
  v.kgs = DfeKgs(conNote->Weight());
  return v;
}

void DfeWriter::AddTable() {
  AppendTable<DfeValues>(fragment_.child(kRoot), "Table", kTable, values_);
}

void DfeWriter::AddCartonLine(const Var& id, const std::string& type, const std::string& packType,
                              const std::string& items, const std::string& kgs) {
  const CartonLine line{
      id.Text(), values_.connote, "ASNNo " + values_.senderReference, packType, items, kgs, type};
  AppendTable<CartonLine>(fragment_.child(kRoot), "Table1", kTable1, line);
}

void DfeWriter::AddLabelLine(const Ref<host::Pack>& pack) {
  const LabelLine line{values_.conNoteId, values_.connote, Read(pack, &host::Pack::SSCC).Text()};
  AppendTable<LabelLine>(fragment_.child(kRoot), "Table2", kTable2, line);
}

void DfeWriter::CreateTable() {
  Procedure proc(module_, "Sub CreateTable");
  proc([&] { AddTable(); });
}

void DfeWriter::CreateTable1() {
  Procedure proc(module_, "Sub CreateTable1");
  proc([&] {
    AddCartonLine(Var(values_.conNoteId), "ITEM", values_.packageType, values_.items, values_.kgs);
  });
}

void DfeWriter::CreateTable1(const Var& iID, const std::string& sType, const std::string& sPackType,
                             const std::string& sItemCount, std::int64_t lweight) {
  Procedure proc(module_, "Sub CreateTable1");
  proc([&] { AddCartonLine(iID, sType, sPackType, sItemCount, WholeKilograms(lweight)); });
}

void DfeWriter::CreateTable2(const Ref<host::Pack>& objPack, std::int32_t) {
  Procedure proc(module_, "Sub CreateTable2");
  proc([&] { AddLabelLine(objPack); });
}

void DfeWriter::GetTotals(const Ref<host::PackList>& lstPacks) {
  Procedure proc(module_, "Sub GetTotals");
  proc([&] {
    std::vector<Ref<host::Pack>> packs;
    if (lstPacks)
      for (Ref<host::Pack> pack : *lstPacks) packs.push_back(pack);
    Sum(packs);
  });
}

void DfeWriter::Sum(const std::vector<Ref<host::Pack>>& packs) {
  DfeTotals totals;
  double weight = 0;
  for (const Ref<host::Pack>& pack : packs) {
    ++totals.packs;
    weight += Read(pack, &host::Pack::Weight).NumberOr(0);
    totals.cubic += Read(pack, &host::Pack::Cubic).NumberOr(0);
    const Ref<host::Carton> carton = Read(pack, &host::Pack::Carton);
    totals.length += Read(carton, &host::Carton::Length).NumberOr(0);
    totals.height += Read(carton, &host::Carton::Height).NumberOr(0);
    totals.width += Read(carton, &host::Carton::Width).NumberOr(0);
  }
  // The packs' weights summed as they are, then rounded once.
  totals.weight = weight > 0 && weight < 1e15 ? RoundHalfEven(weight) : 0;
  totals_ = totals;
}

std::string DfeWriter::Elements() {
  fragment_.reset();
  fragment_.append_child(kRoot);
  AddTable();
  if (variant_.linePerGroup) {
    if (!values_.cartons.empty()) {
      Sum(values_.cartons);
      AddCartonLine(Var(1), "ITEM", values_.packageType, std::to_string(totals_.packs),
                    WholeKilograms(totals_.weight));
    }
    if (!values_.pallets.empty()) {
      Sum(values_.pallets);
      AddCartonLine(Var(2), "PALLET", "Pallet", std::to_string(totals_.packs),
                    WholeKilograms(totals_.weight));
    }
  } else if (!values_.cartons.empty()) {
    AddCartonLine(Var(values_.conNoteId), "ITEM", values_.packageType, values_.items, values_.kgs);
  }
  for (const Ref<host::Pack>& pack : values_.packs) AddLabelLine(pack);

  std::string elements;
  for (pugi::xml_node table : fragment_.child(kRoot).children())
    xml::AppendIndented(elements, table, 1);
  return elements;
}

DfeWriter::Known* DfeWriter::Inspect(const std::string& file) {
  const std::optional<FileStamp> stamp = StampOf(file);
  if (!stamp) {
    // Nothing there yet; something that is not a file is no day file.
    std::error_code ec;
    if (std::filesystem::exists(file, ec) || ec) return nullptr;
    Known& missing = known_[file];
    missing = Known{};
    return &missing;
  }
  if (auto it = known_.find(file); it != known_.end() && it->second.stamp == stamp)
    return it->second.extendable ? &it->second : nullptr;
  // Not as this writer left it: read it whole once.
  known_.erase(file);
  const std::optional<std::string> bytes = ReadFile(file);
  if (!bytes) return nullptr;
  Known& known = known_[file];
  known.stamp = stamp;
  if (!bytes->empty()) {
    const std::unique_ptr<DayDocument> day = ParseDay(*bytes);
    if (!day) {
      known.extendable = false;
      return nullptr;
    }
    known.connotes = ConnotesOf(day->root);
  }
  return &known;
}

DfeWriter::Added DfeWriter::Insert(const std::string& file, const std::string& elements) {
  TailJournal journal(file);
  bool fresh = false;
  const auto find = [&](const TailJournal::End& end) -> std::optional<std::size_t> {
    fresh = end.offset == 0 && end.bytes.empty();
    if (fresh) return 0;
    return ClosingTag(end.bytes);
  };
  const auto build = [&](std::string_view) {
    return fresh ? kHead + elements + kTail : elements + kTail;
  };
  switch (journal.Replace(find, build)) {
    case TailJournal::Outcome::Replaced:
      return Added::Written;
    case TailJournal::Outcome::NoTail:
      return Added::NotExtendable;
    case TailJournal::Outcome::CannotOpen:
      owner_.LogLine(err::kPathFileAccess, kOpenFile, "Cannot open file " + file);
      return Added::Stopped;
    case TailJournal::Outcome::Failed:
      break;
  }
  // The file is as it was; the error report says the write failed.
  throw Error(err::kDeviceIO);
}

DfeWriter::Added DfeWriter::Rewrite(const std::string& file) {
  const std::string bytes = ReadFile(file).value_or(std::string());
  std::unique_ptr<DayDocument> day;
  if (bytes.empty()) {
    day = std::make_unique<DayDocument>();
    day->xml.append_child(pugi::node_comment).set_value(kComment);
    day->root = day->xml.append_child(kRoot);
  } else if (!(day = ParseDay(bytes))) {
    return Added::NotExtendable;
  }
  for (pugi::xml_node table : fragment_.child(kRoot).children()) day->root.append_copy(table);
  std::string text(kDeclaration);
  xml::AppendIndented(text, day->xml);
  if (!ReplaceFile(file, text)) throw Error(err::kDeviceIO);
  return Added::Written;
}

bool DfeWriter::AddToDayFile(const std::string& path, const std::string& no,
                             const std::string& elements) {
  std::vector<std::string> kept;
  const auto logKept = [&](const std::string& file) {
    for (const std::string& name : kept)
      owner_.LogLine(0, kOpenFile,
                     "Despatch advice file " + name +
                         " cannot be read as a DFE despatch advice; it is kept and ConNote " + no +
                         " is written to " + file + ".");
  };
  // The day's file and the files beside it are this station's alone from
  // the duplicate check to the addition.
  FileLock lock;
  if (!lock.Acquire(path)) {
    owner_.LogLine(err::kPathFileAccess, kOpenFile, "Cannot open file " + path);
    return false;
  }
  for (int n = 1; n <= kMaxBeside; ++n) {
    const std::string file = n == 1 ? path : PathBeside(path, n);
    // An addition that a crash interrupted is completed before anything else.
    if (TailJournal(file).Finish() == TailJournal::Recovery::Failed) {
      owner_.LogLine(err::kPathFileAccess, kOpenFile, "Cannot open file " + file);
      return false;
    }
    Known* known = Inspect(file);
    if (!known) {
      kept.push_back(file);
      continue;
    }
    // The carrier tells consignments apart by this identifier alone.
    if (known->connotes.contains(values_.connote)) {
      logKept(file);
      owner_.LogLine(0, kOpenFile, "Cannot process, connoteno already exists " + no);
      return false;
    }
    const Added added = tailReplacement_ ? Insert(file, elements) : Rewrite(file);
    if (added == Added::Stopped) return false;
    if (added == Added::NotExtendable) {
      known->extendable = false;
      known->stamp = StampOf(file);
      kept.push_back(file);
      continue;
    }
    known->connotes.insert(values_.connote);
    known->stamp = StampOf(file);
    logKept(file);
    return true;
  }
  owner_.LogLine(err::kPathFileAccess, kOpenFile, "Cannot open file " + path);
  return false;
}

bool DfeWriter::Write(Procedure& proc, const Ref<host::ConNote>& conNote, const std::string& folder,
                      const std::function<bool()>& written) {
  std::string no;
  Ref<host::PackList> packs;
  std::int32_t count = 0;
  Var account;
  if (!proc([&] {
        no = conNote->ConNoteNo().Text();
        packs = conNote->Packs();
        count = packs ? packs->Count() : 0;
        account = Read(conNote->Carrier(), &host::Carrier::AccountNumber);
      }))
    return false;
  if (variant_.refusePackless && !proc([&] {
        if (count > 0) return true;
        owner_.LogLine(0, "DFEXML processing", "Shipments has no packs " + no);
        return false;
      }))
    return false;
  if (!proc([&] {
        if (IsCarrierFolder(folder)) return true;
        owner_.LogLine(0, kOpenFile, "Invalid folder " + folder);
        return false;
      }))
    return false;
  if (!proc([&] {
        if (Len(account.Text()) == 5) return true;
        owner_.LogLine(0, "Carrier Account Ref must be 5 digits",
                       "Invalid Carrier Account Reffolder " + account.Text());
        return false;
      }))
    return false;

  // One file per account and day; the account is a piece of the name only.
  const std::string path = folder + "MANIFEST_" + SafeNamePart(Left(account.Text(), 5)) + "_" +
                           Format(Var(Today()), "YYYYMMDD") + "1200.XML";

  // Everything is read before anything is written; a step left by Ignore
  // writes nothing rather than a consignment of missing values.
  bool gathered = false;
  if (!proc([&] {
        values_ = DfeValues{};
        values_ = Gather(conNote, packs, account);
        gathered = true;
      }) ||
      !gathered)
    return false;
  std::string elements;
  if (!proc([&] { elements = Elements(); }) || elements.empty()) return false;

  bool added = false;
  if (!proc([&] { added = AddToDayFile(path, no, elements); }) || !added) return false;
  // The consignment is whole in the file; only now may the caller mark it done.
  if (written && !written()) return false;
  const bool done = true;

  if (values_.dangerous) {
    for (int copy = 0; copy < 2; ++copy) {
      if (!proc([&] {
            if (!owner_.DangerouseGoodsDeclaration(conNote))
              owner_.LogLine(0, kProcess,
                             "Error printing dangerous goods declaration, sales order " + no);
          }))
        return done;
    }
  }
  proc([&] { owner_.LogLine(0, kProcess, "ConNote " + no + " compile completed."); });
  return done;
}

}  // namespace quendal
