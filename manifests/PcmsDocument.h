// The eParcel PCMS manifest document: the value rules of its elements, the
// document tree, and the day's file that collects every consignment of a day.
//
// The file holds one PCMS wrapper in the carrier's namespace around one
// SendPCMSManifest tree (one header, one body, one PCMSManifest). A run adds
// its consignments to the day's file when it ends: the file as it stands
// then is read, the run's PCMSConsignment elements are appended, and the
// whole is written to a temporary file that is renamed over it. A file that
// cannot be read as a PCMS manifest is never overwritten; the run goes to a
// file beside it.
#pragma once

#include <memory>
#include <pugixml.hpp>
#include <string>
#include <string_view>
#include <vector>

#include "frame/Var.h"
#include "manifests/XmlWriting.h"

namespace quendal::pcms {

inline constexpr std::string_view kNamespace = "http://www.auspost.com.au/xml/pcms";

// The carrier's account reference followed by the last 7 characters of the consignment note number.
std::string ConsignmentNumber(const Var& accountRef, const Var& conNoteNo);
// "S1" for STANDARD, "X1" for EXPRESS, otherwise the service level itself.
std::string ChargeCode(const Var& serviceLevel);
// "###0.00"; "0.40" when there is no weight (Null, 0, or not a number).
std::string WeightText(const Var& weight);
// "N" when the carrier's notify options hold "#%noemail", otherwise "Y".
std::string EmailNotification(const Var& notifyOptions);
// The first two characters of the vendor's country, "AU" when it is blank.
std::string ReturnCountryCode(const Var& country);
// "99700196" for the EXPRESS service, "99700193" for any other.
std::string BarcodePrefix(const Var& service);
// The article code of the article at 1-based `position` of a consignment.
std::string ArticleCode(int position);
// A carton dimension in metres as the whole centimetres text ("" for no value).
std::string Dimension(const Var& metres);
// "yyyy-mm-ddThh:mm:ss.0Z": local time, written as the carrier expects it.
std::string TransactionTime(const DateTime& at);
// The consignment date as "yyyy-mm-ddThh:mm:ss.106+10:00".
std::string CreatedTime(const Var& conNoteDate);
using xml::AppendText;
using xml::XmlText;

class Document {
 public:
  // An empty SendPCMSManifest tree.
  Document();
  // The tree of a written file (wrapped or not); null when the bytes are
  // not a PCMS manifest with a body and a PCMSManifest.
  static std::unique_ptr<Document> Parse(std::string_view bytes);

  pugi::xml_node SendPCMSManifest() const { return root_; }
  // The PCMSManifest element under body; empty while the tree has none.
  pugi::xml_node PCMSManifest() const;
  std::size_t ConsignmentCount() const;
  // Appends copies of the other document's PCMSConsignment elements whose
  // ConsignmentNumber this tree does not hold yet, and returns the numbers
  // of those left out: a consignment is never twice in one manifest.
  std::vector<std::string> AppendConsignmentsOf(const Document& other);

  // The file: declaration, wrapper start tag, the tree indented by two
  // spaces a level, and the wrapper end tag; every line ends with CR LF;
  // UTF-8 without byte-order mark.
  std::string FileText() const;

 private:
  std::unique_ptr<pugi::xml_document> xml_;
  pugi::xml_node root_;
};

struct DayFileWritten {
  std::string path;                     // the file that now holds the run
  std::vector<std::string> unreadable;  // day's files kept because they could not be read
  std::vector<std::string> alreadyInFile;  // consignment numbers the file held before
};

// Adds the run's consignments to the day's file at `path` (creating it when
// missing); an unreadable file is kept and the next free name beside it
// ("name_2.xml", "name_3.xml", ...) is used instead. Raises the runtime's
// file errors when nothing could be written.
DayFileWritten WriteDayFile(const std::string& path, const Document& run);

}  // namespace quendal::pcms
