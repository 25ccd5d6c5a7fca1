#include "carrierfiles/Layout.h"

#include <algorithm>
#include <array>
#include <charconv>
#include <optional>

#include "carrierfiles/CsvMap.h"
#include "frame/VB.h"
#include "frame/host/Read.h"

namespace quendal {

using host::First;
using host::Read;

namespace {

using record::Field;
using record::Kind;

constexpr std::size_t kRecordLimit = 64;
constexpr std::size_t kFieldLimit = 256;
constexpr int kWidthLimit = 999;
constexpr std::size_t kMaskLimit = 64;

// The host members a layout may name, by object.
constexpr std::string_view kConNoteMembers[] = {
    "ConNoteId", "ConNoteNo", "ConNoteDate", "Service", "ServiceLevel",
    "CarrierPrefix", "Weight", "Volume", "Cube", "CubicTotal", "CubicOverride",
    "DeliveryInstructions", "BillOfLading", "BookingNo", "ScheduledDate", "PartnerCode",
    "DeliveryLocation", "ManifestId"};
constexpr std::string_view kASNMembers[] = {"ID", "ASNNo", "ASNNumber", "ASNDate",
                                    "OriginCode"};
constexpr std::string_view kPackMembers[] = {
    "PackId", "SSCC", "StoreCode", "PartnerId", "SalesOrderNo", "PackType",
    "Weight", "ASNId", "BuyStoreCode", "ItemCount", "Cubic"};
constexpr std::string_view kCartonMembers[] = {"Code", "Weight", "Length", "Width",
                                       "Height"};
constexpr std::string_view kDespatchMembers[] = {
    "DespatchNo", "NotBefore", "NotAfter", "OrderDate", "CompanyCode",
    "SupplierNo", "DeliveryText1", "DeliveryText2", "DeliveryText3", "ZoneDeptA", "ZoneDeptB",
    "ZoneDeptC"};
constexpr std::string_view kOrderMembers[] = {"OrderNo", "StoreNo", "VendorCode"};
constexpr std::string_view kAddressMembers[] = {"Name", "Line1", "Line2", "Suburb",
                                        "State", "Postcode", "Phone", "Email", "Reference",
                                        "Company"};
constexpr std::string_view kReceiverMembers[] = {
    "Code", "Name", "AddressLine1", "AddressLine2", "Suburb", "State",
    "Postcode", "City", "CountryCode", "StoreCode", "CarrierServiceCode", "Extra1", "Extra2"};
constexpr std::string_view kCarrierMembers[] = {"CarrierCode", "Name", "AccountRef",
                                        "AccountNumber"};
constexpr std::string_view kVendorMembers[] = {
    "VendorCode", "Name", "AddressLine1", "AddressLine2", "AddressLine3",
    "Suburb", "State", "Postcode", "Country"};
constexpr std::string_view kPartnerMembers[] = {"Code", "ShortName", "SupplierNo"};

struct HostObject {
  std::string_view name;
  ValueRoot root;
  std::span<const std::string_view> members;
};
constexpr std::array kHostObjects = {
    HostObject{"ConNote", ValueRoot::ConNote, kConNoteMembers},
    HostObject{"ASN", ValueRoot::ASN, kASNMembers},
    HostObject{"Pack", ValueRoot::Pack, kPackMembers},
    HostObject{"Carton", ValueRoot::Carton, kCartonMembers},
    HostObject{"Despatch", ValueRoot::Despatch, kDespatchMembers},
    HostObject{"Order", ValueRoot::Order, kOrderMembers},
    HostObject{"DeliveryAddress", ValueRoot::DeliveryAddress, kAddressMembers},
    HostObject{"Receiver", ValueRoot::Receiver, kReceiverMembers},
    HostObject{"Carrier", ValueRoot::Carrier, kCarrierMembers},
    HostObject{"Vendor", ValueRoot::Vendor, kVendorMembers},
    HostObject{"Partner", ValueRoot::Partner, kPartnerMembers},
};

struct ComputedName {
  std::string_view name;
  ComputedValue value;
};
constexpr std::array kComputed = {
    ComputedName{"ServiceCode", ComputedValue::ServiceCode},
    ComputedName{"PackCount", ComputedValue::PackCount},
    ComputedName{"PackNo", ComputedValue::PackNo},
    ComputedName{"TotalWeight", ComputedValue::TotalWeight},
    ComputedName{"Now", ComputedValue::Now},
    ComputedName{"ManifestNumber", ComputedValue::ManifestNumber},
    ComputedName{"FileName", ComputedValue::FileName},
};

bool SameName(std::string_view a, std::string_view b) {
  return a.size() == b.size() && std::equal(a.begin(), a.end(), b.begin(), [](char x, char y) {
           const auto lower = [](char c) { return c >= 'A' && c <= 'Z' ? char(c - 'A' + 'a') : c; };
           return lower(x) == lower(y);
         });
}

struct Token {
  std::string text;
  int column = 0;
  bool quoted = false;
};

struct Failure {
  LayoutProblem problem;
};

[[noreturn]] void Fail(int line, int column, std::string message) {
  throw Failure{{line, column, std::move(message)}};
}

// A token as a message shows it.
std::string Shown(std::string_view text) { return "\"" + ShownText(text) + "\""; }

// The tokens of one line: words, and quoted texts in which "" is one quote;
// "#" outside a quoted text starts a comment.
std::vector<Token> Tokens(std::string_view line, int lineNo) {
  std::vector<Token> tokens;
  std::size_t i = 0;
  while (i < line.size()) {
    const char c = line[i];
    if (c == ' ' || c == '\t') {
      ++i;
      continue;
    }
    if (c == '#') break;
    Token token;
    token.column = static_cast<int>(i) + 1;
    if (c == '"') {
      token.quoted = true;
      bool closed = false;
      for (++i; i < line.size(); ++i) {
        const auto byte = static_cast<unsigned char>(line[i]);
        if (byte < 0x20 || byte == 0x7F)
          Fail(lineNo, static_cast<int>(i) + 1, "a quoted text may not hold a tab or other control character");
        if (line[i] != '"') {
          token.text += line[i];
          continue;
        }
        if (i + 1 < line.size() && line[i + 1] == '"') {
          token.text += '"';
          ++i;
          continue;
        }
        closed = true;
        ++i;
        break;
      }
      if (!closed)
        Fail(lineNo, token.column, "the quoted text is not closed: it must end on its line with \"");
    } else {
      while (i < line.size() && line[i] != ' ' && line[i] != '\t' && line[i] != '"' &&
             line[i] != '#')
        token.text += line[i++];
    }
    tokens.push_back(std::move(token));
  }
  return tokens;
}

class Reader {
 public:
  explicit Reader(Layout& layout) : layout_(layout) {}

