#include "mvserver/SqliteHost.h"

#include <sqlite3.h>

#include <array>
#include <limits>
#include <optional>
#include <set>

#include "frame/Error.h"
#include "mvserver/Model.h"

namespace quendal::mvserver {

namespace {

constexpr std::size_t kCachedRowsPerType = 20000;

Error NoSuchMember(std::string_view type, std::string_view member) {
  return Error(err::kNoSuchMember,
               std::string(StandardDescription(err::kNoSuchMember)) + ": " + std::string(type) +
                   "." + std::string(member),
               "mvserver");
}

std::string Quoted(std::string_view name) { return "\"" + std::string(name) + "\""; }

std::string_view SqlType(Value value) {
  switch (value) {
    case Value::Text:
    case Value::Date:
      return " TEXT";
    case Value::Integer:
    case Value::SmallInteger:
    case Value::Flag:
      return " INTEGER";
    case Value::Number:
      return " REAL";
    case Value::TextOrNumber:
      return "";  // no affinity: the value stays as given
  }
  return "";
}

// A value converted to what a column of that type holds, so that a bad value
// fails at the setter, as it would on an automation host.
Var Coerce(const Var& value, Value type) {
  if (value.IsNull()) return {};
  if (value.IsObject()) throw Error(err::kTypeMismatch);
  switch (type) {
    case Value::Text:
      return Var(value.Text());
    case Value::Integer: {
      const std::int64_t n = value.Whole();
      if (n < std::numeric_limits<std::int32_t>::min() || n > std::numeric_limits<std::int32_t>::max())
        throw Error(err::kOverflow);
      return Var(static_cast<std::int32_t>(n));
    }
    case Value::SmallInteger: {
      const std::int64_t n = value.Whole();
      if (n < std::numeric_limits<std::int16_t>::min() || n > std::numeric_limits<std::int16_t>::max())
        throw Error(err::kOverflow);
      return Var(static_cast<std::int32_t>(n));
    }
    case Value::Number:
      return Var(value.Number());
    case Value::Flag:
      return Var(value.Flag());
    case Value::Date:
      return Var(value.Date());
    case Value::TextOrNumber:
      if (value.IsText()) return value;
      return Var(value.Number());
  }
  return value;
}

}  // namespace

// ---------------------------------------------------------------- values

void BindValue(Statement& statement, int index, const Var& value, Value type) {
  const Var v = Coerce(value, type);
  switch (v.type()) {
    case Var::Type::Null:
      statement.BindNull(index);
      return;
    case Var::Type::Flag:
      statement.Bind(index, static_cast<std::int64_t>(v.Flag() ? 1 : 0));
      return;
    case Var::Type::Int32:
    case Var::Type::Int64:
      statement.Bind(index, static_cast<std::int64_t>(v.Whole()));
      return;
    case Var::Type::Number:
      statement.Bind(index, v.Number());
      return;
    case Var::Type::Date:
      statement.Bind(index, std::string_view(v.Date().Iso()));
      return;
    default: {
      const std::string text = v.Text();
      statement.Bind(index, std::string_view(text));
    }
  }
}

Var ReadValue(const Statement& statement, int column, Value type) {
  const int stored = statement.ColumnType(column);
  if (stored == SQLITE_NULL) return {};
  switch (type) {
    case Value::Integer:
    case Value::SmallInteger: {
      const std::int64_t n = statement.Int(column);
      if (n >= std::numeric_limits<std::int32_t>::min() && n <= std::numeric_limits<std::int32_t>::max())
        return Var(static_cast<std::int32_t>(n));
      return Var(n);
    }
    case Value::Number:
      return Var(statement.Real(column));
    case Value::Flag:
      return Var(statement.Int(column) != 0);
    case Value::Date: {
      const std::string text = statement.Text(column);
      if (auto d = DateTime::Parse(text)) return Var(*d);
      return Var(text);
    }
    case Value::TextOrNumber:
      if (stored == SQLITE_INTEGER) return Var(static_cast<double>(statement.Int(column)));
      if (stored == SQLITE_FLOAT) return Var(statement.Real(column));
      return Var(statement.Text(column));
    case Value::Text:
      break;
  }
  return Var(statement.Text(column));
}

// ---------------------------------------------------------------- model

const TypeInfo& Model::Type(std::string_view name) const {
  for (const auto& t : types)
    if (t->def->type == name) return *t;
  throw Error(err::kCannotCreateObject, "no host type " + std::string(name), "mvserver");
}

void Model::Invalidate() {
  for (auto& t : types) t->cache.clear();
  ++generation;
}

namespace {

class SqlRecord;

// Gives access to the record behind a host object of this host.
class HasRecord {
 public:
  virtual ~HasRecord() = default;
  virtual SqlRecord& record() = 0;
};

// Reading, writing and querying for the objects of one host.
class Store {
 public:
  explicit Store(std::shared_ptr<SqliteHost> host) : host_(std::move(host)) {}

  SqliteHost& host() { return *host_; }
  const std::shared_ptr<SqliteHost>& shared() { return host_; }
  Model& model() { return host_->model(); }
  Database& db() { return host_->Db(); }

  // Forgets what was read when another connection changed the file; returns the generation.
  std::uint64_t CheckVersion() {
    const std::uint32_t version = db().DataVersion();
    if (version != model().dataVersion) {
      model().Invalidate();
      model().dataVersion = version;
    }
    return model().generation;
  }

