// A small layer over SQLite: one connection, statements prepared once and
// kept for the life of the connection, transactions as scopes.
#pragma once

#include <cstdint>
#include <map>
#include <memory>
#include <stdexcept>
#include <string>
#include <string_view>

struct sqlite3;
struct sqlite3_stmt;

namespace quendal::mvserver {

// The database file could not be opened or is not one this host can use.
class OpenError : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

class Statement {
 public:
  explicit Statement(sqlite3_stmt* stmt) : stmt_(stmt) {}
  ~Statement();
  Statement(const Statement&) = delete;
  Statement& operator=(const Statement&) = delete;

  // Parameters are numbered from 1.
  void BindNull(int index);
  void Bind(int index, std::int64_t value);
  void Bind(int index, double value);
  void Bind(int index, std::string_view value);
  // Runs to the next row; false when done (then the statement is ready to run again).
  bool Step();
  // Runs a statement that returns no rows.
  void Run();
  // Clears bindings and results so the next use starts fresh.
  void Reset();

  // Columns are numbered from 0. Type codes are SQLite's (1 integer, 2 real, 3 text, 5 null).
  int ColumnType(int column) const;
  std::int64_t Int(int column) const;
  double Real(int column) const;
  std::string Text(int column) const;
  int ColumnCount() const;
  std::string ColumnName(int column) const;

 private:
  sqlite3_stmt* stmt_;
};

// Resets a cached statement when the scope ends, whatever happens in it.
class Use {
 public:
  explicit Use(Statement& s) : s_(s) { s_.Reset(); }
  ~Use() { s_.Reset(); }
  Use(const Use&) = delete;
  Use& operator=(const Use&) = delete;
  Statement* operator->() { return &s_; }
  Statement& operator*() { return s_; }

 private:
  Statement& s_;
};

class Database {
 public:
  // Opens (creating when missing) the database file; OpenError when it can't.
  explicit Database(const std::string& path);
  ~Database();
  Database(const Database&) = delete;
  Database& operator=(const Database&) = delete;

  // The statement for this SQL text, prepared on first use and kept.
  Statement& Prepare(std::string_view sql);
  // Runs SQL without results (several statements allowed).
  void Exec(const std::string& sql);
  std::int64_t ChangesTotal() const;
  std::int64_t LastInsertRowId() const;
  // A counter that changes whenever the file's content changes (by any connection).
  std::uint32_t DataVersion() const;
  const std::string& Path() const { return path_; }
  sqlite3* Handle() const { return db_; }

 private:
  sqlite3* db_ = nullptr;
  std::string path_;
  std::map<std::string, std::unique_ptr<Statement>, std::less<>> statements_;
};

// A transaction: committed by Commit(), rolled back when the scope ends without it.
class Transaction {
 public:
  explicit Transaction(Database& db);
  ~Transaction();
  Transaction(const Transaction&) = delete;
  Transaction& operator=(const Transaction&) = delete;
  void Commit();

 private:
  Database& db_;
  bool open_ = true;
};

}  // namespace quendal::mvserver
