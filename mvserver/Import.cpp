// The JSON import: one document, validated against the schema table and
// written in one transaction. Any error rolls everything back and names the
// JSON path of the value at fault.
#include <algorithm>
#include <limits>
#include <map>
#include <nlohmann/json.hpp>
#include <set>

#include "frame/Error.h"
#include "mvserver/Model.h"
#include "mvserver/SqliteHost.h"

namespace quendal::mvserver {

namespace {

using json = nlohmann::json;

std::string Quoted(std::string_view name) { return "\"" + std::string(name) + "\""; }

std::string Describe(const json& value) {
  switch (value.type()) {
    case json::value_t::string:
      return "a string";
    case json::value_t::boolean:
      return "a boolean";
    case json::value_t::number_float:
      return "a number with a fraction";
    case json::value_t::number_integer:
    case json::value_t::number_unsigned:
      return "an integer";
    case json::value_t::object:
      return "an object";
    case json::value_t::array:
      return "an array";
    case json::value_t::null:
      return "null";
    default:
      return "a value of another kind";
  }
}

// Messages quote the document's own keys and values: control characters in
// them are shown as \xNN, so a message stays one line that a terminal shows
// as it is.
std::string Printable(std::string_view text) {
  std::string shown;
  for (const char c : text) {
    const auto byte = static_cast<unsigned char>(c);
    if (byte >= 0x20 && byte != 0x7F) {
      shown += c;
      continue;
    }
    constexpr char kHex[] = "0123456789ABCDEF";
    shown += {'\\', 'x', kHex[byte >> 4], kHex[byte & 0xF]};
  }
  return shown;
}

[[noreturn]] void Reject(const std::string& path, const std::string& message) {
  throw ImportError(Printable(path + ": " + message));
}

bool FitsInteger(const json& value, std::int64_t low, std::int64_t high) {
  if (value.is_number_unsigned()) return value.get<std::uint64_t>() <= static_cast<std::uint64_t>(high);
  const auto n = value.get<std::int64_t>();
  return n >= low && n <= high;
}

[[noreturn]] void WrongType(const std::string& path, Value type, const json& value) {
  Reject(path, "expected " + std::string(ValueName(type)) + ", got " + Describe(value));
}

// A JSON scalar as the value a column of this type holds.
Var Convert(const json& value, Value type, const std::string& path) {
  if (value.is_null()) return {};
  auto wrong = [&]() { WrongType(path, type, value); };
  switch (type) {
    case Value::Text:
      if (!value.is_string()) wrong();
      return Var(value.get<std::string>());
    case Value::Integer:
    case Value::SmallInteger: {
      if (!value.is_number_integer()) wrong();
      const bool small = type == Value::SmallInteger;
      const std::int64_t low = small ? std::numeric_limits<std::int16_t>::min()
                                     : std::numeric_limits<std::int32_t>::min();
      const std::int64_t high = small ? std::numeric_limits<std::int16_t>::max()
                                      : std::numeric_limits<std::int32_t>::max();
      if (!FitsInteger(value, low, high))
        Reject(path, std::to_string(value.get<double>()) + " is out of range for " +
                         std::string(ValueName(type)));
      return Var(value.get<std::int64_t>());
    }
    case Value::Number:
      if (!value.is_number()) wrong();
      return Var(value.get<double>());
    case Value::Flag:
      if (!value.is_boolean()) wrong();
      return Var(value.get<bool>());
    case Value::Date: {
      if (!value.is_string()) wrong();
      const auto text = value.get<std::string>();
      const auto date = DateTime::Parse(text);
      if (!date) Reject(path, "malformed date \"" + text + "\" (expected YYYY-MM-DDTHH:MM:SS)");
      return Var(*date);
    }
    case Value::TextOrNumber:
      if (value.is_string()) return Var(value.get<std::string>());
      if (!value.is_number()) wrong();
      if (value.is_number_integer() && FitsInteger(value, std::numeric_limits<std::int64_t>::min(),
                                                   std::numeric_limits<std::int64_t>::max()))
        return Var(value.get<std::int64_t>());
      return Var(value.get<double>());
  }
  WrongType(path, type, value);
}

struct PendingReference {
  std::string path;
  const TypeInfo* target;
  std::int64_t id;
};

class Importer {
 public:
  Importer(SqliteHost& host) : db_(host.Db()), model_(host.model()) {}