  void Line(std::string_view text, int lineNo) {
    line_ = lineNo;
    tokens_ = Tokens(text, lineNo);
    next_ = 0;
    if (tokens_.empty()) return;
    const Token& first = tokens_[0];
    if (!first.quoted && SameName(first.text, "format")) {
      ++next_;
      Format(first);
    } else if (!first.quoted && SameName(first.text, "record")) {
      ++next_;
      Record(first);
    } else {
      if (layout_.records.empty())
        Fail(line_, first.column, "a field comes before the first \"record\" line");
      FieldLine();
    }
    if (next_ < tokens_.size())
      Fail(line_, tokens_[next_].column, "unexpected " + Shown(tokens_[next_].text) + " at the end of the line");
  }

  void Finish(int lastLine) {
    if (!layout_.Has(RecordWhen::Consignment) && !layout_.Has(RecordWhen::Pack))
      Fail(lastLine, 1, "the layout has no consignment or pack record");
  }

 private:
  const Token& Take(const Token& after, std::string_view what) {
    if (next_ >= tokens_.size())
      Fail(line_, after.column + static_cast<int>(after.text.size()) + (after.quoted ? 2 : 0),
           "missing " + std::string(what) + " after " + Shown(after.text));
    return tokens_[next_++];
  }

  void Format(const Token& keyword) {
    if (formatSeen_ || !layout_.records.empty())
      Fail(line_, keyword.column, "\"format\" may only stand once, before the first record");
    formatSeen_ = true;
    const Token& kind = Take(keyword, "fixed or delimited");
    if (!kind.quoted && SameName(kind.text, "fixed")) return;
    if (kind.quoted || !SameName(kind.text, "delimited"))
      Fail(line_, kind.column, "unknown format " + Shown(kind.text) + ": fixed or delimited");
    layout_.delimited = true;
    const Token& by = Take(kind, "the delimiter (tab or one quoted character)");
    if (!by.quoted && SameName(by.text, "tab")) {
      layout_.delimiter = '\t';
      return;
    }
    const bool usable = by.quoted && by.text.size() == 1 && by.text[0] != '"' &&
                        static_cast<unsigned char>(by.text[0]) >= 0x20 &&
                        static_cast<unsigned char>(by.text[0]) < 0x7F;
    if (!usable)
      Fail(line_, by.column, "bad delimiter " + Shown(by.text) + ": tab or one quoted character such as \",\"");
    layout_.delimiter = by.text[0];
  }