  // The row of a record, from the cache until the next write; null when there is none.
  const Row* ReadRow(const TypeInfo& type, std::int64_t key) {
    CheckVersion();
    auto& cache = const_cast<TypeInfo&>(type).cache;
    if (auto it = cache.find(key); it != cache.end()) return &it->second;
    Use s(db().Prepare(type.selectRow));
    s->Bind(1, key);
    if (!s->Step()) return nullptr;
    Row row;
    row.reserve(type.columns.size());
    for (std::size_t i = 0; i < type.columns.size(); ++i)
      row.push_back(ReadValue(*s, static_cast<int>(i), type.columns[i].value));
    if (cache.size() >= kCachedRowsPerType) cache.clear();
    return &cache.emplace(key, std::move(row)).first->second;
  }

  std::shared_ptr<host::Object> NewObject(const TypeInfo& type) {
    return type.makeObject(host_, &type);
  }
  std::shared_ptr<host::Object> Bound(const TypeInfo& type, std::int64_t key);
  std::shared_ptr<host::Object> List(const TypeInfo& item, std::vector<std::int64_t> keys) {
    return item.makeCollection(host_, &item, std::move(keys));
  }

  // After this host's own write: rows read before stay valid except `changed`, but
  // collections and objects handed out are resolved again.
  void Wrote(const TypeInfo* type = nullptr, std::optional<std::int64_t> changed = std::nullopt) {
    if (type && changed) const_cast<TypeInfo&>(*type).cache.erase(*changed);
    ++model().generation;
    model().dataVersion = db().DataVersion();
  }

  void WriteColumn(const TypeInfo& type, std::int64_t key, int column, const Var& value) {
    const ColumnDef& c = type.columns[static_cast<std::size_t>(column)];
    const std::string sql = "UPDATE " + Quoted(type.def->table) + " SET " + Quoted(c.name) +
                            " = ? WHERE " + Quoted(type.keyColumn) + " = ?";
    {
      Use s(db().Prepare(sql));
      BindValue(*s, 1, value, c.value);
      s->Bind(2, key);
      s->Run();
    }
    Wrote(&type, key);
  }

  // Keys (or any single integer column) a query returns.
  template <class Binder>
  std::vector<std::int64_t> Ids(const std::string& sql, Binder bind) {
    std::vector<std::int64_t> ids;
    Use s(db().Prepare(sql));
    bind(*s);
    while (s->Step()) ids.push_back(s->Int(0));
    return ids;
  }

  std::optional<std::int64_t> FirstId(const std::string& sql, auto bind) {
    auto ids = Ids(sql, bind);
    if (ids.empty()) return std::nullopt;
    return ids.front();
  }

  std::int64_t NextValue(const TypeInfo& type, std::string_view column) {
    const std::string sql = "SELECT coalesce(max(" + Quoted(column) + "), 0) + 1 FROM " +
                            Quoted(type.def->table);
    return Ids(sql, [](Statement&) {}).front();
  }

  // Inserts a new record from staged values; the key and ordinal are assigned here.
  void InsertStaged(const TypeInfo& type, std::int64_t key,
                    const std::map<std::string, Var, std::less<>>& values) {
    const std::int64_t ordinal = NextValue(type, "Ordinal");
    Use s(db().Prepare(type.insertRow));
    for (std::size_t i = 0; i < type.columns.size(); ++i) {
      const ColumnDef& c = type.columns[i];
      const int index = static_cast<int>(i) + 1;
      if (c.name == type.keyColumn)
        s->Bind(index, key);
      else if (c.name == "Ordinal")
        s->Bind(index, ordinal);
      else if (auto it = values.find(c.name); it != values.end())
        BindValue(*s, index, it->second, c.value);
      else
        s->BindNull(index);
    }
    s->Run();
  }

 private:
  std::shared_ptr<SqliteHost> host_;
};

// One record of a host type: bound to a row, or new with staged values.
class SqlRecord {
 public:
  SqlRecord(std::shared_ptr<SqliteHost> host, const TypeInfo* type)
      : store_(std::move(host)), type_(type) {}

  std::string_view TypeName() const { return type_->def->type; }
  void Bind(std::int64_t key) { key_ = key; }
  const std::optional<std::int64_t>& Key() const { return key_; }
  const TypeInfo& Type() const { return *type_; }

  Var Get(std::string_view name);
  void Set(std::string_view name, const Var& value);
  Var Call(std::string_view method, std::span<const Var> args);

 private:
  friend struct Methods;

  const Member& Find(std::string_view name) const {
    auto it = type_->members.find(name);
    if (it == type_->members.end()) throw NoSuchMember(type_->def->type, name);
    return it->second;
  }
  const Row* RowOrNull() { return key_ ? store_.ReadRow(*type_, *key_) : nullptr; }
  Var ColumnValue(std::string_view name, const Member& m);
  Var FromColumn(int column) {
    const Row* row = RowOrNull();
    return row ? (*row)[static_cast<std::size_t>(column)] : Var();
  }
  Var ResolveReference(const Member& m, std::string_view name);
  Var Items(const Member& m);
  Var Resolve(std::string_view name, const Member& m);

  Store store_;
  const TypeInfo* type_;
  std::optional<std::int64_t> key_;
  std::map<std::string, Var, std::less<>> staged_;

  // The objects and collections this record handed out. The record keeps them, as a
  // host object keeps its children, so `for (auto line : *pack->Lines())` iterates a
  // collection that is still alive; a stale one is kept (retired) rather than freed.
  struct Handed {
    std::uint64_t generation;
    std::optional<std::int64_t> key;
    Var value;
  };
  std::map<std::string, Handed, std::less<>> handed_;
  std::vector<Var> retired_;
};

template <class T>
class RecordObject : public T, public HasRecord {
 public:
  RecordObject(std::shared_ptr<SqliteHost> host, const TypeInfo* type)
      : record_(std::move(host), type) {}
  std::string_view TypeName() const override { return record_.TypeName(); }
  Var Get(std::string_view member) override { return record_.Get(member); }
  void Set(std::string_view member, const Var& value) override { record_.Set(member, value); }
  Var Call(std::string_view method, std::span<const Var> args) override {
    return record_.Call(method, args);
  }
  using T::Call;
  SqlRecord& record() override { return record_; }