  ImportSummary Run(const json& document) {
    if (!document.is_object()) Reject("(top level)", "expected an object, got " + Describe(document));
    for (const auto& [key, value] : document.items()) {
      const TypeDef* type = FindTable(key);
      if (!type || !type->topLevel) Reject(key, "unknown collection");
    }
    ImportSummary summary;
    for (const TypeDef& def : Types()) {
      if (!def.topLevel || !document.contains(def.table)) continue;
      const json& value = document.at(def.table);
      const std::string path(def.table);
      const TypeInfo& type = model_.Type(def.type);
      std::int64_t count = 0;
      if (def.single) {
        if (!value.is_object()) Reject(path, "expected an object, got " + Describe(value));
        UpdateSingle(type, value, path);
        count = 1;
      } else {
        if (!value.is_array()) Reject(path, "expected an array, got " + Describe(value));
        for (std::size_t i = 0; i < value.size(); ++i)
          Insert(type, value[i], path + "[" + std::to_string(i) + "]", nullptr, 0);
        count = static_cast<std::int64_t>(value.size());
      }
      summary.records.emplace_back(path, count);
      summary.total += count;
    }
    for (const auto& ref : references_) {
      if (!Exists(*ref.target, ref.id))
        Reject(ref.path, "no " + std::string(ref.target->def->type) + " " + std::to_string(ref.id));
    }
    return summary;
  }

 private:
  bool Exists(const TypeInfo& type, std::int64_t key) {
    Use s(db_.Prepare("SELECT 1 FROM " + Quoted(type.def->table) + " WHERE " +
                      Quoted(type.keyColumn) + " = ?"));
    s->Bind(1, key);
    return s->Step();
  }

  std::int64_t NextOrdinal(const TypeInfo& type) {
    auto it = ordinals_.find(&type);
    if (it == ordinals_.end()) {
      Use s(db_.Prepare("SELECT coalesce(max(Ordinal), 0) FROM " + Quoted(type.def->table)));
      s->Step();
      it = ordinals_.emplace(&type, s->Int(0)).first;
    }
    return ++it->second;
  }

  void CheckReference(const Field& field, const Var& value, const std::string& path) {
    if (field.target.empty() || value.IsNull()) return;
    references_.push_back({path, &model_.Type(field.target), value.Whole()});
  }

  void UpdateSingle(const TypeInfo& type, const json& object, const std::string& path) {
    for (const auto& [key, value] : object.items()) {
      const Field* field = FindField(*type.def, key);
      if (!field) Reject(path + "." + key, "unknown field of " + std::string(type.def->type));
      const Var v = Convert(value, field->value, path + "." + key);
      Use s(db_.Prepare("UPDATE " + Quoted(type.def->table) + " SET " + Quoted(field->name) +
                        " = ? WHERE " + Quoted(type.keyColumn) + " = 1"));
      BindValue(*s, 1, v, field->value);
      s->Run();
    }
  }

  void Insert(const TypeInfo& type, const json& object, const std::string& path,
              const Nested* parentNest, std::int64_t parentKey) {
    const TypeDef& def = *type.def;
    if (!object.is_object()) Reject(path, "expected an object, got " + Describe(object));
    std::vector<Var> row(type.columns.size());
    std::vector<std::pair<const Nested*, const json*>> nests;
    for (const auto& [key, value] : object.items()) {
      const std::string at = path + "." + key;
      if (const Field* field = FindField(def, key)) {
        const Var v = Convert(value, field->value, at);
        row[static_cast<std::size_t>(type.Column(field->name))] = v;
        CheckReference(*field, v, at);
        continue;
      }
      const Nested* nest = nullptr;
      for (const Nested& n : def.nested)
        if (n.name == key) nest = &n;
      if (!nest) Reject(at, "unknown field of " + std::string(def.type));
      if (nest->kind == Nest::Address) {
        if (value.is_null()) continue;
        if (!value.is_object()) Reject(at, "expected an object, got " + Describe(value));
        for (const auto& [name, part] : value.items()) {
          const int column = type.Column(key + "_" + name);
          const auto fields = AddressFields();
          const bool known = std::any_of(fields.begin(), fields.end(),
                                         [&field = name](const Field& f) { return f.name == field; });
          if (!known || column < 0) Reject(at + "." + name, "unknown field of Address");
          row[static_cast<std::size_t>(column)] = Convert(part, Value::Text, at + "." + name);
        }
        continue;
      }
      if (!value.is_null()) nests.emplace_back(nest, &value);
    }

    std::int64_t key = 0;
    if (!def.key.empty()) {
      const Var& id = row[static_cast<std::size_t>(type.Column(def.key))];
      const std::string at = path + "." + std::string(def.key);
      if (id.IsNull()) Reject(at, "required");
      key = id.Whole();
      auto& seen = keys_[&type];
      if (auto it = seen.find(key); it != seen.end())
        Reject(at, "duplicate " + std::string(def.key) + " " + std::to_string(key) + " (also " +
                       it->second + ")");
      if (Exists(type, key))
        Reject(at, std::string(def.key) + " " + std::to_string(key) +
                       " already exists in the database");
      seen.emplace(key, path);
    }
    if (parentNest) row[static_cast<std::size_t>(type.Column(parentNest->column))] = Var(parentKey);
    row[static_cast<std::size_t>(type.Column("Ordinal"))] = Var(NextOrdinal(type));
    {
      Use s(db_.Prepare(type.insertRow));
      for (std::size_t i = 0; i < row.size(); ++i)
        BindValue(*s, static_cast<int>(i) + 1, row[i], type.columns[i].value);
      s->Run();
    }
    if (def.key.empty()) key = db_.LastInsertRowId();

    for (const auto& [nest, value] : nests) InsertNested(*nest, *value, path + "." + std::string(nest->name), key);
  }

