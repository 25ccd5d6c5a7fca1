#include "frame/Catalogue.h"

#include <array>

namespace quendal {

// Factories of the built classes, defined beside each class.
std::unique_ptr<Component> MakeStarTrackGenericSCM();
std::unique_ptr<Component> MakeMayneCMLSCM();
std::unique_ptr<Component> MakeTollMYERSCM();
std::unique_ptr<Component> MakeAaEGenericSCM();
std::unique_ptr<Component> MakeAustPostSCM();
std::unique_ptr<Component> MakeAustPostDespatchSCM();
std::unique_ptr<Component> MakeDFESCM();
std::unique_ptr<Component> MakeDFESCMWinPCL();
std::unique_ptr<Component> MakeDFESCMsscc();
std::unique_ptr<Component> MakeSCMnoSSCC();
std::unique_ptr<Component> MakeHunterGenericSCM();
std::unique_ptr<Component> MakeIFSDJsSCM();
std::unique_ptr<Component> MakeIFSAPISCM();
std::unique_ptr<Component> MakeTollGenericSCM();
std::unique_ptr<Component> MakeTollNZSCM();
std::unique_ptr<Component> MakeMayneGenericSCM();
std::unique_ptr<Component> MakeStarTrackCMLSCM();
std::unique_ptr<Component> MakeTNTCMLSCM();
std::unique_ptr<Component> MakeMayneCMLSCMLSCP();
std::unique_ptr<Component> MakeStarTrackDJsSCM();
std::unique_ptr<Component> MakeTollDJsSCM();
std::unique_ptr<Component> MakeMayneDJsSCM();
std::unique_ptr<Component> MakeStarTrackSpotlightSCM();
std::unique_ptr<Component> MakeStarTrackBLSCM();
std::unique_ptr<Component> MakeStarTrackBigWSCM();
std::unique_ptr<Component> MakeTollBigWSCM();
std::unique_ptr<Component> MakeStarTrackBigWERSCM();
std::unique_ptr<Component> MakeStarTrackHSSCM();
std::unique_ptr<Component> MakeStarTrackRebelSCM();
std::unique_ptr<Component> MakeeParcelManifestxml();
std::unique_ptr<Component> MakeeParcelManifestEODxml();
std::unique_ptr<Component> MakeStarTrackDAcln();
std::unique_ptr<Component> MakeStarTrackManifestcln();
std::unique_ptr<Component> MakeStarTrackEODcln();
std::unique_ptr<Component> MakeTNTDAet11();
std::unique_ptr<Component> MakeVicExpressDAcln();
std::unique_ptr<Component> MakeAlliedExpressSEDIP();
std::unique_ptr<Component> MakeVLODAcsv();
std::unique_ptr<Component> MakeTNTTransactionDAcsv();
std::unique_ptr<Component> MakeDFEDAxml();
std::unique_ptr<Component> MakeDFEDAManifestxml();
std::unique_ptr<Component> MakeMayneDAcl();
std::unique_ptr<Component> MakeIpecDA1250();
std::unique_ptr<Component> MakeIpecDA1256();
std::unique_ptr<Component> MakeHunterDA();
std::unique_ptr<Component> MakeAaEES610();
std::unique_ptr<Component> MakeIpecDA1250Manifest();
std::unique_ptr<Component> MakeIpecDA1250EOD();

namespace {

using enum Family;

constexpr std::array kCatalogue = {
    CatalogueEntry{"clsStarTrackDAcln", Consignment, "StarTrack",
                   "CLN consignment file, dangerous goods declaration", MakeStarTrackDAcln},
    CatalogueEntry{"clsTNTDAet11", Consignment, "TNT", "ET11 file", MakeTNTDAet11},
    CatalogueEntry{"clsStarTrackCMLSCM", Label, "StarTrack", "CML", MakeStarTrackCMLSCM},
    CatalogueEntry{"clsTNTCMLSCM", Label, "TNT", "CML", MakeTNTCMLSCM},
    CatalogueEntry{"clsStarTrackDJsSCM", Label, "StarTrack", "David Jones", MakeStarTrackDJsSCM},
    CatalogueEntry{"clsMayneDAcl", Consignment, "Mayne", "CL file", MakeMayneDAcl},
    CatalogueEntry{"clsMayneCMLSCMLSCP", Label, "Mayne", "CML", MakeMayneCMLSCMLSCP},
    CatalogueEntry{"clsMayneDJsSCM", Label, "Mayne", "David Jones", MakeMayneDJsSCM},
    CatalogueEntry{"clsIpecDA1250", Consignment, "Ipec", "1250 file", MakeIpecDA1250},
    CatalogueEntry{"clsStarTrackBLSCM", Label, "StarTrack", "BL", MakeStarTrackBLSCM},
    CatalogueEntry{"clsIpecDA1256", Consignment, "Ipec", "1256 file", MakeIpecDA1256},
    CatalogueEntry{"clsVicExpressDAcln", Consignment, "VicExpress", "consignment file (\".CTN\")",
                   MakeVicExpressDAcln},
    CatalogueEntry{"clsVLODAcsv", Consignment, "VLO", "map-driven CSV file", MakeVLODAcsv},
    CatalogueEntry{"clsMayneCMLSCM", Label, "Mayne", "CML", MakeMayneCMLSCM},
    CatalogueEntry{"clsMayneGenericSCM", Label, "Mayne", "any retailer", MakeMayneGenericSCM},
    CatalogueEntry{"clsStarTrackGenericSCM", Label, "StarTrack", "any retailer (reference class)",
                   MakeStarTrackGenericSCM},
    CatalogueEntry{"clsTollGenericSCM", Label, "Toll", "any retailer", MakeTollGenericSCM},
    CatalogueEntry{"clsAaEGenericSCM", Label, "AaE", "any retailer", MakeAaEGenericSCM},
    CatalogueEntry{"clsAaEES610", Rows, "AaE", "ES610 file", MakeAaEES610},
    CatalogueEntry{"clsDFEDAxml", Consignment, "DFE",
                   "XML despatch advice, dangerous goods declaration", MakeDFEDAxml},
    CatalogueEntry{"clsDFESCM", Label, "DFE", "any retailer", MakeDFESCM},
    CatalogueEntry{"clsHunterDA", Consignment, "Hunter", "despatch file", MakeHunterDA},
    CatalogueEntry{"clsHunterGenericSCM", Label, "Hunter", "any retailer", MakeHunterGenericSCM},
    CatalogueEntry{"clsStarTrackBigWSCM", Label, "StarTrack", "BigW", MakeStarTrackBigWSCM},
    CatalogueEntry{"clsTollBigWSCM", Label, "Toll", "BigW", MakeTollBigWSCM},
    CatalogueEntry{"clsStarTrackHSSCM", Label, "StarTrack", "HS", MakeStarTrackHSSCM},
    CatalogueEntry{"clsTollMYERSCM", Label, "Toll", "Myer", MakeTollMYERSCM},
    CatalogueEntry{"clsTNTTransactionDAcsv", Consignment, "TNT", "map-driven CSV transaction file",
                   MakeTNTTransactionDAcsv},
    CatalogueEntry{"clsAlliedExpressSEDIP", Consignment, "Allied Express", "SEDIP file",
                   MakeAlliedExpressSEDIP},
    CatalogueEntry{"clsStarTrackRebelSCM", Label, "StarTrack", "Rebel", MakeStarTrackRebelSCM},
    CatalogueEntry{"clsIFSAPISCM", Label, "IFS", "any retailer", MakeIFSAPISCM},
    CatalogueEntry{"clsIFSDJsSCM", Label, "IFS", "David Jones", MakeIFSDJsSCM},
    CatalogueEntry{"clsAustPostSCM", Label, "Australia Post", "article-id labels",
                   MakeAustPostSCM},
    CatalogueEntry{"clseParcelManifestxml", Rows, "Australia Post eParcel", "PCMS manifest",
                   MakeeParcelManifestxml},
    CatalogueEntry{"clsSCMnoSSCC", Label, "any", "label without SSCC", MakeSCMnoSSCC},
    CatalogueEntry{"clsStarTrackSpotlightSCM", Label, "StarTrack", "Spotlight", MakeStarTrackSpotlightSCM},
    CatalogueEntry{"clsStarTrackBigWERSCM", Label, "StarTrack", "BigW", MakeStarTrackBigWERSCM},
    CatalogueEntry{"clsDFESCMWinPCL", Label, "DFE", "drawn label", MakeDFESCMWinPCL},
    CatalogueEntry{"clsDFESCMsscc", Label, "DFE", "SSCC label", MakeDFESCMsscc},
    CatalogueEntry{"clsStarTrackManifestcln", Rows, "StarTrack",
                   "manifest CLN, consolidated manifest, dangerous goods", MakeStarTrackManifestcln},
    CatalogueEntry{"clsDFEDAManifestxml", Rows, "DFE",
                   "manifest XML, consolidated manifest, dangerous goods",
                   MakeDFEDAManifestxml},
    CatalogueEntry{"clsIpecDA1250Manifest", Rows, "Ipec", "1250 manifest, consolidated manifest",
                   MakeIpecDA1250Manifest},
    CatalogueEntry{"clsStarTrackEODcln", Rows, "StarTrack",
                   "end-of-day CLN, consolidated manifest, dangerous goods", MakeStarTrackEODcln},
    CatalogueEntry{"clsIpecDA1250EOD", Rows, "Ipec", "1250 end of day, consolidated manifest",
                   MakeIpecDA1250EOD},
    CatalogueEntry{"clsTollNZSCM", Label, "Toll", "NZ", MakeTollNZSCM},
    CatalogueEntry{"clsAustPostDespatchSCM", Label, "Australia Post", "despatch article-id labels",
                   MakeAustPostDespatchSCM},
    CatalogueEntry{"clseParcelManifestEODxml", Rows, "Australia Post eParcel", "PCMS end of day",
                   MakeeParcelManifestEODxml},
    CatalogueEntry{"clsTollDJsSCM", Label, "Toll", "David Jones", MakeTollDJsSCM},
};
static_assert(kCatalogue.size() == 48);

constexpr std::string_view kPrefix = "Quendal.";

}  // namespace

std::string_view FamilyName(Family family) {
  switch (family) {
    case Label:
      return "label";
    case Consignment:
      return "consignment";
    case Rows:
      return "rows";
  }
  return "";
}

std::span<const CatalogueEntry> Catalogue() { return kCatalogue; }

const CatalogueEntry* FindClass(std::string_view identifier) {
  if (identifier.starts_with(kPrefix)) identifier.remove_prefix(kPrefix.size());
  for (const auto& entry : kCatalogue)
    if (entry.className == identifier) return &entry;
  return nullptr;
}

Created CreateObject(std::string_view identifier) {
  if (!identifier.starts_with(kPrefix))
    return {nullptr, "\"" + std::string(identifier) + "\" is not a Quendal identifier (Quendal.clsName)"};
  const CatalogueEntry* entry = FindClass(identifier);
  if (!entry) return {nullptr, "no class " + std::string(identifier) + " in the catalogue"};
  if (!entry->factory)
    return {nullptr, std::string(identifier) + " is in the catalogue but not built yet"};
  return {entry->factory(), {}};
}

}  // namespace quendal