 private:
  SqlRecord record_;
};

// A collection of records, each made when first reached.
template <class C>
class ListObject : public C {
 public:
  ListObject(std::shared_ptr<SqliteHost> host, const TypeInfo* item, std::vector<std::int64_t> keys)
      : store_(std::move(host)), item_(item) {
    entries_.reserve(keys.size());
    for (auto key : keys) entries_.push_back({key, nullptr});
  }
  std::string_view TypeName() const override { return "Collection"; }
  Var Get(std::string_view member) override {
    if (member == "Count") return Var(static_cast<std::int32_t>(entries_.size()));
    throw NoSuchMember("Collection", member);
  }
  void Set(std::string_view member, const Var&) override { throw NoSuchMember("Collection", member); }
  Var Call(std::string_view method, std::span<const Var> args) override {
    if (method == "Item" && args.size() == 1) {
      const std::int64_t i = args[0].Whole();
      if (i < 1 || i > static_cast<std::int64_t>(entries_.size()))
        throw Error(err::kSubscript, {}, "mvserver");
      Entry& e = entries_[static_cast<std::size_t>(i - 1)];
      if (!e.object) e.object = store_.Bound(*item_, e.key);
      return e.object ? Var(e.object) : Var();
    }
    if (method == "Add" && (args.size() == 1 || args.size() == 2)) {
      auto object = args[0].Object();
      if (!object) throw Error(err::kObjectRequired, {}, "mvserver");
      std::int64_t key = 0;
      if (auto* r = dynamic_cast<HasRecord*>(object.get()); r && r->record().Key())
        key = *r->record().Key();
      entries_.push_back({key, std::move(object)});
      return {};
    }
    if (method == "Count" && args.empty()) return Get("Count");
    throw NoSuchMember("Collection", method);
  }
  using C::Call;

 private:
  struct Entry {
    std::int64_t key;
    std::shared_ptr<host::Object> object;
  };
  Store store_;
  const TypeInfo* item_;
  std::vector<Entry> entries_;
};

// A nested address: a read-only snapshot of its columns.
class AddressObject : public host::Address {
 public:
  explicit AddressObject(std::vector<Var> values) : values_(std::move(values)) {}
  std::string_view TypeName() const override { return "Address"; }
  Var Get(std::string_view member) override {
    const auto fields = AddressFields();
    for (std::size_t i = 0; i < fields.size(); ++i)
      if (fields[i].name == member) return values_[i];
    throw NoSuchMember("Address", member);
  }
  void Set(std::string_view member, const Var&) override { throw NoSuchMember("Address", member); }
  Var Call(std::string_view method, std::span<const Var>) override {
    throw NoSuchMember("Address", method);
  }
  using host::Address::Call;

