// Shared pieces of the quendal command: the two kinds of failure the exit
// status reports, the catalogue checks of the work commands, and the ways a
// result is shown (text for people, JSON for programs).
#pragma once

#include <iosfwd>
#include <memory>
#include <nlohmann/json.hpp>
#include <optional>
#include <stdexcept>
#include <string>
#include <string_view>
#include <vector>

#include "frame/Catalogue.h"
#include "frame/host/Host.h"

namespace quendal::cli {

using json = nlohmann::json;

// Bad usage or bad input: exit status 1.
class UsageError : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

// The database or a file can't be opened: exit status 2.
class OpenFailure : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

// The catalogue entry of a class named "clsX" or "Quendal.clsX"; UsageError when it is
// unknown, of another family, or not built yet.
const CatalogueEntry& BuiltClass(std::string_view name, Family family);
// Creates a built class and reaches its family interface.
template <class Interface>
std::unique_ptr<Component> Create(const CatalogueEntry& entry, Interface*& out) {
  Created created = CreateObject(entry.Identifier());
  if (!created.object) throw UsageError(created.reason);
  out = as<Interface>(created.object);
  if (!out) throw UsageError(entry.Identifier() + " does not offer the " +
                             std::string(FamilyName(entry.family)) + " interface");
  return std::move(created.object);
}

json VarJson(const Var& value);
std::string VarText(const Var& value);
json LogJson(const Ref<host::Log>& log);
json LogsJson(const std::vector<Ref<host::Log>>& logs);

// A plain text table: a header line and left-aligned columns.
void PrintTable(std::ostream& out, const std::vector<std::string>& header,
                const std::vector<std::vector<std::string>>& rows);
void PrintLogs(std::ostream& out, const std::vector<Ref<host::Log>>& logs);

// A System object that answers some members itself (--language) and passes the rest on.
Ref<host::System> OverrideSystem(Ref<host::System> system, std::string member, Var value);

}  // namespace quendal::cli
