// The eParcel PCMS manifest runs: the consignments of a run are built into
// one PCMS document, which Term adds to the day's file. The manifest run and
// the end-of-day run differ only by the points of eParcelVariant.
#pragma once

#include <memory>
#include <optional>
#include <pugixml.hpp>
#include <string>
#include <unordered_set>
#include <vector>

#include "manifests/PcmsDocument.h"
#include "manifests/RowJournal.h"
#include "manifests/RowWriter.h"
#include "platform/FileLock.h"

namespace quendal {

// What tells one eParcel run from the other.
struct eParcelVariant {
  std::string_view className;
  // Lists the consignments awaiting a manifest; otherwise today's.
  bool awaitingManifest;
  // Grid column 2 shows the single order's delivery name and suburb when
  // there is one; otherwise always the delivery location.
  bool orderAddressInGrid;
  // Creates the host manifest record on the first row, takes the manifest
  // number from it and stamps each consignment with it; otherwise the
  // manifest number is the clock ("YYMMDDHHMM") and nothing is stamped.
  bool manifestRecord;
  // Looks for the day's file in the EDI document's output folder; otherwise
  // in the carrier's file folder.
  bool scansOutputFolder;
  // DeliveryCompanyName is the company of the customer's address; otherwise the customer's name.
  bool companyFromAddress;
  // One PCMSDomesticArticle per pack; otherwise one per consignment.
  bool articlePerPack;
};

class eParcelRows : public RowWriter {
 public:
  // Each appends its element (and what it holds) to `parentNode`.
  void CreateContentsItem(pugi::xml_node parentNode);
  void CreatePCMSHeader(pugi::xml_node parentNode, const Ref<host::ConNote>& objConNote);
  // The article of the consignment's pack at 1-based `position`.
  void CreatePCMSDomesticArticle(pugi::xml_node parentNode, const Ref<host::ConNote>& aConnote,
                                 std::int32_t position = 1);
  void CreatePCMSConsignment(pugi::xml_node parentNode, const Ref<host::ConNote>& aConnote);
  std::string CreateArticleID(const std::string& sConnote, const std::string& sCodes);

 protected:
  explicit eParcelRows(const eParcelVariant& variant);

  Ref<host::ConNotes> QueryConNotes() override;
  void FillRow(Grid& rows, std::size_t row, const Ref<host::ConNote>& conNote) override;
  std::int32_t ProcessRow(Procedure& proc, const Ref<host::ConNote>& conNote,
                          LogList& vtErrorLog) override;
  bool TermWork(Procedure& proc) override;

 private:
  struct Article {
    std::string number, barcode, length, width, height;
  };
  // Every value of one PCMSConsignment, read from the host before any
  // element is made, so a failing host read never leaves half a consignment.
  struct Consignment {
    std::optional<std::string> number, chargeCode, reference, deliveryName, company, email, line1,
        line2, phone, emailAddress, suburb, state, postcode, returnName, returnLine1, returnSuburb,
        returnState, returnPostcode, returnCountry, created, postCharge;
    std::string weight;
    std::vector<Article> articles;
  };
  struct ConsignmentField {
    const char* element;
    std::optional<std::string> Consignment::*value;  // null: the fixed text
    const char* fixed;
  };
  static const ConsignmentField kConsignmentFields[];

  Consignment ReadConsignment(const Ref<host::ConNote>& conNote);
  Article ReadArticle(const Ref<host::Pack>& pack, std::int32_t position,
                      const std::string& consignmentNumber, const std::string& barcodePrefix,
                      const std::string& postcode);
  std::optional<std::string> DeliveryCompany(const Ref<host::Pack>& firstPack);
  static void AppendConsignment(pugi::xml_node parent, const Consignment& values);
  static void AppendArticle(pugi::xml_node parent, const Article& article,
                            const std::string& weight);

  // A new document for the run: header, body and the PCMSManifest fields.
  std::unique_ptr<pcms::Document> StartDocument(const Ref<host::ConNote>& conNote);
  // The name of a new day's file: account, manifest number and carrier options.
  std::string DayFileName(const std::string& manifestNumber);
  // Adds a run's document to the day's file as it stands now, as steps of
  // `proc`; false when nothing could be written.
  bool WriteRun(Procedure& proc, const pcms::Document& run, const std::string& newFile);
  // Moves into the day's file the consignments that runs which ended
  // without Term left in their journals; false when a step was left.
  bool MoveInAbandoned(Procedure& proc);
  // The folder of the day's file, where the journals lie too.
  std::string DayFolder();
  // Takes the lock the runs of the folder share for the day's file and the journals.
  bool LockDayFile(Procedure& proc, FileLock& lock);
  // The first file of the scanned folder created today whose name ends in ".XML".
  std::optional<std::string> TodaysFile();

  const eParcelVariant& variant_;
  std::unique_ptr<pcms::Document> document_;
  // document_ before its first consignment: what each journal record starts from.
  std::string skeleton_;
  // The run's finished consignments, durable before they are stamped.
  std::unique_ptr<RowJournal> journal_;
  // The consignment numbers in document_.
  std::unordered_set<std::string> runNumbers_;
  std::string manifestNumber_;
};

}  // namespace quendal