 private:
  std::vector<Var> values_;
};

std::shared_ptr<host::Object> Store::Bound(const TypeInfo& type, std::int64_t key) {
  if (!ReadRow(type, key)) return nullptr;
  auto object = NewObject(type);
  dynamic_cast<HasRecord&>(*object).record().Bind(key);
  return object;
}

Var SqlRecord::ColumnValue(std::string_view name, const Member& m) {
  if (m.lookupKey || !key_) {
    if (auto it = staged_.find(name); it != staged_.end()) return it->second;
  }
  if (!key_) {
    if (type_->def->newKeyReadsZero && name == type_->keyColumn) return Var(0);
    return {};
  }
  return FromColumn(m.column);
}

Var SqlRecord::ResolveReference(const Member& m, std::string_view name) {
  Var id = ColumnValue(name, m);
  if (id.IsNull() && m.fallbackColumn >= 0) id = FromColumn(m.fallbackColumn);
  if (id.IsNull() && !m.fallbackMember.empty()) {
    const Var via = Get(m.fallbackMember);
    if (!via.IsObject()) return {};
    return via.Object()->Get(m.objectName);
  }
  if (id.IsNull()) return {};
  auto object = store_.Bound(*m.target, id.Whole());
  return object ? Var(object) : Var();
}

Var SqlRecord::Items(const Member& m) {
  const TypeInfo& item = *m.target;
  std::vector<std::int64_t> keys;
  if (key_) {
    const std::int64_t key = *key_;
    auto bindKey = [key](Statement& s) { s.Bind(1, key); };
    if (m.kind == MemberKind::ListOrDerived) {
      keys = store_.Ids("SELECT " + Quoted(m.list->idColumn) + " FROM " + Quoted(m.list->table) +
                            " WHERE " + Quoted(m.list->column) + " = ? ORDER BY Ordinal",
                        bindKey);
      if (keys.empty()) {
        const Member& via = Find(m.via);
        const std::string column = Quoted(m.targetColumn);
        keys = store_.Ids("SELECT " + column + " FROM " + Quoted(via.target->def->table) +
                              " WHERE " + Quoted(via.targetColumn) + " = ? AND " + column +
                              " IS NOT NULL GROUP BY " + column + " ORDER BY min(Ordinal)",
                          bindKey);
      }
    } else {
      keys = store_.Ids("SELECT " + Quoted(item.keyColumn) + " FROM " + Quoted(item.def->table) +
                            " WHERE " + Quoted(m.targetColumn) + " = ? ORDER BY Ordinal",
                        bindKey);
    }
  }
  return Var(store_.List(item, std::move(keys)));
}

Var SqlRecord::Get(std::string_view name) {
  const Member& m = Find(name);
  switch (m.kind) {
    case MemberKind::Column:
      return ColumnValue(name, m);
    case MemberKind::LogId:
      if (key_) return Var(static_cast<std::int32_t>(*key_));
      if (auto it = staged_.find(name); it != staged_.end()) return it->second;
      return {};
    default:
      break;
  }
  const std::uint64_t generation = store_.CheckVersion();
  auto it = handed_.find(name);
  if (it != handed_.end() && it->second.generation == generation && it->second.key == key_)
    return it->second.value;
  Var value = Resolve(name, m);
  if (it == handed_.end()) {
    handed_.emplace(std::string(name), Handed{generation, key_, value});
  } else {
    if (retired_.size() >= 256) retired_.erase(retired_.begin(), retired_.begin() + 128);
    retired_.push_back(std::move(it->second.value));
    it->second = Handed{generation, key_, value};
  }
  return value;
}

Var SqlRecord::Resolve(std::string_view name, const Member& m) {
  switch (m.kind) {
    case MemberKind::Column:
    case MemberKind::LogId:
      return {};
    case MemberKind::Reference:
      return ResolveReference(m, name);
    case MemberKind::Parent: {
      const Var id = FromColumn(m.column);
      if (id.IsNull()) return {};
      auto object = store_.Bound(*m.target, id.Whole());
      return object ? Var(object) : Var();
    }
    case MemberKind::Address: {
      std::vector<Var> values;
      for (int column : m.addressColumns) values.push_back(FromColumn(column));
      return Var(std::make_shared<AddressObject>(std::move(values)));
    }
    case MemberKind::Children:
    case MemberKind::Referrers:
    case MemberKind::ListOrDerived:
      return Items(m);
  }
  return {};
}

void SqlRecord::Set(std::string_view name, const Var& value) {
  const Member& m = Find(name);
  if (m.kind == MemberKind::LogId) {
    // Setting ID binds a new entry object to an existing entry; 0 binds nothing.
    const Var id = Coerce(value, Value::Integer);
    staged_.clear();
    key_.reset();
    if (!id.IsNull() && id.Whole() != 0 && store_.ReadRow(*type_, id.Whole()))
      key_ = id.Whole();
    else
      staged_[std::string(name)] = id;
    return;
  }
  if (m.kind != MemberKind::Column || !m.settable) throw NoSuchMember(type_->def->type, name);
  const Var v = Coerce(value, m.value);
  if (m.lookupKey || !key_) {
    staged_[std::string(name)] = v;
    return;
  }
  store_.WriteColumn(*type_, *key_, m.column, v);
}

// The methods of the host types.
struct Methods {
  using Handler = Var (*)(SqlRecord&, std::span<const Var>);
  struct Entry {
    std::string_view type;  // empty: any type that has look-up keys
    std::string_view name;
    std::size_t minArgs;
    std::size_t maxArgs;
    Handler handler;
  };

  static Var Load(SqlRecord& r, std::span<const Var>) {
    const TypeInfo& t = *r.type_;
    std::string sql = "SELECT " + Quoted(t.keyColumn) + " FROM " + Quoted(t.def->table) + " WHERE ";
    for (std::size_t i = 0; i < t.def->loadKeys.size(); ++i)
      sql += (i ? " AND " : "") + Quoted(t.def->loadKeys[i]) + " IS ?";
    sql += " ORDER BY Ordinal LIMIT 1";
    std::vector<Var> values;
    for (auto key : t.def->loadKeys) values.push_back(r.ColumnValue(key, r.Find(key)));
    const auto found = r.store_.FirstId(sql, [&](Statement& s) {
      for (std::size_t i = 0; i < values.size(); ++i)
        BindValue(s, static_cast<int>(i) + 1, values[i], r.Find(t.def->loadKeys[i]).value);
    });
    if (!found) {
      r.key_.reset();
      return Var(false);
    }
    r.key_ = *found;
    r.staged_.clear();
    return Var(true);
  }

  static Var Refresh(SqlRecord& r, std::span<const Var>) {
    if (r.key_) const_cast<TypeInfo&>(*r.type_).cache.erase(*r.key_);
    return {};
  }

  static Var NoOp(SqlRecord&, std::span<const Var>) { return {}; }

  static Var UpdateConNote(SqlRecord& r, std::span<const Var> args) {
    if (args.empty() || !r.key_) return {};
    const Member& m = r.Find("Status");
    r.store_.WriteColumn(*r.type_, *r.key_, m.column, Coerce(args[0], m.value));
    return {};
  }

  static Var SetCubic(SqlRecord& r, std::span<const Var> args) {
    const Member& m = r.Find("Cubic");
    const Var v = Coerce(args[0], m.value);
    if (r.key_)
      r.store_.WriteColumn(*r.type_, *r.key_, m.column, v);
    else
      r.staged_["Cubic"] = v;
    return {};
  }

  static Var GetAttribute(SqlRecord& r, std::span<const Var> args) {
    if (!r.key_ || args[0].IsNull()) return {};
    Use s(r.store_.db().Prepare("SELECT Value FROM PackAttributes WHERE PackId = ? AND Key = ?"));
    s->Bind(1, *r.key_);
    const std::string key = args[0].Text();
    s->Bind(2, std::string_view(key));
    if (!s->Step()) return {};
    return ReadValue(*s, 0, Value::Text);
  }

