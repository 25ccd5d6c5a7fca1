// The records of consignments a row run has finished but writes into the
// day's file only when the run ends (Term). A run stamps each consignment
// as manifested in the host as soon as its row is processed; should the
// process die before Term, those consignments would be in no file. So each
// row's finished records go first into a journal of the run beside the day
// file, made durable, and only then is the consignment stamped. Term moves
// the run's records into the day file and removes the journal; a journal
// that a dead run left is moved in by the next run of the class on that folder.
//
// Each run has a journal of its own (a hidden file named after the class),
// which it keeps locked (fcntl, per open file) while it lives: a journal
// nobody holds belongs to a run that died, or whose object was released
// without Term. Records are framed with their length and a checksum, so a
// record torn by a crash (whose consignment was never stamped) is dropped.
//
//   RowJournal journal(folder, "clseParcelManifestxml");
//   journal.Add(record);          // durable before the host is told
//   ... Term: write the day file ...
//   journal.Clear();
//   RowJournal::TakeAbandoned(folder, kind, [&](const auto& records) { ... });
#pragma once

#include <functional>
#include <string>
#include <string_view>
#include <vector>

namespace quendal {

class RowJournal {
 public:
  RowJournal(std::string folder, std::string kind);
  // Lets the journal go but keeps its file: records not yet moved in stay
  // for the next run of the class.
  ~RowJournal();
  RowJournal(const RowJournal&) = delete;
  RowJournal& operator=(const RowJournal&) = delete;

  // Adds a record; true once it is durable (the journal's data, and on its
  // first record its name in the folder). A failed addition leaves the
  // journal as it was.
  bool Add(std::string_view record);
  // Removes the journal once its records are in the day file; the next Add starts a new one.
  void Clear();
  bool Empty() const { return fd_ < 0; }

  // Calls `moveIn` with the records of every journal of `kind` in `folder`
  // that no live run holds, oldest record first, and removes each journal
  // whose records `moveIn` accepted. Returns how many journals were moved in.
  using MoveIn = std::function<bool(const std::vector<std::string>& records)>;
  static int TakeAbandoned(const std::string& folder, const std::string& kind, const MoveIn& moveIn);

  // The records of a journal's bytes, up to the first torn one.
  static std::vector<std::string> Records(std::string_view bytes);

 private:
  std::string folder_;
  std::string kind_;
  std::string path_;
  int fd_ = -1;
};

}  // namespace quendal
