#include "manifests/PcmsDocument.h"

#include <filesystem>
#include <system_error>
#include <unordered_set>

#include "frame/Error.h"
#include "frame/VB.h"
#include "platform/FileSystem.h"

namespace quendal::pcms {

namespace fs = std::filesystem;

std::string ConsignmentNumber(const Var& accountRef, const Var& conNoteNo) {
  return accountRef.Text() + Right(conNoteNo.Text(), 7);
}

std::string ChargeCode(const Var& serviceLevel) {
  const std::string level = serviceLevel.Text();
  if (level == "STANDARD") return "S1";
  if (level == "EXPRESS") return "X1";
  return level;
}

std::string WeightText(const Var& weight) {
  // A weight that is missing or not a number would make the carrier refuse
  // the whole manifest; such parcels go as the smallest weight band.
  if (!weight.IsNumeric() || weight.Number() == 0) return "0.40";
  return Format(Var(weight.Number()), "###0.00");
}

std::string EmailNotification(const Var& notifyOptions) {
  return InStr(notifyOptions.Text(), "#%noemail") > 0 ? "N" : "Y";
}

std::string ReturnCountryCode(const Var& country) {
  const std::string text = country.Text();
  return Trim(text).empty() ? "AU" : Left(text, 2);
}

std::string BarcodePrefix(const Var& service) {
  // "997", "001" for a two-digit product code, then the product code:
  // 96 for express post, 93 for parcel post.
  return service.Text() == "EXPRESS" ? "99700196" : "99700193";
}

std::string ArticleCode(int position) {
  // The code after the consignment number in an article id. The first
  // article of a consignment carries "01502"; a later one puts its own
  // two-digit position in place of the leading "01" ("02502", "03502", ...),
  // so that every parcel of a consignment has an id of its own to track.
  if (position <= 1) return "01502";
  std::string number = std::to_string(position);
  if (number.size() < 2) number.insert(0, "0");
  return number + "502";
}

std::string Dimension(const Var& metres) {
  if (!metres.IsNumeric()) return {};
  return NumberText(metres.Number() * 100);
}

std::string TransactionTime(const DateTime& at) {
  return Format(Var(at), "yyyy-mm-dd") + "T" + Format(Var(at), "hh:mm:ss") + ".0Z";
}

std::string CreatedTime(const Var& conNoteDate) {
  return Format(conNoteDate, "yyyy-mm-dd") + "T" + Format(conNoteDate, "hh:mm:ss") + ".106+10:00";
}

namespace {

std::string_view LocalName(pugi::xml_node node) {
  std::string_view name = node.name();
  const std::size_t colon = name.find(':');
  return colon == std::string_view::npos ? name : name.substr(colon + 1);
}

// The first child element whose name without prefix is `local`.
pugi::xml_node FindChild(pugi::xml_node parent, std::string_view local) {
  for (pugi::xml_node child : parent.children())
    if (child.type() == pugi::node_element && LocalName(child) == local) return child;
  return {};
}

void Store(const std::string& path, const std::string& bytes) {
  if (ReplaceFile(path, bytes)) return;
  const fs::path folder = fs::path(path).parent_path();
  throw Error(folder.empty() || FolderExists(folder.string()) ? err::kPathFileAccess
                                                              : err::kPathNotFound);
}

}  // namespace

Document::Document() : xml_(std::make_unique<pugi::xml_document>()) {
  root_ = xml_->append_child("SendPCMSManifest");
}

std::unique_ptr<Document> Document::Parse(std::string_view bytes) {
  auto xml = std::make_unique<pugi::xml_document>();
  // Whitespace that is an element's whole text is kept, so a written value
  // of spaces reads back as it was.
  const pugi::xml_parse_result parsed =
      xml::LoadDayFile(*xml, bytes, pugi::parse_default | pugi::parse_ws_pcdata_single);
  if (!parsed) return nullptr;
  pugi::xml_node root;
  for (pugi::xml_node top : xml->children()) {
    if (top.type() != pugi::node_element) continue;
    if (LocalName(top) == "SendPCMSManifest") root = top;
    if (LocalName(top) == "PCMS") root = FindChild(top, "SendPCMSManifest");
    break;
  }
  if (!root) return nullptr;
  auto document = std::unique_ptr<Document>(new Document());
  document->xml_ = std::move(xml);
  document->root_ = root;
  if (!document->PCMSManifest()) return nullptr;
  return document;
}

pugi::xml_node Document::PCMSManifest() const {
  return FindChild(FindChild(root_, "body"), "PCMSManifest");
}

std::size_t Document::ConsignmentCount() const {
  std::size_t count = 0;
  for (pugi::xml_node child : PCMSManifest().children())
    if (LocalName(child) == "PCMSConsignment") ++count;
  return count;
}

namespace {

std::string_view NumberOf(pugi::xml_node consignment) {
  return FindChild(consignment, "ConsignmentNumber").text().get();
}

}  // namespace

std::vector<std::string> Document::AppendConsignmentsOf(const Document& other) {
  pugi::xml_node target = PCMSManifest();
  std::unordered_set<std::string> held;
  for (pugi::xml_node child : target.children())
    if (LocalName(child) == "PCMSConsignment") held.emplace(NumberOf(child));
  std::vector<std::string> leftOut;
  for (pugi::xml_node child : other.PCMSManifest().children()) {
    if (LocalName(child) != "PCMSConsignment") continue;
    if (!held.emplace(NumberOf(child)).second) {
      leftOut.emplace_back(NumberOf(child));
      continue;
    }
    target.append_copy(child);
  }
  return leftOut;
}

std::string Document::FileText() const {
  std::string out;
  // About 2 KB a consignment: one allocation for a day's file instead of many.
  out.reserve(1024 + ConsignmentCount() * 2560);
  out += "<?xml version=\"1.0\" encoding=\"utf-8\"?>\r\n<PCMS xmlns=\"";
  out += kNamespace;
  out += "\">\r\n";
  xml::AppendIndented(out, root_);
  out += "</PCMS>\r\n";
  return out;
}

DayFileWritten WriteDayFile(const std::string& path, const Document& run) {
  DayFileWritten written;
  constexpr int kMaxBeside = 999;
  for (int n = 1; n <= kMaxBeside; ++n) {
    const std::string candidate = n == 1 ? path : PathBeside(path, n);
    std::error_code ec;
    if (!fs::exists(candidate, ec) && !ec) {
      Store(candidate, run.FileText());
      written.path = candidate;
      return written;
    }
    std::unique_ptr<Document> day;
    if (FileExists(candidate))
      if (auto bytes = ReadFile(candidate)) day = Document::Parse(*bytes);
    if (!day) {
      written.unreadable.push_back(candidate);
      continue;
    }
    written.alreadyInFile = day->AppendConsignmentsOf(run);
    Store(candidate, day->FileText());
    written.path = candidate;
    return written;
  }
  throw Error(err::kPathFileAccess);
}

}  // namespace quendal::pcms
