#include "cli/Cli.h"

#include <algorithm>
#include <ostream>

namespace quendal::cli {

const CatalogueEntry& BuiltClass(std::string_view name, Family family) {
  const CatalogueEntry* entry = FindClass(name);
  if (!entry) throw UsageError("no class " + std::string(name) + " in the catalogue (see quendal classes)");
  if (entry->family != family)
    throw UsageError(entry->Identifier() + " is a " + std::string(FamilyName(entry->family)) +
                     " class; this command needs a " + std::string(FamilyName(family)) + " class");
  if (!entry->factory) throw UsageError(entry->Identifier() + " is not built yet");
  return *entry;
}

json VarJson(const Var& value) {
  switch (value.type()) {
    case Var::Type::Null:
      return nullptr;
    case Var::Type::Flag:
      return value.Flag();
    case Var::Type::Int32:
    case Var::Type::Int64:
      return value.Whole();
    case Var::Type::Number:
      return value.Number();
    case Var::Type::Date:
      return value.Date().Iso();
    case Var::Type::Object:
      return "(object)";
    case Var::Type::Text:
      break;
  }
  return value.Text();
}

std::string VarText(const Var& value) {
  if (value.IsDate()) return value.Date().Iso();
  if (value.IsObject()) return "(object)";
  return value.Text();
}

json LogJson(const Ref<host::Log>& log) {
  return json{{"LogId", VarJson(log->LogId())},         {"LogDate", VarJson(log->LogDate())},
              {"UserName", VarJson(log->UserName())},   {"ComputerName", VarJson(log->ComputerName())},
              {"Source", VarJson(log->Source())},       {"Procedure", VarJson(log->Procedure())},
              {"ErrorNumber", VarJson(log->ErrorNumber())}, {"Level", VarJson(log->Level())},
              {"Message", VarJson(log->Message())}};
}

json LogsJson(const std::vector<Ref<host::Log>>& logs) {
  json list = json::array();
  for (const auto& log : logs) list.push_back(LogJson(log));
  return list;
}

void PrintTable(std::ostream& out, const std::vector<std::string>& header,
                const std::vector<std::vector<std::string>>& rows) {
  std::vector<std::size_t> widths(header.size());
  for (std::size_t i = 0; i < header.size(); ++i) widths[i] = header[i].size();
  for (const auto& row : rows)
    for (std::size_t i = 0; i < row.size() && i < widths.size(); ++i)
      widths[i] = std::max(widths[i], row[i].size());
  auto line = [&](const std::vector<std::string>& cells) {
    std::string text;
    for (std::size_t i = 0; i < cells.size() && i < widths.size(); ++i) {
      text += cells[i];
      if (i + 1 < cells.size()) text += std::string(widths[i] - cells[i].size() + 2, ' ');
    }
    out << text << "\n";
  };
  line(header);
  for (const auto& row : rows) line(row);
}

void PrintLogs(std::ostream& out, const std::vector<Ref<host::Log>>& logs) {
  if (logs.empty()) {
    out << "No log entries.\n";
    return;
  }
  std::vector<std::vector<std::string>> rows;
  for (const auto& log : logs)
    rows.push_back({VarText(log->LogId()), VarText(log->LogDate()), VarText(log->Source()),
                    VarText(log->Procedure()), VarText(log->ErrorNumber()), VarText(log->Level()),
                    VarText(log->Message())});
  PrintTable(out, {"LogId", "LogDate", "Source", "Procedure", "Error", "Level", "Message"}, rows);
}

namespace {

class SystemWithOverride : public host::System {
 public:
  SystemWithOverride(Ref<host::System> inner, std::string member, Var value)
      : inner_(std::move(inner)), member_(std::move(member)), value_(std::move(value)) {}
  std::string_view TypeName() const override { return inner_.ptr()->TypeName(); }
  Var Get(std::string_view member) override {
    return member == member_ ? value_ : inner_->Get(member);
  }
  void Set(std::string_view member, const Var& value) override { inner_->Set(member, value); }
  Var Call(std::string_view method, std::span<const Var> args) override {
    return inner_->Call(method, args);
  }
  using host::System::Call;

 private:
  Ref<host::System> inner_;
  std::string member_;
  Var value_;
};

}  // namespace

Ref<host::System> OverrideSystem(Ref<host::System> system, std::string member, Var value) {
  return Ref<host::System>(
      std::make_shared<SystemWithOverride>(std::move(system), std::move(member), std::move(value)));
}

}  // namespace quendal::cli
