// The reference host's data model in one table: every host type with its
// stored fields, nested parts, derived collections and look-up keys. The
// SQLite schema, the JSON import's validation and the member dispatch of
// the host objects are all read from it.
#pragma once

#include <cstdint>
#include <span>
#include <string_view>

namespace quendal::mvserver {

// Value types of stored fields.
enum class Value : std::uint8_t {
  Text,
  Integer,       // 32-bit
  SmallInteger,  // 16-bit
  Number,
  Flag,
  Date,          // "YYYY-MM-DDTHH:MM:SS", local time
  TextOrNumber,  // a number a host may also hold as non-numeric text
};

std::string_view ValueName(Value value);  // "text", "an integer", ...

// A stored field: JSON field, column and host member of the same name.
struct Field {
  std::string_view name;
  Value value;
  // For a reference: the type whose key the field holds, and the object member it resolves.
  std::string_view target = {};
  std::string_view object = {};
  // When the reference is Null: the object member whose member of the same name stands in.
  std::string_view fallback = {};
  bool settable = false;
};

// A part a record nests in the JSON document.
enum class Nest : std::uint8_t {
  Records,  // an array of child records (their own type and table), also a collection member
  Address,  // an Address object held in columns "<name>_<field>"; never Nothing
  IdList,   // an array of ids of `type`, kept in `table` (parent column, Ordinal, id column)
  TextMap,  // an object of key -> text, kept in `table` (parent column, Key, Value)
};

struct Nested {
  std::string_view name;    // JSON field (and member for Records and Address)
  Nest kind;
  std::string_view type;    // child or referenced type
  std::string_view table;   // child table (IdList, TextMap)
  std::string_view column;  // the child's column holding the parent's key
  std::string_view idColumn = {};  // IdList: the column of the ids
  bool member = true;       // Records: reachable as a collection member
};

// The parent of a nested record: the column holding its key and the member reaching it.
struct Parent {
  std::string_view column;
  std::string_view type;
  std::string_view member;  // empty: not a member
};

// A collection computed from other records.
enum class Derived : std::uint8_t {
  Referrers,      // records of `type` whose `column` holds this record's key, in document order
  ListOrDerived,  // the nested id list `list` when given, else the distinct `column` objects of `via`
};

struct Collection {
  std::string_view member;
  Derived kind;
  std::string_view type;
  std::string_view column;
  std::string_view list = {};  // ListOrDerived: the nested IdList
  std::string_view via = {};   // ListOrDerived: the collection member whose items supply `column`
};

struct TypeDef {
  std::string_view type;   // host type name
  std::string_view table;  // SQLite table; JSON array (or object) of the top-level types
  std::string_view key;    // key field; empty: a row id the host assigns (nested records, System)
  std::span<const Field> fields;
  std::span<const Nested> nested = {};
  std::span<const Parent> parents = {};
  std::span<const Collection> collections = {};
  // Load() binds the first record whose members equal these; setting them never writes through.
  std::span<const std::string_view> loadKeys = {};
  bool topLevel = true;  // a JSON top-level key
  bool single = false;   // one object rather than an array (System)
  bool newKeyReadsZero = false;  // the key of a new, unsaved record reads 0 rather than Null
};

// Every type, in JSON document order (referenced types before their referrers).
std::span<const TypeDef> Types();
const TypeDef* FindType(std::string_view type);
const TypeDef* FindTable(std::string_view table);
const Field* FindField(const TypeDef& type, std::string_view name);

// The Address type: its fields are the columns of a nested address.
std::span<const Field> AddressFields();

// The schema version this host writes; a newer file is refused, an older one migrated.
inline constexpr int kSchemaVersion = 1;

}  // namespace quendal::mvserver