  void Record(const Token& keyword) {
    const Token& kind = Take(keyword, "header, consignment, pack or trailer");
    static constexpr std::array<std::pair<std::string_view, RecordWhen>, 4> kKinds = {{
        {"header", RecordWhen::Header},
        {"consignment", RecordWhen::Consignment},
        {"pack", RecordWhen::Pack},
        {"trailer", RecordWhen::Trailer},
    }};
    for (const auto& [name, when] : kKinds) {
      if (kind.quoted || !SameName(kind.text, name)) continue;
      if (layout_.records.size() >= kRecordLimit)
        Fail(line_, keyword.column, "too many records: a layout holds at most " + std::to_string(kRecordLimit));
      LayoutRecord& record = layout_.records.emplace_back();
      record.when = when;
      return;
    }
    Fail(line_, kind.column, "unknown record " + Shown(kind.text) + ": header, consignment, pack or trailer");
  }

  int Width(const Token& after, int smallest) {
    const Token& token = Take(after, "a width");
    int width = -1;
    const char* end = token.text.data() + token.text.size();
    const auto [stop, error] = std::from_chars(token.text.data(), end, width);
    if (token.quoted || error != std::errc() || stop != end || width < smallest || width > kWidthLimit)
      Fail(line_, token.column,
           "bad width " + Shown(token.text) + ": a width is a whole number from " +
               std::to_string(smallest) + " to " + std::to_string(kWidthLimit));
    return width;
  }

  std::string_view Mask(const Token& after, Kind kind) {
    const Token& token = Take(after, "a quoted mask");
    if (!token.quoted || token.text.empty() || token.text.size() > kMaskLimit)
      Fail(line_, token.column, "bad mask " + Shown(token.text) + ": a mask is quoted, as \"YYYYMMDD\" or \"0000.0\"");
    if (kind == Kind::Number) {
      const bool digits = token.text.find_first_not_of("0#.") == std::string::npos &&
                          std::count(token.text.begin(), token.text.end(), '.') <= 1 &&
                          token.text.find_first_of("0#") != std::string::npos;
      if (!digits)
        Fail(line_, token.column, "bad number mask " + Shown(token.text) + ": digits \"0\" or \"#\" and at most one \".\"");
    }
    return layout_.Keep(token.text);
  }

  ValueSource Value(const Token& after, RecordWhen when) {
    const Token& token = Take(after, "a value");
    const std::string& name = token.text;
    if (!token.quoted) {
      for (const ComputedName& computed : kComputed) {
        if (!SameName(name, computed.name)) continue;
        if (computed.value == ComputedValue::PackNo && when != RecordWhen::Pack)
          Fail(line_, token.column, "PackNo is a value of pack records only");
        ValueSource source;
        source.root = ValueRoot::Computed;
        source.computed = computed.value;
        return source;
      }
      const std::size_t dot = name.find('.');
      if (dot != std::string::npos) {
        const std::string_view object = std::string_view(name).substr(0, dot);
        const std::string_view member = std::string_view(name).substr(dot + 1);
        for (const HostObject& host : kHostObjects) {
          if (!SameName(object, host.name)) continue;
          for (std::string_view known : host.members)
            if (SameName(member, known)) return {host.root, known, ComputedValue::Now};
        }
      }
    }
    Fail(line_, token.column, "unknown value " + Shown(name));
  }