  void InsertNested(const Nested& nest, const json& value, const std::string& path,
                    std::int64_t parentKey) {
    switch (nest.kind) {
      case Nest::Records: {
        if (!value.is_array()) Reject(path, "expected an array, got " + Describe(value));
        const TypeInfo& child = model_.Type(nest.type);
        for (std::size_t i = 0; i < value.size(); ++i)
          Insert(child, value[i], path + "[" + std::to_string(i) + "]", &nest, parentKey);
        return;
      }
      case Nest::IdList: {
        if (!value.is_array()) Reject(path, "expected an array, got " + Describe(value));
        const TypeInfo& target = model_.Type(nest.type);
        Use s(db_.Prepare("INSERT INTO " + Quoted(nest.table) + " (" + Quoted(nest.column) +
                          ", Ordinal, " + Quoted(nest.idColumn) + ") VALUES (?, ?, ?)"));
        for (std::size_t i = 0; i < value.size(); ++i) {
          const std::string at = path + "[" + std::to_string(i) + "]";
          const Var id = Convert(value[i], Value::Integer, at);
          if (id.IsNull()) Reject(at, "expected an id, got null");
          references_.push_back({at, &target, id.Whole()});
          s->Reset();
          s->Bind(1, parentKey);
          s->Bind(2, static_cast<std::int64_t>(i + 1));
          s->Bind(3, id.Whole());
          s->Run();
        }
        return;
      }
      case Nest::TextMap: {
        if (!value.is_object()) Reject(path, "expected an object, got " + Describe(value));
        Use s(db_.Prepare("INSERT INTO " + Quoted(nest.table) + " (" + Quoted(nest.column) +
                          ", Key, Value) VALUES (?, ?, ?)"));
        for (const auto& [key, text] : value.items()) {
          const Var v = Convert(text, Value::Text, path + "." + key);
          s->Reset();
          s->Bind(1, parentKey);
          s->Bind(2, std::string_view(key));
          BindValue(*s, 3, v, Value::Text);
          s->Run();
        }
        return;
      }
      case Nest::Address:
        return;
    }
  }

  Database& db_;
  Model& model_;
  std::vector<PendingReference> references_;
  std::map<const TypeInfo*, std::int64_t> ordinals_;
  std::map<const TypeInfo*, std::map<std::int64_t, std::string>> keys_;
};

}  // namespace

ImportSummary SqliteHost::Import(std::string_view text) {
  json document;
  try {
    document = json::parse(text);
  } catch (const json::exception& e) {
    // A syntax error, or a number too large for a double ("1e999"). The library's
    // message starts with its own tag: "[json.exception.parse_error.101] ".
    std::string message = e.what();
    if (auto end = message.find("] "); message.starts_with("[json.") && end != std::string::npos)
      message.erase(0, end + 2);
    throw ImportError(Printable("invalid JSON: " + message));
  }
  ImportSummary summary;
  {
    Transaction tx(db_);
    try {
      summary = Importer(*this).Run(document);
    } catch (...) {
      model_->Invalidate();
      throw;
    }
    tx.Commit();
  }
  model_->Invalidate();
  model_->dataVersion = db_.DataVersion();
  return summary;
}

}  // namespace quendal::mvserver