  static bool Exists(SqlRecord& r, std::string_view type, const Var& id) {
    if (id.IsNull() || !id.IsNumeric()) return false;
    return r.store_.ReadRow(r.store_.model().Type(type), id.Whole()) != nullptr;
  }

  static Var SaveManifest(SqlRecord& r, std::span<const Var>) {
    if (r.key_) return Var(true);
    auto staged = [&](std::string_view name) {
      auto it = r.staged_.find(name);
      return it == r.staged_.end() ? Var() : it->second;
    };
    if (!Exists(r, "Vendor", staged("VendorId")) || !Exists(r, "Carrier", staged("CarrierId")))
      return Var(false);
    const TypeInfo& t = *r.type_;
    std::int64_t id = 0;
    {
      Transaction tx(r.store_.db());
      id = r.store_.NextValue(t, t.keyColumn);
      std::int64_t number = 1;
      {
        Use s(r.store_.db().Prepare("SELECT NextManifestNumber FROM System WHERE RowId = 1"));
        if (s->Step() && s->ColumnType(0) != SQLITE_NULL) number = s->Int(0);
      }
      {
        Use s(r.store_.db().Prepare(
            "INSERT INTO System (RowId, Ordinal, NextManifestNumber) VALUES (1, 0, ?1) "
            "ON CONFLICT (RowId) DO UPDATE SET NextManifestNumber = ?1"));
        s->Bind(1, number + 1);
        s->Run();
      }
      auto values = r.staged_;
      values["ManifestNumber"] = Var(number);
      r.store_.InsertStaged(t, id, values);
      tx.Commit();
    }
    r.store_.Wrote();
    r.key_ = id;
    r.staged_.clear();
    return Var(true);
  }

  static Var SaveLog(SqlRecord& r, std::span<const Var>) {
    if (r.key_) return {};
    const TypeInfo& t = *r.type_;
    std::int64_t id = 0;
    {
      Transaction tx(r.store_.db());
      id = r.store_.NextValue(t, t.keyColumn);
      r.store_.InsertStaged(t, id, r.staged_);
      tx.Commit();
    }
    r.store_.Wrote();
    r.key_ = id;
    r.staged_.clear();
    return {};
  }

  static Var ClearLog(SqlRecord& r, std::span<const Var>) {
    r.key_.reset();
    r.staged_.clear();
    return {};
  }

  // A consignment's vendor (carrier) matches an argument by id, numerically, or by code.
  static void BindMatch(Statement& s, int index, const Var& arg) {
    if (arg.IsNumeric())
      s.Bind(index, arg.Number());
    else
      s.BindNull(index);
    if (arg.IsNull()) {
      s.BindNull(index + 1);
    } else {
      const std::string text = arg.Text();
      s.Bind(index + 1, std::string_view(text));
    }
  }

  static constexpr std::string_view kMatchingConNotes =
      "SELECT c.ConNoteId FROM ConNotes c "
      "JOIN Vendors v ON v.VendorId = c.VendorId "
      "JOIN Carriers r ON r.CarrierId = c.CarrierId "
      "WHERE (v.VendorId = ?1 OR v.VendorCode = ?2) AND (r.CarrierId = ?3 OR r.CarrierCode = ?4) ";

  static Var ConNoteList(SqlRecord& r, std::vector<std::int64_t> keys) {
    return Var(r.store_.List(r.store_.model().Type("ConNote"), std::move(keys)));
  }

  static Var GetManifestConNotes(SqlRecord& r, std::span<const Var> args) {
    const std::string sql = std::string(kMatchingConNotes) +
                            "AND (c.ManifestId IS NULL OR c.ManifestId = 0) ORDER BY c.Ordinal";
    return ConNoteList(r, r.store_.Ids(sql, [&](Statement& s) {
      BindMatch(s, 1, args[0]);
      BindMatch(s, 3, args[1]);
    }));
  }

  static Var GetConNotesByDate(SqlRecord& r, std::span<const Var> args) {
    const std::string begin = args[0].Date().Iso();
    const std::string end = args[1].Date().Iso();
    auto matches = [&](std::string_view table, std::string_view id, std::string_view code,
                       const Var& arg) {
      const std::string sql = "SELECT 1 FROM " + std::string(table) + " WHERE " + std::string(id) +
                              " = ?1 OR " + std::string(code) + " = ?2 LIMIT 1";
      return !r.store_.Ids(sql, [&](Statement& s) { BindMatch(s, 1, arg); }).empty();
    };
    if (!matches("Vendors", "VendorId", "VendorCode", args[2]) ||
        !matches("Carriers", "CarrierId", "CarrierCode", args[3]))
      return {};
    const std::string sql = std::string(kMatchingConNotes) +
                            "AND c.ConNoteDate >= ?5 AND c.ConNoteDate < ?6 ORDER BY c.Ordinal";
    return ConNoteList(r, r.store_.Ids(sql, [&](Statement& s) {
      BindMatch(s, 1, args[2]);
      BindMatch(s, 3, args[3]);
      s.Bind(5, std::string_view(begin));
      s.Bind(6, std::string_view(end));
    }));
  }

  static Var CountWhere(SqlRecord& r, std::string_view column, const Var& value) {
    if (value.IsNull()) return Var(0);
    const std::string sql = "SELECT count(*) FROM Packs WHERE " + std::string(column) + " = ?";
    const auto n = r.store_.Ids(sql, [&](Statement& s) { s.Bind(1, value.Whole()); }).front();
    return Var(static_cast<std::int32_t>(n));
  }