  void FieldLine() {
    LayoutRecord& record = layout_.records.back();
    if (record.fields.size() >= kFieldLimit)
      Fail(line_, tokens_[0].column, "too many fields: a record holds at most " + std::to_string(kFieldLimit));
    const Token& first = tokens_[next_++];
    if (first.quoted) {
      record.fields.push_back(record::Literal(layout_.Keep(first.text)));
      return;
    }
    static constexpr std::array<std::pair<std::string_view, Kind>, 6> kWidthKinds = {{
        {"left", Kind::TextLeft},
        {"right", Kind::TextRight},
        {"cut", Kind::CutLeft},
        {"cutright", Kind::CutRight},
        {"zero", Kind::Zero},
        {"spaces", Kind::Spaces},
    }};
    Field field{Kind::Literal, 0, {}};
    const Token* last = &first;
    bool known = false;
    for (const auto& [name, kind] : kWidthKinds) {
      if (!SameName(first.text, name)) continue;
      const bool fills = kind == Kind::TextLeft || kind == Kind::TextRight;
      field = {kind, Width(first, fills ? 0 : 1), {}};
      last = &tokens_[next_ - 1];
      known = true;
    }
    if (!known && SameName(first.text, "text")) {
      field = {Kind::TextLeft, 0, {}};
      known = true;
    }
    if (!known && (SameName(first.text, "date") || SameName(first.text, "number"))) {
      const Kind kind = SameName(first.text, "date") ? Kind::Date : Kind::Number;
      const std::string_view mask = Mask(first, kind);
      field = {kind, static_cast<int>(mask.size()), mask};
      last = &tokens_[next_ - 1];
      known = true;
    }
    if (!known)
      Fail(line_, first.column,
           "unknown field " + Shown(first.text) +
               ": a quoted literal, spaces, left, right, cut, cutright, zero, text, date or number");
    if (field.kind == Kind::Spaces) {
      record.fields.push_back(field);
      return;
    }
    const ValueSource source = Value(*last, record.when);
    // Options: or "TEXT" (written when the value is missing), upper.
    while (next_ < tokens_.size()) {
      const Token& option = tokens_[next_];
      if (!option.quoted && SameName(option.text, "or")) {
        ++next_;
        const Token& text = Take(option, "a quoted text");
        if (!text.quoted) Fail(line_, text.column, "the text after \"or\" must be quoted");
        field.blank = layout_.Keep(text.text);
        field.hasBlank = true;
      } else if (!option.quoted && SameName(option.text, "upper")) {
        ++next_;
        if (field.kind == Kind::Date || field.kind == Kind::Number || field.kind == Kind::Zero)
          Fail(line_, option.column, "\"upper\" applies to text fields only");
        field.upper = true;
      } else {
        Fail(line_, option.column, "unknown option " + Shown(option.text) + ": or \"TEXT\" or upper");
      }
    }
    record.fields.push_back(field);
    record.sources.push_back(source);
  }

  Layout& layout_;
  int line_ = 0;
  std::vector<Token> tokens_;
  std::size_t next_ = 0;
  bool formatSeen_ = false;
};

// The host objects of one record, read once each as a field first needs them.
class Objects {
 public:
  Objects(const LayoutValues& values, const Ref<host::Pack>& pack)
      : values_(values), pack_(pack ? pack : First(values.packs)) {}

  Var Get(ValueRoot root, std::string_view member) {
    const std::shared_ptr<host::Object> object = Resolve(root);
    return object ? object->Get(member) : Var();
  }

