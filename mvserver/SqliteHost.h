// The reference host: every host object of the library's model over one
// SQLite database, loaded from JSON documents. Objects read their record's
// row (cached until the next write), setters on bound records write through
// at once, and new objects hold what is set until Load or Save.
#pragma once

#include <cstdint>
#include <memory>
#include <stdexcept>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "frame/host/Host.h"
#include "mvserver/Database.h"

namespace quendal::mvserver {

struct Model;
struct TypeInfo;

// A JSON document the import refuses; the message names the JSON path,
// e.g. "Packs[3].ConNoteId: no ConNote 77".
class ImportError : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

struct ImportSummary {
  std::vector<std::pair<std::string, std::int64_t>> records;  // per JSON collection, those present
  std::int64_t total = 0;
};

class SqliteHost : public host::Library, public std::enable_shared_from_this<SqliteHost> {
 public:
  // Opens the database file, creating it with the current schema when new.
  // OpenError when it can't be opened or is not a database of this host.
  static std::shared_ptr<SqliteHost> Open(const std::string& path);
  ~SqliteHost() override;

  // Adds the records of a JSON document in one transaction: all or nothing.
  ImportSummary Import(std::string_view json);

  Ref<host::Log> NewLog() override;
  Ref<host::Receiver> NewReceiver() override;
  Ref<host::Vendor> NewVendor() override;
  Ref<host::Carrier> NewCarrier() override;
  Ref<host::Partner> NewPartner() override;
  Ref<host::EDIDocument> NewEDIDocument() override;
  Ref<host::Manifest> NewManifest() override;
  Ref<host::ConNotes> NewConNotes() override;
  Ref<host::Order> NewOrder() override;
  Ref<host::Pack> NewPack() override;

  // The System object (all members Null when the data has none).
  Ref<host::System> System();
  // The record of a type ("Pack") with that key, bound; Nothing when there is none.
  std::shared_ptr<host::Object> Find(std::string_view type, std::int64_t key);
  template <class T>
  Ref<T> Find(std::string_view type, std::int64_t key) {
    return host::Object::As<T>(Var(Find(type, key)));
  }
  // The keys of every record of a top-level type, in document order.
  std::vector<std::int64_t> Keys(std::string_view type);
  std::int64_t Count(std::string_view type);
  // Log entries with LogId above `id`, in order.
  std::vector<Ref<host::Log>> LogsSince(std::int64_t id);
  std::int64_t LastLogId();

  Database& Db() { return db_; }
  Model& model() { return *model_; }

 private:
  explicit SqliteHost(const std::string& path);
  void CreateOrCheckSchema();

  Database db_;
  std::unique_ptr<Model> model_;
};

}  // namespace quendal::mvserver