  static std::shared_ptr<host::Object> ObjectArgument(const Var& arg) {
    auto object = arg.Object();
    if (!object) throw Error(err::kObjectRequired, {}, "mvserver");
    return object;
  }

  static Var OrderPackCount(SqlRecord& r, std::span<const Var> args) {
    return CountWhere(r, "OrderId", ObjectArgument(args[0])->Get("OrderId"));
  }

  static Var ConNotePackCount(SqlRecord& r, std::span<const Var> args) {
    return CountWhere(r, "ConNoteId", ObjectArgument(args[0])->Get("ConNoteId"));
  }

  static constexpr std::array kTable = {
      Entry{{}, "Load", 0, 0, &Load},
      Entry{"Receiver", "Refresh", 0, 0, &Refresh},
      Entry{"ConNote", "Update", 0, 1, &UpdateConNote},
      Entry{"Pack", "Update", 0, 0, &NoOp},
      Entry{"Pack", "SetCubic", 1, 1, &SetCubic},
      Entry{"Pack", "GetAttribute", 1, 1, &GetAttribute},
      Entry{"Manifest", "Save", 0, 0, &SaveManifest},
      Entry{"Log", "Save", 0, 0, &SaveLog},
      Entry{"Log", "Clear", 0, 0, &ClearLog},
      Entry{"System", "GetManifestConNotes", 2, 2, &GetManifestConNotes},
      Entry{"System", "GetConNotesByDate", 4, 4, &GetConNotesByDate},
      Entry{"System", "OrderPackCount", 1, 1, &OrderPackCount},
      Entry{"System", "ConNotePackCount", 1, 1, &ConNotePackCount},
  };
};

Var SqlRecord::Call(std::string_view method, std::span<const Var> args) {
  const std::string_view type = type_->def->type;
  for (const auto& entry : Methods::kTable) {
    if (entry.name != method) continue;
    if (entry.type.empty() ? type_->def->loadKeys.empty() : entry.type != type) continue;
    if (args.size() < entry.minArgs || args.size() > entry.maxArgs)
      throw Error(err::kInvalidCall,
                  "wrong number of arguments to " + std::string(type) + "." + std::string(method),
                  "mvserver");
    Var result = entry.handler(*this, args);
    // Collections a method returns are kept like members, for the same reason.
    if (result.IsObject()) {
      if (retired_.size() >= 256) retired_.erase(retired_.begin(), retired_.begin() + 128);
      retired_.push_back(result);
    }
    return result;
  }
  throw NoSuchMember(type, method);
}

template <class T>
std::shared_ptr<host::Object> MakeObject(std::shared_ptr<SqliteHost> host, const TypeInfo* type) {
  return std::make_shared<RecordObject<T>>(std::move(host), type);
}
template <class C>
std::shared_ptr<host::Object> MakeList(std::shared_ptr<SqliteHost> host, const TypeInfo* item,
                                       std::vector<std::int64_t> keys) {
  return std::make_shared<ListObject<C>>(std::move(host), item, std::move(keys));
}

struct Facade {
  std::string_view type;
  ObjectMaker object;
  CollectionMaker collection;
};

const std::array kFacades = {
    Facade{"System", &MakeObject<host::System>, nullptr},
    Facade{"Vendor", &MakeObject<host::Vendor>, nullptr},
    Facade{"Carrier", &MakeObject<host::Carrier>, nullptr},
    Facade{"Partner", &MakeObject<host::Partner>, nullptr},
    Facade{"Receiver", &MakeObject<host::Receiver>, nullptr},
    Facade{"Product", &MakeObject<host::Product>, nullptr},
    Facade{"Carton", &MakeObject<host::Carton>, nullptr},
    Facade{"Customer", &MakeObject<host::Customer>, nullptr},
    Facade{"Despatch", &MakeObject<host::Despatch>, nullptr},
    Facade{"Order", &MakeObject<host::Order>, &MakeList<host::Orders>},
    Facade{"PSlipLine", &MakeObject<host::PSlipLine>, &MakeList<host::SlipLines>},
    Facade{"ASN", &MakeObject<host::ASN>, nullptr},
    Facade{"ConNote", &MakeObject<host::ConNote>, &MakeList<host::ConNotes>},
    Facade{"Pack", &MakeObject<host::Pack>, &MakeList<host::PackList>},
    Facade{"PackLine", &MakeObject<host::PackLine>, &MakeList<host::PackLines>},
    Facade{"Job", &MakeObject<host::Job>, nullptr},
    Facade{"EDIDocument", &MakeObject<host::EDIDocument>, nullptr},
    Facade{"Manifest", &MakeObject<host::Manifest>, nullptr},
    Facade{"Log", &MakeObject<host::Log>, nullptr},
};

std::string AddressColumn(std::string_view nest, std::string_view field) {
  return std::string(nest) + "_" + std::string(field);
}

}  // namespace

std::unique_ptr<Model> BuildModel() {
  auto model = std::make_unique<Model>();
  for (const TypeDef& def : Types()) {
    auto info = std::make_unique<TypeInfo>();
    info->def = &def;
    for (const auto& f : kFacades)
      if (f.type == def.type) {
        info->makeObject = f.object;
        info->makeCollection = f.collection;
      }
    model->types.push_back(std::move(info));
  }
  for (auto& owned : model->types) {
    TypeInfo& t = *owned;
    const TypeDef& def = *t.def;
    auto addColumn = [&](std::string name, Value value) {
      t.columnIndex[name] = static_cast<int>(t.columns.size());
      t.columns.push_back({std::move(name), value});
    };
    t.keyColumn = def.key.empty() ? "RowId" : std::string(def.key);
    addColumn(t.keyColumn, Value::Integer);
    addColumn("Ordinal", Value::Integer);
    for (const Parent& p : def.parents) addColumn(std::string(p.column), Value::Integer);
    for (const Field& f : def.fields)
      if (f.name != def.key) addColumn(std::string(f.name), f.value);
    for (const Nested& n : def.nested)
      if (n.kind == Nest::Address)
        for (const Field& f : AddressFields()) addColumn(AddressColumn(n.name, f.name), f.value);

    auto isLoadKey = [&](std::string_view name) {
      for (auto k : def.loadKeys)
        if (k == name) return true;
      return false;
    };
    for (const Field& f : def.fields) {
      Member m;
      m.kind = MemberKind::Column;
      m.column = t.Column(f.name);
      m.value = f.value;
      m.settable = f.settable;
      m.lookupKey = isLoadKey(f.name);
      t.members[std::string(f.name)] = m;
      if (!f.object.empty()) {
        Member r = m;
        r.kind = MemberKind::Reference;
        r.target = &model->Type(f.target);
        r.objectName = std::string(f.object);
        r.settable = false;
        if (!f.fallback.empty()) {
          if (t.Column(f.fallback) >= 0)
            r.fallbackColumn = t.Column(f.fallback);
          else
            r.fallbackMember = std::string(f.fallback);
        }
        t.members[std::string(f.object)] = r;
      }
    }
    for (const Parent& p : def.parents) {
      if (p.member.empty()) continue;
      Member m;
      m.kind = MemberKind::Parent;
      m.column = t.Column(p.column);
      m.target = &model->Type(p.type);
      t.members[std::string(p.member)] = m;
    }
    for (const Nested& n : def.nested) {
      Member m;
      if (n.kind == Nest::Records && n.member) {
        m.kind = MemberKind::Children;
        m.target = &model->Type(n.type);
        m.targetColumn = std::string(n.column);
      } else if (n.kind == Nest::Address) {
        m.kind = MemberKind::Address;
        for (const Field& f : AddressFields())
          m.addressColumns.push_back(t.Column(AddressColumn(n.name, f.name)));
      } else {
        continue;
      }
      t.members[std::string(n.name)] = m;
    }
    for (const Collection& c : def.collections) {
      Member m;
      m.target = &model->Type(c.type);
      m.targetColumn = std::string(c.column);
      if (c.kind == Derived::Referrers) {
        m.kind = MemberKind::Referrers;
      } else {
        m.kind = MemberKind::ListOrDerived;
        for (const Nested& n : def.nested)
          if (n.name == c.list) m.list = &n;
        m.via = std::string(c.via);
      }
      t.members[std::string(c.member)] = m;
    }
    if (def.type == "Log") {
      Member m;
      m.kind = MemberKind::LogId;
      t.members["ID"] = m;
    }

    std::string names, params;
    for (std::size_t i = 0; i < t.columns.size(); ++i) {
      names += (i ? ", " : "") + Quoted(t.columns[i].name);
      params += i ? ", ?" : "?";
    }
    const std::string table = Quoted(def.table);
    t.selectRow = "SELECT " + names + " FROM " + table + " WHERE " + Quoted(t.keyColumn) + " = ?";
    t.insertRow = "INSERT INTO " + table + " (" + names + ") VALUES (" + params + ")";
    t.keysInOrder = "SELECT " + Quoted(t.keyColumn) + " FROM " + table + " ORDER BY Ordinal";
  }
  return model;
}

// ---------------------------------------------------------------- host

SqliteHost::SqliteHost(const std::string& path) : db_(path), model_(BuildModel()) {
  CreateOrCheckSchema();
  model_->dataVersion = db_.DataVersion();
}

SqliteHost::~SqliteHost() = default;

std::shared_ptr<SqliteHost> SqliteHost::Open(const std::string& path) {
  return std::shared_ptr<SqliteHost>(new SqliteHost(path));
}

namespace {

// The records the library adds one at a time (log entries, manifests) take
// the next ordinal of their table: an index keeps finding it from growing
// with the table. Also made on opening a database written without it.
constexpr std::array<std::string_view, 2> kAddedTables = {"Logs", "Manifests"};

std::string OrdinalIndexesSql() {
  std::string sql;
  for (std::string_view table : kAddedTables)
    sql += "CREATE INDEX IF NOT EXISTS " + Quoted("idx_" + std::string(table) + "_Ordinal") + " ON " +
           Quoted(table) + " (Ordinal);\n";
  return sql;
}

std::string CreateSchemaSql(const Model& model) {
  std::string sql, indexes;
  std::set<std::string> indexed;
  auto index = [&](std::string_view table, const std::string& columns) {
    std::string name = "idx_" + std::string(table) + "_" + columns;
    for (char& c : name)
      if (c == ',' || c == ' ' || c == '"') c = '_';
    if (!indexed.insert(name).second) return;
    indexes += "CREATE INDEX " + Quoted(name) + " ON " + Quoted(table) + " (" + columns + ");\n";
  };
  for (const auto& owned : model.types) {
    const TypeInfo& t = *owned;
    const TypeDef& def = *t.def;
    sql += "CREATE TABLE " + Quoted(def.table) + " (";
    for (std::size_t i = 0; i < t.columns.size(); ++i) {
      const ColumnDef& c = t.columns[i];
      sql += (i ? ", " : "") + Quoted(c.name) + std::string(SqlType(c.value));
      if (c.name == t.keyColumn) sql += " PRIMARY KEY";
      if (c.name == "Ordinal") sql += " NOT NULL";
    }
    sql += ");\n";
    for (const Field& f : def.fields)
      if (!f.target.empty()) index(def.table, Quoted(f.name));
    for (const Parent& p : def.parents) index(def.table, Quoted(p.column) + ", Ordinal");
    if (!def.loadKeys.empty() && def.loadKeys.front() != def.key) {
      std::string columns;
      for (auto k : def.loadKeys) columns += (columns.empty() ? "" : ", ") + Quoted(k);
      index(def.table, columns);
    }
    for (const Collection& c : def.collections)
      if (c.kind == Derived::Referrers) index(model.Type(c.type).def->table, Quoted(c.column));
    for (const Nested& n : def.nested) {
      if (n.kind == Nest::IdList) {
        sql += "CREATE TABLE " + Quoted(n.table) + " (" + Quoted(n.column) +
               " INTEGER NOT NULL, Ordinal INTEGER NOT NULL, " + Quoted(n.idColumn) +
               " INTEGER NOT NULL);\n";
        index(n.table, Quoted(n.column) + ", Ordinal");
      } else if (n.kind == Nest::TextMap) {
        sql += "CREATE TABLE " + Quoted(n.table) + " (" + Quoted(n.column) +
               " INTEGER NOT NULL, Key TEXT NOT NULL, Value TEXT, PRIMARY KEY (" +
               Quoted(n.column) + ", Key));\n";
      }
    }
  }
  sql += indexes;
  sql += OrdinalIndexesSql();
  // The one System record always exists, so that its settable members write through.
  sql += "INSERT INTO System (RowId, Ordinal) VALUES (1, 0);\n";
  sql += "PRAGMA user_version = " + std::to_string(kSchemaVersion) + ";\n";
  return sql;
}

}  // namespace

void SqliteHost::CreateOrCheckSchema() {
  std::int64_t version = 0, tables = 0;
  {
    Use s(db_.Prepare("PRAGMA user_version"));
    if (s->Step()) version = s->Int(0);
  }
  {
    Use s(db_.Prepare("SELECT count(*) FROM sqlite_master"));
    if (s->Step()) tables = s->Int(0);
  }
  if (version == 0 && tables == 0) {
    Transaction tx(db_);
    db_.Exec(CreateSchemaSql(*model_));
    tx.Commit();
    return;
  }
  if (version == 0)
    throw OpenError(db_.Path() + " is not a Quendal host database");
  if (version > kSchemaVersion)
    throw OpenError(db_.Path() + " was written by a newer Quendal (schema version " +
                    std::to_string(version) + "; this one knows up to " +
                    std::to_string(kSchemaVersion) + ")");
  db_.Exec(OrdinalIndexesSql());
}

namespace {
template <class T>
Ref<T> NewOf(SqliteHost& host, std::string_view type) {
  Store store(host.shared_from_this());
  return host::Object::As<T>(Var(store.NewObject(host.model().Type(type))));
}
}  // namespace

Ref<host::Log> SqliteHost::NewLog() { return NewOf<host::Log>(*this, "Log"); }
Ref<host::Receiver> SqliteHost::NewReceiver() { return NewOf<host::Receiver>(*this, "Receiver"); }
Ref<host::Vendor> SqliteHost::NewVendor() { return NewOf<host::Vendor>(*this, "Vendor"); }
Ref<host::Carrier> SqliteHost::NewCarrier() { return NewOf<host::Carrier>(*this, "Carrier"); }
Ref<host::Partner> SqliteHost::NewPartner() { return NewOf<host::Partner>(*this, "Partner"); }
Ref<host::EDIDocument> SqliteHost::NewEDIDocument() {
  return NewOf<host::EDIDocument>(*this, "EDIDocument");
}
Ref<host::Manifest> SqliteHost::NewManifest() { return NewOf<host::Manifest>(*this, "Manifest"); }
Ref<host::Order> SqliteHost::NewOrder() { return NewOf<host::Order>(*this, "Order"); }
Ref<host::Pack> SqliteHost::NewPack() { return NewOf<host::Pack>(*this, "Pack"); }
Ref<host::ConNotes> SqliteHost::NewConNotes() {
  Store store(shared_from_this());
  return host::Object::As<host::ConNotes>(Var(store.List(model_->Type("ConNote"), {})));
}

Ref<host::System> SqliteHost::System() { return Find<host::System>("System", 1); }

std::shared_ptr<host::Object> SqliteHost::Find(std::string_view type, std::int64_t key) {
  Store store(shared_from_this());
  return store.Bound(model_->Type(type), key);
}

std::vector<std::int64_t> SqliteHost::Keys(std::string_view type) {
  Store store(shared_from_this());
  return store.Ids(model_->Type(type).keysInOrder, [](Statement&) {});
}

std::int64_t SqliteHost::Count(std::string_view type) {
  Store store(shared_from_this());
  return store.Ids("SELECT count(*) FROM " + Quoted(model_->Type(type).def->table),
                   [](Statement&) {})
      .front();
}

std::vector<Ref<host::Log>> SqliteHost::LogsSince(std::int64_t id) {
  Store store(shared_from_this());
  std::vector<Ref<host::Log>> logs;
  const TypeInfo& type = model_->Type("Log");
  for (auto key : store.Ids("SELECT LogId FROM Logs WHERE LogId > ? ORDER BY LogId",
                            [id](Statement& s) { s.Bind(1, id); }))
    logs.push_back(host::Object::As<host::Log>(Var(store.Bound(type, key))));
  return logs;
}

std::int64_t SqliteHost::LastLogId() {
  Store store(shared_from_this());
  return store.Ids("SELECT coalesce(max(LogId), 0) FROM Logs", [](Statement&) {}).front();
}

}  // namespace quendal::mvserver
