// The consignment procedure of the carrier files laid out by a layout file,
// written once for the despatch classes and the row classes that write
// them. The writer takes one consignment, reads the layout (the site's file
// beside the output, else the one the library ships), picks the file,
// builds every record of the consignment and adds them in one write; a
// layout with trailer records has them replaced through a journal, so they
// stay the last lines of the file whatever happens to the call. What tells
// the classes apart is a LayoutVariant.
#pragma once

#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <string_view>

#include "carrierfiles/ConsignmentWriter.h"
#include "carrierfiles/Layout.h"
#include "frame/FailSafe.h"
#include "frame/host/Host.h"
#include "platform/FileSystem.h"

namespace quendal {

struct LayoutVariant {
  // Names the layout: "<className>.layout" beside the output, else the shipped one.
  std::string_view className;
  // The file name: prefix, then (with accountInName) the first 4 characters
  // of the upper-cased account reference and "_", then the time of the call
  // by stampMask, then the extension.
  std::string_view prefix;
  bool accountInName = false;
  std::string_view stampMask;
  std::string_view extension;
  // A file of the folder with this prefix and extension that was created
  // today takes the consignment, whatever its time in the name.
  bool reuseTodaysFile = false;
  // The table of ServiceCode; without one ServiceCode is the trimmed service.
  std::optional<ServiceTable> serviceTable;
  // Trailer records are written after each consignment. Otherwise a trailer
  // the file ends with is kept last, and none is added.
  bool writesTrailer = true;
};

// One consignment as the writer takes it.
struct LayoutConsignment {
  Ref<host::ConNote> conNote;
  Ref<host::ASN> asn;
  Ref<host::PackList> packs;
  std::string folder;  // the output folder, ending with its separator
  Var manifestNumber;
  // 0 writes every pack; n writes only the consignment's n-th pack (a row
  // of a run that lists packs), after the consignment records.
  std::int32_t onlyPack = 0;
};

class LayoutWriter {
 public:
  class Owner {
   public:
    virtual ~Owner() = default;
    // Writes one host log entry and hands its id to the caller.
    virtual void LogLine(long errorNumber, std::string_view procedure, std::string_view message) = 0;
  };

  // Both must outlive the writer.
  LayoutWriter(const LayoutVariant& variant, Owner& owner) : variant_(variant), owner_(owner) {}

  // Writes the consignment as further steps of `proc`; true once its
  // records are in the file and `written` (when given) has succeeded.
  bool Write(Procedure& proc, const LayoutConsignment& consignment,
             const std::function<bool()>& written = {});

  void Close() { file_.Close(); }

  // The layout for an output folder: the site's file there, else the
  // shipped one; null after logging why it can't be used.
  std::shared_ptr<const Layout> LayoutFor(const std::string& folder);

 private:
  std::string TargetFile(const Ref<host::Carrier>& carrier, const std::string& folder) const;

  const LayoutVariant& variant_;
  Owner& owner_;
  AppendingFile file_;
  // The last layout read, while its file is unchanged.
  std::string cachedPath_;
  std::optional<FileStamp> cachedStamp_;
  std::shared_ptr<const Layout> cached_;
};

// A despatch class whose file is laid out by a layout file: each Process
// logs the call and writes the consignment to the carrier's FileFolder.
class LayoutDespatch : public ConsignmentWriter, private LayoutWriter::Owner {
 protected:
  // The variant must outlive the object.
  explicit LayoutDespatch(const LayoutVariant& variant);

  void Compile(const Ref<host::ConNote>& objConNote, const Ref<host::ASN>& objASN,
               const Ref<host::PackList>& lstPacks) override;
  void CloseOpenFile() override { writer_.Close(); }

 private:
  void LogLine(long errorNumber, std::string_view procedure, std::string_view message) override {
    ConsignmentWriter::LogLine(errorNumber, procedure, message);
  }

  LayoutWriter writer_;
};

}  // namespace quendal
