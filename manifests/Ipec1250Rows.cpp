#include "manifests/Ipec1250Rows.h"

#include "frame/host/Read.h"

namespace quendal {

Ipec1250Rows::Ipec1250Rows(const Ipec1250RowsVariant& variant)
    : ConsignmentFileRows(variant.layout.className, variant.columns, variant.rowColumns,
                          SummarySource::DateRange, variant.manifestRun),
      variant_(variant),
      writer_(variant.layout, *this) {}

void Ipec1250Rows::LogLine(long errorNumber, std::string_view procedure, std::string_view message) {
  RowWriter::LogLine(errorNumber, procedure, message);
}

std::int32_t Ipec1250Rows::ProcessRow(Procedure& proc, const Ref<host::ConNote>& conNote,
                                      LogList&) {
  std::int32_t result = 0;
  struct Done {
    Ipec1250Rows& self;
    ~Done() { self.writer_.Close(); }
  } done{*this};

  LayoutConsignment consignment;
  consignment.conNote = conNote;
  if (!OpenRow(proc, conNote, consignment.packs, consignment.asn)) return result;
  if (!proc([&] {
        consignment.folder =
            variant_.manifestRun ? ediDocument_->OutputFolder().Text()
                                 : host::Read(conNote->Carrier(), &host::Carrier::FileFolder).Text();
      }))
    return result;
  if (variant_.manifestRun) {
    if (!ManifestSaved(proc, "Failed to create mainifest ID")) return result;
    if (!proc([&] { consignment.manifestNumber = manifest_->ManifestNumber(); })) return result;
  }
  // A consignment counts as manifested once its records are in the file.
  const bool written = writer_.Write(proc, consignment, [&] {
    if (!variant_.manifestRun) return true;
    return proc([&] {
      conNote->SetManifestId(manifest_->ManifestId());
      conNote->Update(Var(8));
    });
  });
  if (!written) return result;
  proc([&] { result = ConNoteIdResult(conNote); });
  return result;
}

bool Ipec1250Rows::TermWork(Procedure& proc) {
  if (variant_.manifestRun) return true;
  bool printed = false;
  if (!proc([&] { printed = PrintTodaysSummary(); })) return false;
  return printed;
}

}  // namespace quendal
