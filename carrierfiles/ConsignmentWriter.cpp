#include "carrierfiles/ConsignmentWriter.h"

#include <array>

#include "frame/VB.h"
#include "platform/CodePage.h"

namespace quendal {

namespace {

// One row of a service table: within `group` (the carrier prefix where the
// carrier has groups), `service` maps to `code`; a row marked `other` takes
// every service the group's earlier rows did not.
struct ServiceRow {
  std::string_view group;
  std::string_view service;
  std::string_view code;
  bool other = false;
};

constexpr ServiceRow Other(std::string_view group, std::string_view code) {
  return {group, {}, code, true};
}

// Ipec's road file: fashion, road express and priority services.
constexpr std::array kIpec1250 = {
    ServiceRow{"", "FASHION", "F"},
    ServiceRow{"", "ROAD EXPRESS", "X"},
    ServiceRow{"", "PRIORITY SERVICE", "H"},
    Other("", "X"),
};

// Ipec's time-slot file: four-hour road express, one-hour priority.
constexpr std::array kIpec1256 = {
    ServiceRow{"", "ROAD EXPRESS", "4H"},
    ServiceRow{"", "PRIORITY SERVICE", "1H"},
    Other("", "4H"),
};

// Hunter: air freight, else road freight.
constexpr std::array kHunter = {
    ServiceRow{"", "AF", "AF"},
    Other("", "RF"),
};

// TNT: the first three letters of the carrier prefix name the TNT business
// (air freight, couriers, international, express, domestic) and each has
// its own service codes; "***" marks a service the business does not know.
constexpr std::array kTNTET11 = {
    ServiceRow{"AAF", "ECONOMY", "AJ"},
    ServiceRow{"AAF", "OVERNIGHT", "AE"},
    ServiceRow{"AAF", "PRIORITY ONE", "AA"},
    ServiceRow{"AAF", "STANDBY", "AT"},
    ServiceRow{"AAF", "PREPAID", "AZ"},
    Other("AAF", "***"),
    ServiceRow{"TCE", "CARGO", "CGO"},
    ServiceRow{"TCE", "EXPRESS", "EXP"},
    ServiceRow{"TCE", "LOCAL", "ONL"},
    ServiceRow{"TCE", "PREPAID", "PPD"},
    ServiceRow{"TCE", "ROAD", "RD"},
    ServiceRow{"TCE", "SAMEDAY", "SDY"},
    Other("TCE", "***"),
    ServiceRow{"TEW", "INTERNATIONAL", "INT"},
    Other("TEW", "***"),
    ServiceRow{"TEX", "EXPRESS", "01"},
    ServiceRow{"TEX", "PRIORITY", "03"},
    ServiceRow{"TEX", "EXPRESS PC", "62"},
    ServiceRow{"TEX", "FASHION", "33"},
    ServiceRow{"TEX", "SAMEDAY", "34"},
    ServiceRow{"TEX", "STANDBY AIR", "36"},
    ServiceRow{"TEX", "EXP PREMIUM", "58"},
    ServiceRow{"TEX", "SATURDAY AIR", "10"},
    Other("TEX", "***"),
    ServiceRow{"TNT", "SAMEDAY", "701"},
    ServiceRow{"TNT", "OVERNIGHT 9:00", "712"},
    ServiceRow{"TNT", "CIT", "73"},
    ServiceRow{"TNT", "O/N 1ST CLASS", "75"},
    ServiceRow{"TNT", "EXPRESS", "76"},
    ServiceRow{"TNT", "AIR/ROAD COMBO", "77"},
    ServiceRow{"TNT", "FASHION", "718"},
    ServiceRow{"TNT", "SENSITIVE EQUIP", "717"},
    ServiceRow{"TNT", "PREPAID", "72E"},
    Other("TNT", "76"),
};

// The first matching row of the group; empty text when the group is not in the table.
std::string Lookup(std::span<const ServiceRow> table, std::string_view group,
                   std::string_view service) {
  for (const ServiceRow& row : table) {
    if (row.group != group) continue;
    if (row.other || row.service == service) return std::string(row.code);
  }
  return {};
}

// Splits file bytes into lines ended by CR LF, CR or LF.
template <class Visit>
void ForEachLine(std::string_view bytes, Visit visit) {
  std::size_t start = 0;
  while (start < bytes.size()) {
    std::size_t end = bytes.find_first_of("\r\n", start);
    if (end == std::string_view::npos) {
      visit(bytes.substr(start));
      return;
    }
    visit(bytes.substr(start, end - start));
    start = end + 1;
    if (bytes[end] == '\r' && start < bytes.size() && bytes[start] == '\n') ++start;
  }
}

}  // namespace

void ConsignmentWriter::Process(const Ref<host::System>& objSystem,
                                const Ref<host::ConNote>& objConNote, const Ref<host::ASN>& objASN,
                                const Ref<host::PackList>& lstPacks, LogList& vtErrorLog) {
  system_ = objSystem;
  errorLog_ = &vtErrorLog;
  struct Done {
    ConsignmentWriter& self;
    ~Done() {
      self.errorLog_ = nullptr;
      self.CloseOpenFile();
    }
  } done{*this};
  Compile(objConNote, objASN, lstPacks);
}

void ConsignmentWriter::LogLine(long errorNumber, std::string_view procedure,
                                std::string_view message) {
  WriteLog(errorNumber, procedure, message);
  if (errorLog_) errorLog_->push_back(LastLogId());
}

bool IsCarrierFolder(const std::string& folder) {
  return FolderExists(folder) && folder.back() == kFolderSeparator;
}

bool ConsignmentWriter::CheckFolder(const std::string& folder) {
  if (IsCarrierFolder(folder)) return true;
  LogLine(0, "Open carrier message file", "Invalid folder " + folder);
  return false;
}

bool ConsignmentWriter::HasFolder(const std::string& folder) {
  if (!folder.empty()) return true;
  LogLine(0, "Open carrier message file", "Invalid folder " + folder);
  return false;
}

std::string ConsignmentWriter::CarrierLine(std::string_view utf8) {
  return ToCodePage(utf8) + "\r\n";
}

std::string ConsignmentWriter::FormatText(std::string_view text, long length, bool rightAlign) {
  if (length <= 0) return {};
  const std::string cut = Left(text, length);
  const std::string fill = Spaces(length - Len(cut));
  return rightAlign ? fill + cut : cut + fill;
}

std::string ServiceCodeOf(ServiceTable table, const Ref<host::ConNote>& conNote) {
  const std::string service = Trim(conNote->Service().Text());
  switch (table) {
    case ServiceTable::Ipec1250:
      return Lookup(kIpec1250, "", UCase(service));
    case ServiceTable::Ipec1256:
      return Lookup(kIpec1256, "", UCase(service));
    case ServiceTable::Hunter:
      return Lookup(kHunter, "", service);
    case ServiceTable::TNTET11:
      return Lookup(kTNTET11, Left(conNote->CarrierPrefix().Text(), 3), service);
  }
  return {};
}

std::string ConsignmentWriter::ServiceCode(ServiceTable table, const Ref<host::ConNote>& conNote) {
  std::string result;
  Procedure proc = Guard("Function ServiceCode");
  proc([&] { result = ServiceCodeOf(table, conNote); });
  return result;
}

std::int32_t ConsignmentWriter::WriteFile(const std::string& path) {
  std::int32_t result = 0;
  Procedure proc = Guard("Function WriteFile");
  std::optional<std::string> batch;
  if (!proc([&] {
        batch = ReadFile(path);
        return batch.has_value();
      }))
    return result;
  std::string kept;
  std::int32_t count = 0;
  if (!proc([&] {
        kept.clear();
        count = 0;
        ForEachLine(*batch, [&](std::string_view line) {
          if (line.starts_with('Z')) return;
          if (line.starts_with('B') && bValue_.empty())
            bValue_ = Trim(FromCodePage(line.substr(1, 10)));
          if (line.starts_with('A') && aValue_.empty())
            aValue_ = Trim(FromCodePage(line.substr(1, 20)));
          kept.append(line);
          kept.append("\r\n");
          ++count;
        });
      }))
    return result;
  // The batch is replaced in one rename: a failure leaves the old file whole.
  proc([&] {
    if (ReplaceFile(path, kept)) result = count;
  });
  return result;
}

double ShipmentWeightOf(const Ref<host::PackList>& packs) {
  double total = 0;
  if (!packs) return total;
  for (Ref<host::Pack> pack : *packs) {
    if (!pack) continue;
    if (Ref<host::Carton> carton = pack->Carton()) {
      const Var weight = carton->Weight();
      if (weight.IsNumeric() && weight.Number() > 0) {
        total += weight.Number();
        continue;
      }
    }
    total += pack->Weight().NumberOr(0);
  }
  return total;
}

double ConsignmentWriter::TotalShipmentWeight(const Ref<host::PackList>& packs) {
  double result = 0;
  Procedure proc = Guard("Function TotalShipmentWeight");
  proc([&] { result = ShipmentWeightOf(packs); });
  return result;
}

}  // namespace quendal
