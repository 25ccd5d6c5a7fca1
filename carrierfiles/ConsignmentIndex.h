// The duplicate check of a day's carrier file, without reading the whole
// file for every consignment.
//
// A consignment is already in the file when a line contains the record
// mark followed by its number as a fixed-width key. The index remembers
// every key that follows a record mark in the file, together with the
// file's stamp (identity, size, modification time). While the stamp is
// unchanged the answer comes from memory; after our own append the new
// bytes are added and the stamp taken anew; when anything else changed the
// file, it is read again. The answers are those of reading the file line
// by line each time (HoldsRecord).
#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <string_view>
#include <unordered_set>

#include "platform/FileSystem.h"

namespace quendal {

// The straightforward check: true when a line of the file contains `needle`.
bool HoldsRecord(const std::string& path, std::string_view needle);

class ConsignmentIndex {
 public:
  // `mark` opens the record ("10"); `keyWidth` is the width of the key that follows it.
  ConsignmentIndex(std::string mark, std::size_t keyWidth)
      : mark_(std::move(mark)), keyWidth_(keyWidth) {}

  // True when a line of the file holds mark + key (file bytes).
  bool Holds(const std::string& path, std::string_view key);
  // Our own append of `bytes` to `path`: `before` and `after` are the file's
  // stamps around it. The index follows the append when it knew the file as
  // it was before; otherwise it forgets the file.
  void Appended(const std::string& path, std::string_view bytes,
                const std::optional<FileStamp>& before, const std::optional<FileStamp>& after);
  // With indexing off every check reads the file (for comparisons).
  void SetEnabled(bool enabled) { enabled_ = enabled; }
  // How often the file was read in full since the object was made.
  std::size_t Reads() const { return reads_; }

 private:
  void Load(const std::string& path, const FileStamp& stamp);
  void Add(std::string_view bytes);

  std::string mark_;
  std::size_t keyWidth_;
  bool enabled_ = true;
  std::size_t reads_ = 0;

  void Forget();

  // What the index knows of path_: nothing, that it does not exist, or its keys at stamp_.
  enum class State { Unknown, Missing, Indexed };
  State state_ = State::Unknown;
  std::string path_;
  FileStamp stamp_;
  bool endsInLine_ = false;  // the known bytes end inside a line (no line break at the end)
  std::unordered_set<std::string> keys_;
};

}  // namespace quendal
