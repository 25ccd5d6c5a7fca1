#include "mvserver/Database.h"

#include <sqlite3.h>

#include "frame/Error.h"

namespace quendal::mvserver {

namespace {

[[noreturn]] void Fail(sqlite3* db) {
  throw Error(err::kAutomation, std::string("database: ") + sqlite3_errmsg(db), "mvserver");
}

}  // namespace

Statement::~Statement() { sqlite3_finalize(stmt_); }

void Statement::BindNull(int index) { sqlite3_bind_null(stmt_, index); }
void Statement::Bind(int index, std::int64_t value) { sqlite3_bind_int64(stmt_, index, value); }
void Statement::Bind(int index, double value) { sqlite3_bind_double(stmt_, index, value); }
void Statement::Bind(int index, std::string_view value) {
  sqlite3_bind_text(stmt_, index, value.data(), static_cast<int>(value.size()), SQLITE_TRANSIENT);
}

bool Statement::Step() {
  const int rc = sqlite3_step(stmt_);
  if (rc == SQLITE_ROW) return true;
  if (rc == SQLITE_DONE) return false;
  sqlite3* db = sqlite3_db_handle(stmt_);
  sqlite3_reset(stmt_);
  Fail(db);
}

void Statement::Run() {
  while (Step()) {
  }
}

void Statement::Reset() {
  sqlite3_reset(stmt_);
  sqlite3_clear_bindings(stmt_);
}

int Statement::ColumnType(int column) const { return sqlite3_column_type(stmt_, column); }
std::int64_t Statement::Int(int column) const { return sqlite3_column_int64(stmt_, column); }
double Statement::Real(int column) const { return sqlite3_column_double(stmt_, column); }
std::string Statement::Text(int column) const {
  const auto* text = reinterpret_cast<const char*>(sqlite3_column_text(stmt_, column));
  const int size = sqlite3_column_bytes(stmt_, column);
  return text ? std::string(text, static_cast<std::size_t>(size)) : std::string();
}
int Statement::ColumnCount() const { return sqlite3_column_count(stmt_); }
std::string Statement::ColumnName(int column) const { return sqlite3_column_name(stmt_, column); }

Database::Database(const std::string& path) : path_(path) {
  const int rc = sqlite3_open_v2(path.c_str(), &db_, SQLITE_OPEN_READWRITE | SQLITE_OPEN_CREATE,
                                 nullptr);
  if (rc != SQLITE_OK) {
    std::string message = db_ ? sqlite3_errmsg(db_) : sqlite3_errstr(rc);
    sqlite3_close(db_);
    db_ = nullptr;
    throw OpenError("cannot open database " + path + ": " + message);
  }
  sqlite3_busy_timeout(db_, 5000);
  // A file that is not a database only shows itself on the first read.
  char* error = nullptr;
  if (sqlite3_exec(db_, "PRAGMA foreign_keys = OFF; SELECT count(*) FROM sqlite_master;", nullptr,
                   nullptr, &error) != SQLITE_OK) {
    std::string message = error ? error : "unknown error";
    sqlite3_free(error);
    sqlite3_close(db_);
    db_ = nullptr;
    throw OpenError("cannot open database " + path + ": " + message);
  }
  // Several packing stations share one database: with a write-ahead log their
  // reads never wait for another station's write, and a write waits (up to the
  // busy timeout) only for another write. The mode stays with the file; where
  // it can't be had (a memory database, a file system without shared memory)
  // the rollback journal serves, only slower.
  sqlite3_exec(db_, "PRAGMA journal_mode = WAL", nullptr, nullptr, nullptr);
}

Database::~Database() {
  statements_.clear();
  sqlite3_close(db_);
}

Statement& Database::Prepare(std::string_view sql) {
  auto it = statements_.find(sql);
  if (it != statements_.end()) return *it->second;
  sqlite3_stmt* stmt = nullptr;
  if (sqlite3_prepare_v2(db_, sql.data(), static_cast<int>(sql.size()), &stmt, nullptr) != SQLITE_OK)
    Fail(db_);
  auto [slot, inserted] = statements_.emplace(std::string(sql), std::make_unique<Statement>(stmt));
  return *slot->second;
}

void Database::Exec(const std::string& sql) {
  char* error = nullptr;
  if (sqlite3_exec(db_, sql.c_str(), nullptr, nullptr, &error) != SQLITE_OK) {
    std::string message = error ? error : "unknown error";
    sqlite3_free(error);
    throw Error(err::kAutomation, "database: " + message, "mvserver");
  }
}

std::int64_t Database::ChangesTotal() const { return sqlite3_total_changes64(db_); }
std::int64_t Database::LastInsertRowId() const { return sqlite3_last_insert_rowid(db_); }

std::uint32_t Database::DataVersion() const {
  unsigned int version = 0;
  sqlite3_file_control(db_, "main", SQLITE_FCNTL_DATA_VERSION, &version);
  return version;
}

Transaction::Transaction(Database& db) : db_(db) { db_.Exec("BEGIN IMMEDIATE"); }

Transaction::~Transaction() {
  if (open_) {
    try {
      db_.Exec("ROLLBACK");
    } catch (...) {
      // Nothing more can be done: SQLite rolls back an unfinished transaction on close.
    }
  }
}

void Transaction::Commit() {
  db_.Exec("COMMIT");
  open_ = false;
}

}  // namespace quendal::mvserver