 private:
  std::shared_ptr<host::Object> Resolve(ValueRoot root) {
    const auto slot = static_cast<std::size_t>(root);
    if (resolved_[slot]) return objects_[slot];
    resolved_[slot] = true;
    const Ref<host::ConNote>& c = values_.conNote;
    std::shared_ptr<host::Object> object;
    switch (root) {
      case ValueRoot::ConNote: object = c.ptr(); break;
      case ValueRoot::ASN: object = values_.asn.ptr(); break;
      case ValueRoot::Pack: object = pack_.ptr(); break;
      case ValueRoot::Carton: object = Read(pack_, &host::Pack::Carton).ptr(); break;
      case ValueRoot::Despatch: object = Read(pack_, &host::Pack::Despatch).ptr(); break;
      case ValueRoot::Order: object = Read(pack_, &host::Pack::Order).ptr(); break;
      case ValueRoot::DeliveryAddress:
        object = Read(Read(pack_, &host::Pack::Order), &host::Order::DeliveryAddress).ptr();
        break;
      case ValueRoot::Receiver: object = Read(c, &host::ConNote::Receiver).ptr(); break;
      case ValueRoot::Carrier: object = Read(c, &host::ConNote::Carrier).ptr(); break;
      case ValueRoot::Vendor: object = Read(c, &host::ConNote::Vendor).ptr(); break;
      case ValueRoot::Partner: object = Read(c, &host::ConNote::Partner).ptr(); break;
      case ValueRoot::Computed: break;
    }
    objects_[slot] = object;
    return object;
  }

  const LayoutValues& values_;
  Ref<host::Pack> pack_;
  std::array<std::shared_ptr<host::Object>, 12> objects_;
  std::array<bool, 12> resolved_{};
};

Var ComputedOf(ComputedValue value, const LayoutValues& v, std::int32_t packNo) {
  switch (value) {
    case ComputedValue::ServiceCode: return Var(v.serviceCode);
    case ComputedValue::PackCount: return Var(v.packCount);
    case ComputedValue::PackNo: return Var(packNo);
    case ComputedValue::TotalWeight: return Var(v.totalWeight);
    case ComputedValue::Now: return Var(v.now);
    case ComputedValue::ManifestNumber: return v.manifestNumber;
    case ComputedValue::FileName: return Var(v.fileName);
  }
  return Var();
}

}  // namespace

bool Layout::Has(RecordWhen when) const { return Count(when) > 0; }

std::size_t Layout::Count(RecordWhen when) const {
  return static_cast<std::size_t>(std::count_if(
      records.begin(), records.end(), [&](const LayoutRecord& r) { return r.when == when; }));
}

LayoutRead ReadLayout(std::string_view bytes) {
  LayoutRead read;
  if (bytes.size() > kLayoutFileLimit) {
    read.problem = {1, 1, "the file is too large: a layout holds at most " + std::to_string(kLayoutFileLimit) + " bytes"};
    return read;
  }
  auto layout = std::make_shared<Layout>();
  try {
    const std::string text = DecodeHandEdited(bytes);
    const std::vector<std::string_view> lines = SplitLines(text);
    Reader reader(*layout);
    for (std::size_t i = 0; i < lines.size(); ++i) reader.Line(lines[i], static_cast<int>(i) + 1);
    reader.Finish(static_cast<int>(std::max<std::size_t>(lines.size(), 1)));
  } catch (const Failure& failure) {
    read.problem = failure.problem;
    return read;
  }
  read.layout = std::move(layout);
  return read;
}

std::string ProblemText(std::string_view file, const LayoutProblem& problem) {
  return std::string(file) + " line " + std::to_string(problem.line) + " column " +
         std::to_string(problem.column) + ": " + problem.message;
}

std::string RenderRecord(const Layout& layout, const LayoutRecord& record,
                         const LayoutValues& values, const Ref<host::Pack>& pack,
                         std::int32_t packNo) {
  Objects objects(values, pack);
  std::vector<Var> filled;
  filled.reserve(record.sources.size());
  auto source = record.sources.begin();
  for (const Field& field : record.fields) {
    if (!record::TakesValue(field) || source == record.sources.end()) continue;
    Var value = source->root == ValueRoot::Computed ? ComputedOf(source->computed, values, packNo)
                                                    : objects.Get(source->root, source->member);
    ++source;
    // A fixed-width field keeps its width when the host has no value: a
    // number missing counts as 0, a date missing is written as spaces.
    if (!layout.delimited && field.kind == Kind::Number && !value.IsNumeric()) value = Var(0);
    if (!layout.delimited && field.kind == Kind::Date && !host::DateOf(value))
      value = Var(Spaces(field.width));
    filled.push_back(std::move(value));
  }
  return layout.delimited ? record::RenderDelimited(record.fields, filled, layout.delimiter)
                          : record::Render(record.fields, filled);
}

}  // namespace quendal
