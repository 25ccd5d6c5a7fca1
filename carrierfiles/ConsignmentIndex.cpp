#include "carrierfiles/ConsignmentIndex.h"

#include <cstring>

namespace quendal {

namespace {

bool IsLineEnd(char c) { return c == '\r' || c == '\n'; }

}  // namespace

bool HoldsRecord(const std::string& path, std::string_view needle) {
  const std::optional<std::string> bytes = ReadFile(path);
  if (!bytes) return false;
  std::string_view rest(*bytes);
  while (!rest.empty()) {
    std::size_t end = 0;
    while (end < rest.size() && !IsLineEnd(rest[end])) ++end;
    if (rest.substr(0, end).find(needle) != std::string_view::npos) return true;
    rest.remove_prefix(end == rest.size() ? end : end + 1);
  }
  return false;
}

void ConsignmentIndex::Add(std::string_view bytes) {
  // Every record mark with a whole key after it inside its line.
  const std::size_t need = mark_.size() + keyWidth_;
  std::size_t lineStart = 0;
  while (lineStart < bytes.size()) {
    std::size_t lineEnd = lineStart;
    while (lineEnd < bytes.size() && !IsLineEnd(bytes[lineEnd])) ++lineEnd;
    const std::string_view line = bytes.substr(lineStart, lineEnd - lineStart);
    for (std::size_t at = line.find(mark_); at != std::string_view::npos && at + need <= line.size();
         at = line.find(mark_, at + 1))
      keys_.emplace(line.substr(at + mark_.size(), keyWidth_));
    lineStart = lineEnd + 1;
  }
  if (!bytes.empty()) endsInLine_ = !IsLineEnd(bytes.back());
}

void ConsignmentIndex::Forget() {
  state_ = State::Unknown;
  path_.clear();
  keys_.clear();
  endsInLine_ = false;
}

void ConsignmentIndex::Load(const std::string& path, const FileStamp& stamp) {
  ++reads_;
  Forget();
  const std::optional<std::string> bytes = ReadFile(path);
  if (!bytes) return;
  Add(*bytes);
  // Keep the index only when the file did not change while it was read.
  if (bytes->size() != stamp.size || StampOf(path) != stamp) {
    Forget();
    return;
  }
  state_ = State::Indexed;
  path_ = path;
  stamp_ = stamp;
}

bool ConsignmentIndex::Holds(const std::string& path, std::string_view key) {
  if (!enabled_ || key.size() < keyWidth_) {
    ++reads_;
    return HoldsRecord(path, mark_ + std::string(key));
  }
  const std::optional<FileStamp> now = StampOf(path);
  if (!now) {
    Forget();
    state_ = State::Missing;
    path_ = path;
    return false;
  }
  if (state_ != State::Indexed || path != path_ || stamp_ != *now) {
    Load(path, *now);
    if (state_ != State::Indexed) {
      ++reads_;
      return HoldsRecord(path, mark_ + std::string(key));
    }
  }
  if (!keys_.contains(std::string(key.substr(0, keyWidth_)))) return false;
  // A key longer than its field matched on its first part: look at the lines themselves.
  if (key.size() > keyWidth_) {
    ++reads_;
    return HoldsRecord(path, mark_ + std::string(key));
  }
  return true;
}

void ConsignmentIndex::Appended(const std::string& path, std::string_view bytes,
                                const std::optional<FileStamp>& before,
                                const std::optional<FileStamp>& after) {
  if (!enabled_ || path != path_ || !after) return Forget();
  const std::uintmax_t sizeBefore = before ? before->size : 0;
  bool knewIt = false;
  if (state_ == State::Indexed)
    knewIt = before && *before == stamp_ && !(stamp_.size > 0 && endsInLine_);
  else if (state_ == State::Missing)
    knewIt = sizeBefore == 0;  // created empty by the open of this call
  if (!knewIt || after->size != sizeBefore + bytes.size()) return Forget();
  if (state_ == State::Missing) {
    keys_.clear();
    endsInLine_ = false;
  }
  Add(bytes);
  state_ = State::Indexed;
  stamp_ = *after;
}

}  // namespace quendal
