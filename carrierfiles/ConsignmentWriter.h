// The frame of the consignment classes: Process hands the consignment to
// the class's own Compile with the caller's log list in place, every log
// line lands in that list at once (so the caller sees every entry even
// when the call ends early), the carrier file is opened and closed inside
// the call, and the procedures several carrier files share live here once.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>

#include "frame/ComponentBase.h"
#include "platform/FileSystem.h"

namespace quendal {

// The carriers whose service names map to service codes.
enum class ServiceTable { Ipec1250, Ipec1256, Hunter, TNTET11 };

// The folder separator that ends every carrier folder text.
inline constexpr char kFolderSeparator = '/';

// A carrier folder exists and its text ends with the folder separator.
bool IsCarrierFolder(const std::string& folder);

// The carrier's code for the consignment's service (no guard of its own).
std::string ServiceCodeOf(ServiceTable table, const Ref<host::ConNote>& conNote);
// Sum over the packs of the carton weight when above 0, else the pack
// weight (no guard of its own).
double ShipmentWeightOf(const Ref<host::PackList>& packs);

class ConsignmentWriter : public Lifecycle, public ConsignmentInterface {
 public:
  void Process(const Ref<host::System>& objSystem, const Ref<host::ConNote>& objConNote,
               const Ref<host::ASN>& objASN, const Ref<host::PackList>& lstPacks,
               LogList& vtErrorLog) final;

  // Exactly `length` characters: the first ones of a longer text, a shorter
  // one padded with spaces on the right (or on the left with rightAlign).
  static std::string FormatText(std::string_view text, long length, bool rightAlign = false);
  // The carrier's code for the consignment's service.
  std::string ServiceCode(ServiceTable table, const Ref<host::ConNote>& conNote);
  // Prepares an existing batch file for one more consignment: rewrites it
  // without its trailer lines ("Z") and returns the number of lines kept;
  // 0 when the file can't be read or rewritten, which leaves it as it was.
  // Remembers the batch values of the first "A" and "B" lines while they
  // are still empty.
  std::int32_t WriteFile(const std::string& path);
  // Sum over the packs of the carton weight when above 0, else the pack weight.
  double TotalShipmentWeight(const Ref<host::PackList>& packs);

  const std::string& AValue() const { return aValue_; }
  const std::string& BValue() const { return bValue_; }

  // A line of a carrier file: code-page text ended by carriage return and line feed.
  static std::string CarrierLine(std::string_view utf8);

 protected:
  explicit ConsignmentWriter(std::string_view className) : Lifecycle(className) {}

  // The class's work on one consignment, under its own procedure guard.
  virtual void Compile(const Ref<host::ConNote>& objConNote, const Ref<host::ASN>& objASN,
                       const Ref<host::PackList>& lstPacks) = 0;

  // Consignment classes log at the error number.
  long LogLevel(long errorNumber) const override { return errorNumber; }

  // Writes one host log entry and appends its id to the caller's list.
  void LogLine(long errorNumber, std::string_view procedure, std::string_view message);

  // A carrier folder must exist and end with the folder separator; an
  // invalid one is logged ("Invalid folder ") and false returned.
  bool CheckFolder(const std::string& folder);
  // The classes that take the folder text as it stands still need one: an
  // empty text would put the day file in the process's working directory,
  // where no carrier transfer looks. It is logged ("Invalid folder ") and
  // false returned.
  bool HasFolder(const std::string& folder);

  // The carrier file of the current call.
  AppendingFile& File() { return file_; }
  void CloseOpenFile() override { file_.Close(); }

  std::string aValue_;
  std::string bValue_;

 private:
  LogList* errorLog_ = nullptr;
  AppendingFile file_;
};

}  // namespace quendal
