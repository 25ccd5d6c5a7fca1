// libFuzzer target: the reference host's JSON import, given any document,
// must not crash, loop or read out of bounds. A document it refuses is
// refused with an ImportError (nothing else may escape) that says what and
// where in one printable line, and leaves the database as it was; a
// document it takes is read back, every member of every record, before the
// next input starts on a fresh database.
#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <memory>
#include <span>
#include <string>
#include <string_view>

#include "frame/Error.h"
#include "mvserver/Model.h"
#include "mvserver/SqliteHost.h"

namespace {

using quendal::mvserver::SqliteHost;

void Check(bool condition) {
  if (!condition) std::abort();
}

std::shared_ptr<SqliteHost> Fresh() { return SqliteHost::Open(":memory:"); }

// Records of every top-level collection (a new database holds its one System record).
std::int64_t Records(SqliteHost& host) {
  std::int64_t records = 0;
  for (const auto& type : host.model().types)
    if (type->def->topLevel) records += host.Count(type->def->type);
  return records;
}

// Reads every member of every record, and every item of what they resolve to
// one level down: resolution must stand on whatever the import took in.
void ReadBack(SqliteHost& host) {
  for (const auto& type : host.model().types) {
    if (!type->def->topLevel) continue;
    const std::string_view name = type->def->type;
    for (const std::int64_t key : host.Keys(name)) {
      const auto object = host.Find(name, key);
      Check(object != nullptr);
      for (const auto& [member, info] : type->members) {
        try {
          const quendal::Var value = object->Get(member);
          if (!value.IsObject()) {
            (void)value.Text();
            continue;
          }
          auto child = value.Object();
          if (!child || child->TypeName() != "Collection") continue;
          const std::int64_t count = child->Get("Count").Whole();
          for (std::int64_t i = 1; i <= count && i <= 8; ++i) {
            const quendal::Var index(i);
            (void)child->Call("Item", std::span<const quendal::Var>(&index, 1));
          }
        } catch (const quendal::Error&) {
          // A member the host raises on (as an automation host would) is the
          // library's guard's business, not the import's.
        }
      }
    }
  }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  static std::shared_ptr<SqliteHost> host = Fresh();
  static const std::int64_t empty = Records(*host);
  const std::string_view text(reinterpret_cast<const char*>(data), size);
  try {
    host->Import(text);
  } catch (const quendal::mvserver::ImportError& e) {
    const std::string message = e.what();
    Check(!message.empty());
    // "invalid JSON: ..." or "<JSON path>: <what is wrong>".
    Check(message.find(": ") != std::string::npos);
    for (const char c : message) Check(static_cast<unsigned char>(c) >= 0x20 && c != 0x7F);
    Check(Records(*host) == empty);
    return 0;
  }
  ReadBack(*host);
  host = Fresh();
  return 0;
}
