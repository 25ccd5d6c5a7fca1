#include "carrierfiles/LayoutWriter.h"

#include <utility>
#include <vector>

#include "carrierfiles/TailJournal.h"
#include "frame/VB.h"
#include "frame/host/Read.h"
#include "platform/Clock.h"
#include "platform/CodePage.h"
#include "platform/DirectorySpooler.h"
#include "platform/FileLock.h"

namespace quendal {

using host::Read;

namespace {

constexpr std::string_view kOpenFile = "Open carrier message file";
constexpr std::string_view kOpenLayout = "Open layout file";
constexpr std::string_view kProcess = "Process";
// How much of the file's end the trailer check reads.
constexpr std::size_t kTrailerWindow = 64 * 1024;

// The shipped layout's name in messages.
std::string ShippedName(std::string_view className) {
  return "the shipped layout " + std::string(className) + ".layout";
}

// A line of the file (code-page bytes, without its line end) has the shape
// of the trailer record: its literals where the record puts them and, in a
// fixed-width file, the record's length.
bool LooksLikeTrailer(const Layout& layout, const LayoutRecord& record, std::string_view line) {
  if (layout.delimited) {
    std::vector<std::string_view> columns;
    std::size_t start = 0;
    for (std::size_t at; (at = line.find(layout.delimiter, start)) != std::string_view::npos;
         start = at + 1)
      columns.push_back(line.substr(start, at - start));
    columns.push_back(line.substr(start));
    if (columns.size() != record.fields.size()) return false;
    for (std::size_t i = 0; i < columns.size(); ++i)
      if (record.fields[i].kind == record::Kind::Literal &&
          columns[i] != ToCodePage(record.fields[i].text))
        return false;
    return true;
  }
  std::size_t at = 0;
  for (const record::Field& field : record.fields) {
    if (field.kind == record::Kind::Literal) {
      const std::string literal = ToCodePage(field.text);
      if (line.substr(at, literal.size()) != literal) return false;
      at += literal.size();
    } else {
      at += static_cast<std::size_t>(field.width);
    }
  }
  return at == line.size();
}

}  // namespace

std::shared_ptr<const Layout> LayoutWriter::LayoutFor(const std::string& folder) {
  const std::string site = folder + std::string(variant_.className) + ".layout";
  if (FileExists(site) || FolderExists(site)) {
    const std::optional<FileStamp> stamp = StampOf(site);
    if (cached_ && cachedPath_ == site && stamp && cachedStamp_ == stamp) return cached_;
    const std::optional<std::string> bytes = ReadFileHead(site, kLayoutFileLimit + 1);
    if (!bytes) {
      owner_.LogLine(err::kPathFileAccess, kOpenLayout, "Cannot read layout " + site);
      return nullptr;
    }
    LayoutRead read = ReadLayout(*bytes);
    if (!read.layout) {
      owner_.LogLine(0, kOpenLayout, "Cannot use layout " + ProblemText(site, read.problem));
      return nullptr;
    }
    cachedPath_ = site;
    cachedStamp_ = stamp;
    cached_ = std::move(read.layout);
    return cached_;
  }
  if (cached_ && cachedPath_.empty()) return cached_;
  const std::string_view shipped = DefaultLayout(variant_.className);
  LayoutRead read = ReadLayout(shipped);
  if (shipped.empty() || !read.layout) {
    owner_.LogLine(0, kOpenLayout,
                   shipped.empty() ? "No layout for " + std::string(variant_.className)
                                   : "Cannot use layout " +
                                         ProblemText(ShippedName(variant_.className), read.problem));
    return nullptr;
  }
  cachedPath_.clear();
  cachedStamp_.reset();
  cached_ = std::move(read.layout);
  return cached_;
}

std::string LayoutWriter::TargetFile(const Ref<host::Carrier>& carrier,
                                     const std::string& folder) const {
  if (variant_.reuseTodaysFile) {
    const std::string today = Format(Var(Today()), "Short Date");
    const std::string extension = UCase(variant_.extension);
    if (const auto files = ListFiles(folder)) {
      for (const FileEntry& file : *files)
        if (file.name.starts_with(variant_.prefix) &&
            UCase(Right(file.name, Len(extension))) == extension &&
            Format(Var(file.created), "Short Date") == today)
          return folder + file.name;
    }
  }
  // The account reference is a host text: made safe on its own, it can't
  // lead out of the folder or reach into the extension.
  std::string name(variant_.prefix);
  if (variant_.accountInName)
    name += SafeNamePart(Left(UCase(Read(carrier, &host::Carrier::AccountRef).Text()), 4)) + "_";
  name += Format(Var(Now()), variant_.stampMask);
  name += variant_.extension;
  return folder + name;
}

bool LayoutWriter::Write(Procedure& proc, const LayoutConsignment& c,
                         const std::function<bool()>& written) {
  std::string no;
  Ref<host::Carrier> carrier;
  if (!proc([&] {
        no = c.conNote->ConNoteNo().Text();
        carrier = c.conNote->Carrier();
      }))
    return false;

  if (!proc([&] {
        if (IsCarrierFolder(c.folder)) return true;
        owner_.LogLine(0, kOpenFile, "Invalid folder " + c.folder);
        return false;
      }))
    return false;

  // A layout that can't be used writes nothing: a file laid out wrongly
  // would be refused by the carrier, or read wrongly.
  std::shared_ptr<const Layout> layout;
  if (!proc([&] {
        layout = LayoutFor(c.folder);
        return layout != nullptr;
      }))
    return false;

  std::string path;
  if (!proc([&] { path = TargetFile(carrier, c.folder); })) return false;

  // Until the consignment is in, the file is this station's alone: whether
  // it needs a header, and where its trailer starts, stay as read here.
  FileLock lock;
  if (!proc([&] {
        if (lock.Acquire(path)) return true;
        owner_.LogLine(err::kPathFileAccess, kOpenFile, "Cannot open file " + c.folder);
        return false;
      }))
    return false;

  // An addition that a crash interrupted is completed before anything else.
  TailJournal journal(path, kTrailerWindow);
  if (!proc([&] {
        if (journal.Finish() != TailJournal::Recovery::Failed) return true;
        owner_.LogLine(0, kOpenFile, "Cannot open file to add consignment " + c.folder);
        return false;
      }))
    return false;

  LayoutValues values;
  bool newFile = false;
  if (!proc([&] {
        values.conNote = c.conNote;
        values.asn = c.asn;
        values.packs = c.packs;
        values.serviceCode = variant_.serviceTable ? ServiceCodeOf(*variant_.serviceTable, c.conNote)
                                                   : Trim(c.conNote->Service().Text());
        values.packCount = c.packs ? c.packs->Count() : 0;
        values.totalWeight = ShipmentWeightOf(c.packs);
        values.now = Now();
        values.manifestNumber = c.manifestNumber;
        values.fileName = path.substr(path.rfind(kFolderSeparator) + 1);
        newFile = FileSize(path).value_or(0) == 0;
      }))
    return false;

  const auto lines = [&](RecordWhen when, const Ref<host::Pack>& pack, std::int32_t packNo) {
    std::string text;
    for (const LayoutRecord& record : layout->records)
      if (record.when == when)
        text += ConsignmentWriter::CarrierLine(RenderRecord(*layout, record, values, pack, packNo));
    return text;
  };

  std::string header;
  if (!proc([&] { header = newFile ? lines(RecordWhen::Header, nullptr, 0) : std::string(); }))
    return false;
  // The records the consignment writes (its own, and the trailer that
  // follows them) must keep their widths; the file's header names the file.
  record::FitCheck fit;
  std::string records;
  if (!proc([&] { records = header + lines(RecordWhen::Consignment, nullptr, 0); })) return false;
  if (layout->Has(RecordWhen::Pack)) {
    const std::int32_t first = c.onlyPack > 0 ? c.onlyPack : 1;
    const std::int32_t last = c.onlyPack > 0 ? std::min(c.onlyPack, values.packCount) : values.packCount;
    for (std::int32_t i = first; i <= last; ++i) {
      const std::size_t packStart = records.size();
      if (!proc([&] {
            // A retried pack starts again from where it began.
            records.resize(packStart);
            records += lines(RecordWhen::Pack, c.packs->Item(i), i);
          }))
        return false;
    }
  }

  std::string trailer;
  if (layout->Has(RecordWhen::Trailer) &&
      !proc([&] { trailer = lines(RecordWhen::Trailer, nullptr, 0); }))
    return false;
  if (!proc([&] {
        if (fit.Fits()) return true;
        owner_.LogLine(0, kOpenFile, fit.Refusal(no));
        return false;
      }))
    return false;

  if (!layout->Has(RecordWhen::Trailer)) {
    // The consignment goes into the file in one write, so the file never holds part of it.
    if (!proc([&] {
          if (file_.Open(path)) return true;
          owner_.LogLine(err::kPathFileAccess, kOpenFile, "Cannot open file " + c.folder);
          return false;
        }))
      return false;
    if (!proc([&] {
          if (!file_.Append(records)) throw Error(err::kDeviceIO);
        }))
      return false;
  } else {
    // The consignment goes where the file's trailer starts (at its end when
    // it has none) and the trailer after it, in one journalled write.
    const std::size_t trailerLines = layout->Count(RecordWhen::Trailer);
    const auto find = [&](const TailJournal::End& end) -> std::optional<std::size_t> {
      if (end.bytes.empty()) return end.offset == 0 ? std::optional<std::size_t>(0) : std::nullopt;
      if (!end.bytes.ends_with("\r\n")) return std::nullopt;
      // The whole lines of the window, with where each starts.
      std::vector<std::pair<std::size_t, std::string_view>> whole;
      std::size_t start = 0;
      if (end.offset != 0) {
        start = end.bytes.find('\n');
        start = start == std::string_view::npos ? end.bytes.size() : start + 1;
      }
      for (std::size_t stop; (stop = end.bytes.find("\r\n", start)) != std::string_view::npos;
           start = stop + 2)
        whole.emplace_back(start, end.bytes.substr(start, stop - start));
      if (whole.size() < trailerLines) return end.bytes.size();
      const std::size_t from = whole.size() - trailerLines;
      std::size_t k = from;
      for (const LayoutRecord& record : layout->records) {
        if (record.when != RecordWhen::Trailer) continue;
        if (!LooksLikeTrailer(*layout, record, whole[k++].second)) return end.bytes.size();
      }
      return whole[from].first;
    };
    const auto build = [&](std::string_view oldTail) {
      return records + (variant_.writesTrailer ? trailer : std::string(oldTail));
    };
    if (!proc([&] {
          switch (journal.Replace(find, build)) {
            case TailJournal::Outcome::Replaced:
              return true;
            case TailJournal::Outcome::NoTail:
              owner_.LogLine(0, kOpenFile, "Cannot open file to add consignment " + c.folder);
              owner_.LogLine(0, kOpenFile,
                             "ConNote " + no + " not added: the last line of " + path +
                                 " is not whole");
              return false;
            case TailJournal::Outcome::CannotOpen:
              owner_.LogLine(err::kPathFileAccess, kOpenFile, "Cannot open file " + c.folder);
              return false;
            case TailJournal::Outcome::Failed:
              break;
          }
          throw Error(err::kDeviceIO);
        }))
      return false;
  }
  file_.Close();
  lock.Release();
  // The consignment is whole in the file; only now may the caller mark it done.
  if (written && !written()) return false;
  const bool done = true;
  if (!proc([&] { owner_.LogLine(0, kProcess, "ConNote " + no + " compile completed."); })) return done;
  proc([&] { file_.Close(); });
  return done;
}

LayoutDespatch::LayoutDespatch(const LayoutVariant& variant)
    : ConsignmentWriter(variant.className), writer_(variant, *this) {}

void LayoutDespatch::Compile(const Ref<host::ConNote>& objConNote, const Ref<host::ASN>& objASN,
                             const Ref<host::PackList>& lstPacks) {
  Procedure proc = Guard("Sub Process");
  LayoutConsignment consignment{objConNote, objASN, lstPacks, {}, Var(), 0};
  if (!proc([&] {
        LogLine(0, kProcess,
                "ConNote " + objConNote->ConNoteNo().Text() + ". ActiveX called " + ClassName());
        consignment.folder = Read(objConNote->Carrier(), &host::Carrier::FileFolder).Text();
      }))
    return;
  writer_.Write(proc, consignment);
}

}  // namespace quendal
