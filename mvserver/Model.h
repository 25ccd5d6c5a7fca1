// What the reference host derives from the schema table at start-up: the
// columns of each table and how each member of each type resolves. Shared
// by the host objects and the import.
#pragma once

#include <cstdint>
#include <map>
#include <memory>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "frame/Var.h"
#include "frame/host/Host.h"
#include "mvserver/Database.h"
#include "mvserver/Schema.h"

namespace quendal::mvserver {

class SqliteHost;
struct TypeInfo;

using Row = std::vector<Var>;

struct ColumnDef {
  std::string name;
  Value value;
};

enum class MemberKind : std::uint8_t {
  Column,         // a stored scalar
  Reference,      // an object by the id a column holds
  Parent,         // the record a nested record belongs to
  Address,        // a nested address (columns with a prefix)
  Children,       // nested records of another type
  Referrers,      // records of another type that point here
  ListOrDerived,  // an id list when given, else derived through another collection
  LogId,          // Log.ID: reads the key; set on a new entry, binds it
};

struct Member {
  MemberKind kind = MemberKind::Column;
  int column = -1;                  // Column, Reference, Parent
  Value value = Value::Text;        // Column
  bool settable = false;
  bool lookupKey = false;           // staged, never written through; Load matches it
  const TypeInfo* target = nullptr; // the type of the object or of the collection's items
  std::string targetColumn;         // Children, Referrers: the item column holding our key
  int fallbackColumn = -1;          // Reference: a parent column holding the stand-in id
  std::string fallbackMember;       // Reference: an object member whose same-named member stands in
  std::string objectName;           // Reference: the member name (for the fallback's look-up)
  std::vector<int> addressColumns;  // Address: the columns, in AddressFields order
  // ListOrDerived
  const Nested* list = nullptr;
  std::string via;
};

using ObjectMaker = std::shared_ptr<host::Object> (*)(std::shared_ptr<SqliteHost>, const TypeInfo*);
using CollectionMaker = std::shared_ptr<host::Object> (*)(std::shared_ptr<SqliteHost>,
                                                         const TypeInfo*, std::vector<std::int64_t>);

struct TypeInfo {
  const TypeDef* def = nullptr;
  std::string keyColumn;  // the key field, or "RowId"
  std::vector<ColumnDef> columns;
  std::map<std::string, int, std::less<>> columnIndex;
  std::map<std::string, Member, std::less<>> members;
  std::string selectRow;  // every column of one row by key
  std::string insertRow;  // every column, one parameter each
  std::string keysInOrder;
  ObjectMaker makeObject = nullptr;
  CollectionMaker makeCollection = nullptr;
  std::unordered_map<std::int64_t, Row> cache;

  int Column(std::string_view name) const {
    auto it = columnIndex.find(name);
    return it == columnIndex.end() ? -1 : it->second;
  }
};

struct Model {
  std::vector<std::unique_ptr<TypeInfo>> types;
  std::uint32_t dataVersion = 0;
  std::uint64_t generation = 0;  // counts invalidations: cached objects older than this are stale

  const TypeInfo& Type(std::string_view name) const;
  // Forgets every cached row: after any write.
  void Invalidate();
};

// Builds the model of every type in the schema table.
std::unique_ptr<Model> BuildModel();

// Binds a value as a column of the given type holds it (Null as NULL); raises
// "Type mismatch" or "Overflow" as an automation host would for a bad value.
void BindValue(Statement& statement, int index, const Var& value, Value type);
// The value a column holds, as the host member returns it.
Var ReadValue(const Statement& statement, int column, Value type);

}  // namespace quendal::mvserver
