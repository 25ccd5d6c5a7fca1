#include "manifests/eParcelRows.h"

#include <array>
#include <cstdint>

#include "frame/VB.h"
#include "labels/WinPrint.h"
#include "platform/Clock.h"
#include "platform/DirectorySpooler.h"
#include "platform/FileLock.h"
#include "platform/FileSystem.h"

namespace quendal {

namespace {

constexpr std::size_t kRowColumns = 6;
// What the runs of one folder lock while they look for, read and rewrite the day's file.
constexpr const char* kDayFileLock = "PCMS manifest";

void AppendContentsItem(pugi::xml_node parent) {
  pcms::AppendText(parent.append_child("ContentsItem"), "GoodsDescription", "Apparel");
}

std::optional<std::string> NonEmpty(std::string text) {
  if (text.empty()) return std::nullopt;
  return text;
}

}  // namespace

// The elements of a PCMSConsignment before its articles, in the order the
// carrier reads them; an optional element is left out when it has no value.
const eParcelRows::ConsignmentField eParcelRows::kConsignmentFields[] = {
    {"ConsignmentNumber", &Consignment::number, nullptr},
    {"ChargeCode", &Consignment::chargeCode, nullptr},
    {"ReferenceNo1", &Consignment::reference, nullptr},
    {"DeliveryName", &Consignment::deliveryName, nullptr},
    {"DeliveryCompanyName", &Consignment::company, nullptr},
    {"EmailNotification", &Consignment::email, nullptr},
    {"DeliveryAddressLine1", &Consignment::line1, nullptr},
    {"DeliveryAddressLine2", &Consignment::line2, nullptr},
    {"DeliveryPhoneNumber", &Consignment::phone, nullptr},
    {"DeliveryEmailAddress", &Consignment::emailAddress, nullptr},
    {"DeliverySuburb", &Consignment::suburb, nullptr},
    {"DeliveryStateCode", &Consignment::state, nullptr},
    {"DeliveryPostcode", &Consignment::postcode, nullptr},
    {"DeliveryCountryCode", nullptr, "AU"},
    {"IsInternationalDelivery", nullptr, "false"},
    {"ReturnName", &Consignment::returnName, nullptr},
    {"ReturnAddressLine1", &Consignment::returnLine1, nullptr},
    {"ReturnSuburb", &Consignment::returnSuburb, nullptr},
    {"ReturnStateCode", &Consignment::returnState, nullptr},
    {"ReturnPostcode", &Consignment::returnPostcode, nullptr},
    {"ReturnCountryCode", &Consignment::returnCountry, nullptr},
    {"CreatedDateTime", &Consignment::created, nullptr},
    {"PostChargeToAccount", &Consignment::postCharge, nullptr},
    {"IsSignatureRequired", nullptr, "Y"},
    {"DeliverPartConsignment", nullptr, "N"},
    {"ContainsDangerousGoods", nullptr, "false"},
};

eParcelRows::eParcelRows(const eParcelVariant& variant)
    : RowWriter(variant.className, kConsignmentColumns, kRowColumns), variant_(variant) {}

Ref<host::ConNotes> eParcelRows::QueryConNotes() {
  return variant_.awaitingManifest ? ManifestConNotes() : TodaysConNotes();
}

void eParcelRows::FillRow(Grid& rows, std::size_t row, const Ref<host::ConNote>& conNote) {
  RowWriter::FillRow(rows, row, conNote);
  if (!variant_.orderAddressInGrid) return;
  Ref<host::Orders> orders = conNote->Orders();
  if (!orders || orders->Count() != 1) return;
  Ref<host::Order> order = orders->Item(1);
  Ref<host::Address> address = order ? order->DeliveryAddress() : nullptr;
  if (!address) return;
  const std::string name = address->Name().Text();
  if (!name.empty()) rows(row, 2) = Var(name + " " + address->Suburb().Text());
}

std::int32_t eParcelRows::ProcessRow(Procedure& proc, const Ref<host::ConNote>& conNote,
                                     LogList& vtErrorLog) {
  std::int32_t result = 0;
  // Without a folder text the day's file and the run's journal would go to
  // the process's working directory, where no carrier transfer looks.
  if (!proc([&] {
        if (!DayFolder().empty()) return true;
        WriteLog(0, "Open carrier message file", "Invalid folder ");
        vtErrorLog = {LastLogId()};
        return false;
      }))
    return result;
  if (variant_.manifestRecord) {
    bool saved = false;
    if (!proc([&] { saved = SaveManifestRecord(); })) return result;
    if (!proc([&] {
          if (saved) return true;
          WriteLog(0, "Process", "Failed to create mainifest ID");
          vtErrorLog = {LastLogId()};
          return false;
        }))
      return result;
  }
  // A run begins by moving in what runs that died before their Term left.
  if (!document_) {
    FileLock lock;
    if (!LockDayFile(proc, lock) || !MoveInAbandoned(proc)) return result;
  }
  // The run's document is kept only once a whole consignment is in it: a
  // first row whose consignment cannot be read leaves no header behind.
  std::unique_ptr<pcms::Document> started;
  std::string skeleton;
  if (!proc([&] {
        if (document_) return;
        manifestNumber_ = variant_.manifestRecord ? manifest_->ManifestNumber().Text()
                                                  : Format(Var(Now()), "YYMMDDHHMM");
        fileName_ = DayFolder() + DayFileName(manifestNumber_);
        started = StartDocument(conNote);
        skeleton = started->FileText();
      }))
    return result;
  pcms::Document* document = document_ ? document_.get() : started.get();
  if (!document) return result;
  bool appended = false;
  bool listed = false;
  if (!proc([&] {
        const std::string number =
            pcms::ConsignmentNumber(carrier_->AccountRef(), conNote->ConNoteNo());
        if (document_ && runNumbers_.contains(number)) {
          listed = true;
          WriteLog(0, "Process",
                   "Consignment " + number + " is already in this manifest; it is not added again.");
          vtErrorLog = {LastLogId()};
          return;
        }
        CreatePCMSConsignment(document->PCMSManifest(), conNote);
        appended = true;
        if (started) runNumbers_.clear();
        runNumbers_.insert(number);
      }))
    return result;
  if (listed) return result;
  // A consignment that is not in the document is neither stamped nor reported done.
  if (!appended) return result;
  // The consignment is durable in the run's journal before the host hears
  // of it: a process that dies before Term leaves it for the next run.
  bool kept = false;
  if (!proc([&] {
        const pugi::xml_node added = document->PCMSManifest().last_child();
        std::unique_ptr<pcms::Document> single =
            pcms::Document::Parse(started ? skeleton : skeleton_);
        if (single) {
          single->PCMSManifest().append_copy(added);
          if (!journal_) journal_ = std::make_unique<RowJournal>(DayFolder(), ClassName());
          kept = journal_->Add(single->FileText());
        }
        if (kept) return;
        document->PCMSManifest().remove_child(added);
        const std::string number =
            pcms::ConsignmentNumber(carrier_->AccountRef(), conNote->ConNoteNo());
        runNumbers_.erase(number);
        WriteLog(err::kPathFileAccess, "Process",
                 "Consignment " + number + " cannot be kept for the manifest file in " +
                     DayFolder() + "; it is not added.");
        vtErrorLog = {LastLogId()};
      }) ||
      !kept)
    return result;
  if (started) {
    document_ = std::move(started);
    skeleton_ = std::move(skeleton);
  }
  if (variant_.manifestRecord) {
    if (!proc([&] {
          conNote->SetManifestId(manifest_->ManifestId());
          conNote->Update(Var(8));
        }))
      return result;
  }
  if (!proc([&] {
        WriteLog(0, "Process", "Consigment " + conNote->ConNoteNo().Text() + " compile completed.");
      }))
    return result;
  if (!proc([&] {
        vtErrorLog = {LastLogId()};
        result = ConNoteIdResult(conNote);
      }))
    return result;
  return result;
}

bool eParcelRows::TermWork(Procedure& proc) {
  // The day's file is this run's alone while it is read and rewritten.
  FileLock lock;
  if (!LockDayFile(proc, lock) || !MoveInAbandoned(proc)) return false;
  if (!document_) return true;
  if (!WriteRun(proc, *document_, fileName_)) return false;
  document_.reset();
  runNumbers_.clear();
  // Its consignments are in the file: the journal has done its work.
  if (journal_) journal_->Clear();
  return true;
}

bool eParcelRows::WriteRun(Procedure& proc, const pcms::Document& run, const std::string& newFile) {
  std::string target;
  if (!proc([&] {
        // The day's file as it stands now: another run may have written it
        // since this run began.
        target = newFile;
        if (auto today = TodaysFile()) target = DayFolder() + *today;
      }))
    return false;
  pcms::DayFileWritten written;
  if (!proc([&] { written = pcms::WriteDayFile(target, run); })) return false;
  // Nothing written: the run's consignments stay for another Term.
  if (written.path.empty()) return false;
  for (const std::string& number : written.alreadyInFile) {
    if (!proc([&] {
          WriteLog(0, "Term",
                   "Consignment " + number + " is already in the manifest file " + written.path +
                       "; it is not added again.");
        }))
      return false;
  }
  for (const std::string& kept : written.unreadable) {
    if (!proc([&] {
          WriteLog(0, "Term",
                   "Manifest file " + kept +
                       " cannot be read as a PCMS manifest; it is kept and the consignments are "
                       "written to " +
                       written.path + ".");
        }))
      return false;
  }
  return true;
}

bool eParcelRows::MoveInAbandoned(Procedure& proc) {
  bool left = false;
  std::string folder;
  if (!proc([&] { folder = DayFolder(); })) return false;
  if (!FolderExists(folder)) return true;
  RowJournal::TakeAbandoned(folder, ClassName(), [&](const std::vector<std::string>& records) {
    if (left) return false;
    // The records of one run share its header; together they are that run's document.
    std::unique_ptr<pcms::Document> run;
    for (const std::string& record : records) {
      std::unique_ptr<pcms::Document> one = pcms::Document::Parse(record);
      if (!one) continue;
      if (!run)
        run = std::move(one);
      else
        run->AppendConsignmentsOf(*one);
    }
    if (!run) return true;
    const std::string number = run->PCMSManifest().child("ManifestNumber").text().as_string();
    if (WriteRun(proc, *run, folder + DayFileName(number))) return true;
    left = true;
    return false;
  });
  return !left;
}

std::string eParcelRows::DayFolder() { return carrier_ ? carrier_->FileFolder().Text() : std::string(); }

bool eParcelRows::LockDayFile(Procedure& proc, FileLock& lock) {
  return proc([&] {
    // Without its folder there is no day's file to guard; writing will say so.
    const std::string folder = DayFolder();
    if (FolderExists(folder)) lock.Acquire(folder + kDayFileLock);
  });
}

std::unique_ptr<pcms::Document> eParcelRows::StartDocument(const Ref<host::ConNote>& conNote) {
  auto document = std::make_unique<pcms::Document>();
  CreatePCMSHeader(document->SendPCMSManifest(), conNote);
  pugi::xml_node manifest =
      document->SendPCMSManifest().append_child("body").append_child("PCMSManifest");
  pcms::AppendText(manifest, "MerchantLocationId", carrier_->AccountRef().Text());
  pcms::AppendText(manifest, "ManifestNumber", manifestNumber_);
  const std::string now = pcms::TransactionTime(Now());
  pcms::AppendText(manifest, "DateSubmitted", now);
  pcms::AppendText(manifest, "DateLodged", now);
  return document;
}

std::string eParcelRows::DayFileName(const std::string& manifestNumber) {
  return SafeNamePart(Left(UCase(carrier_->AccountRef().Text()), 4)) + "_" + SafeNamePart(manifestNumber) +
         "_" + SafeNamePart(carrier_->Options().Text()) + ".xml";
}

std::optional<std::string> eParcelRows::TodaysFile() {
  const std::string folder = variant_.scansOutputFolder ? ediDocument_->OutputFolder().Text()
                                                        : carrier_->FileFolder().Text();
  const auto files = ListFiles(folder);
  if (!files) return std::nullopt;
  const DateTime today = Today();
  for (const FileEntry& file : *files)
    if (UCase(Right(file.name, 4)) == ".XML" && file.created.DateOnly() == today) return file.name;
  return std::nullopt;
}

void eParcelRows::CreateContentsItem(pugi::xml_node parentNode) { AppendContentsItem(parentNode); }

void eParcelRows::CreatePCMSHeader(pugi::xml_node parentNode,
                                   const Ref<host::ConNote>& objConNote) {
  Ref<host::Despatch> despatch = objConNote->Packs()->Item(1)->Despatch();
  const std::string transactionId = despatch ? despatch->DespatchNo().Text() : std::string();
  pugi::xml_node header = parentNode.append_child("header");
  pcms::AppendText(header, "TransactionDateTime", pcms::TransactionTime(Now()));
  pcms::AppendText(header, "TransactionId", transactionId);
  pcms::AppendText(header, "TransactionSequence", "0");
  pcms::AppendText(header, "ApplicationId", "MERCHANT");
}

void eParcelRows::CreatePCMSDomesticArticle(pugi::xml_node parentNode,
                                            const Ref<host::ConNote>& aConnote,
                                            std::int32_t position) {
  Ref<host::PackList> packs = aConnote->Packs();
  const std::string postcode = packs->Item(1)->Order()->DeliveryAddress()->Postcode().Text();
  const std::string number = pcms::ConsignmentNumber(carrier_->AccountRef(), aConnote->ConNoteNo());
  const Article article = ReadArticle(packs->Item(position), position, number,
                                      pcms::BarcodePrefix(aConnote->Service()), postcode);
  AppendArticle(parentNode, article, pcms::WeightText(aConnote->Weight()));
}

void eParcelRows::CreatePCMSConsignment(pugi::xml_node parentNode,
                                        const Ref<host::ConNote>& aConnote) {
  AppendConsignment(parentNode, ReadConsignment(aConnote));
}

std::string eParcelRows::CreateArticleID(const std::string& sConnote, const std::string& sCodes) {
  return quendal::CreateArticleID(sConnote, sCodes);
}

eParcelRows::Consignment eParcelRows::ReadConsignment(const Ref<host::ConNote>& conNote) {
  Consignment v;
  Ref<host::PackList> packs = conNote->Packs();
  Ref<host::Pack> first = packs->Item(1);
  Ref<host::Address> address = first->Order()->DeliveryAddress();
  Ref<host::Vendor> vendor = conNote->Vendor();

  const std::string number = pcms::ConsignmentNumber(carrier_->AccountRef(), conNote->ConNoteNo());
  v.number = number;
  v.chargeCode = pcms::ChargeCode(conNote->ServiceLevel());
  v.reference = address->Reference().Text();
  v.deliveryName = address->Name().Text();
  v.company = DeliveryCompany(first);
  v.email = pcms::EmailNotification(carrier_->NotifyOptions());
  v.line1 = address->Line1().Text();
  v.line2 = NonEmpty(address->Line2().Text());
  v.phone = NonEmpty(Trim(address->Phone().Text()));
  const std::string emailAddress = address->Email().Text();
  if (!Trim(emailAddress).empty()) v.emailAddress = emailAddress;
  v.suburb = address->Suburb().Text();
  v.state = address->State().Text();
  const std::string postcode = address->Postcode().Text();
  v.postcode = postcode;
  v.returnName = vendor->Name().Text();
  v.returnLine1 = vendor->AddressLine1().Text();
  v.returnSuburb = vendor->Suburb().Text();
  v.returnState = vendor->State().Text();
  v.returnPostcode = vendor->Postcode().Text();
  v.returnCountry = pcms::ReturnCountryCode(vendor->Country());
  v.created = pcms::CreatedTime(conNote->ConNoteDate());
  v.postCharge = carrier_->AccountNumber().Text();
  v.weight = pcms::WeightText(conNote->Weight());

  const std::string prefix = pcms::BarcodePrefix(conNote->Service());
  if (variant_.articlePerPack) {
    std::int32_t position = 0;
    for (Ref<host::Pack> pack : *packs)
      v.articles.push_back(ReadArticle(pack, ++position, number, prefix, postcode));
  } else {
    v.articles.push_back(ReadArticle(first, 1, number, prefix, postcode));
  }
  return v;
}

eParcelRows::Article eParcelRows::ReadArticle(const Ref<host::Pack>& pack, std::int32_t position,
                                              const std::string& consignmentNumber,
                                              const std::string& barcodePrefix,
                                              const std::string& postcode) {
  Article article;
  article.number = CreateArticleID(consignmentNumber, pcms::ArticleCode(position));
  article.barcode = barcodePrefix + article.number + "0" + postcode;
  // Each article carries its own pack's carton; a pack without a carton
  // type gives no dimensions rather than stopping the consignment.
  if (Ref<host::Carton> carton = pack->Carton()) {
    article.length = pcms::Dimension(carton->Length());
    article.width = pcms::Dimension(carton->Width());
    article.height = pcms::Dimension(carton->Height());
  }
  return article;
}

std::optional<std::string> eParcelRows::DeliveryCompany(const Ref<host::Pack>& firstPack) {
  Ref<host::SlipLines> lines = firstPack->Order()->SlipLines();
  if (!lines || lines->Count() < 1) return std::nullopt;
  Ref<host::Customer> customer = lines->Item(1)->Customer();
  if (!customer) return std::nullopt;
  const std::string name = customer->Name().Text();
  if (name.empty()) return std::nullopt;
  if (!variant_.companyFromAddress) return name;
  Ref<host::Address> address = customer->Address();
  return address ? address->Company().Text() : std::string();
}

void eParcelRows::AppendConsignment(pugi::xml_node parent, const Consignment& values) {
  pugi::xml_node consignment = parent.append_child("PCMSConsignment");
  for (const ConsignmentField& field : kConsignmentFields) {
    if (!field.value) {
      pcms::AppendText(consignment, field.element, field.fixed);
    } else if (const auto& value = values.*field.value) {
      pcms::AppendText(consignment, field.element, *value);
    }
  }
  for (const Article& article : values.articles) AppendArticle(consignment, article, values.weight);
}

void eParcelRows::AppendArticle(pugi::xml_node parent, const Article& article,
                                const std::string& weight) {
  pugi::xml_node node = parent.append_child("PCMSDomesticArticle");
  pcms::AppendText(node, "ArticleNumber", article.number);
  pcms::AppendText(node, "BarcodeArticleNumber", article.barcode);
  pcms::AppendText(node, "Length", article.length);
  pcms::AppendText(node, "Width", article.width);
  pcms::AppendText(node, "Height", article.height);
  pcms::AppendText(node, "ActualWeight", weight);
  pcms::AppendText(node, "IsTransitCoverRequired", "N");
  AppendContentsItem(node);
}

}  // namespace quendal
