#include "carrierfiles/cAlliedExpressSEDIP.h"

#include "frame/VB.h"
#include "frame/host/Read.h"
#include "platform/Clock.h"
#include "platform/DirectorySpooler.h"
#include "platform/FileSystem.h"

namespace quendal {

using host::Read;

namespace {

constexpr std::string_view kOpenFile = "Open carrier message file";

// The carrier reads a transmission per file; one that is taken is never
// written into, so a consignment goes to the next second whose name is free.
constexpr int kSecondsToTry = 3600;

// A value as a field of a record: its plain text, without the separators
// and line breaks that would split the field or the record.
std::string Field(const Var& value) {
  std::string text = value.Text();
  for (char& c : text)
    if (c == '|' || static_cast<unsigned char>(c) < 0x20 || c == 0x7F) c = ' ';
  return text;
}

std::string Field(const Var& date, std::string_view mask) { return Field(Var(Format(date, mask))); }

}  // namespace

clsAlliedExpressSEDIP::clsAlliedExpressSEDIP() : ConsignmentWriter("clsAlliedExpressSEDIP") {}

void clsAlliedExpressSEDIP::Compile(const Ref<host::ConNote>& objConNote,
                                    const Ref<host::ASN>& objASN,
                                    const Ref<host::PackList>& lstPacks) {
  Procedure proc = Guard("Sub Process");
  Ref<host::Carrier> carrier;
  std::string folder;
  if (!proc([&] {
        carrier = objConNote->Carrier();
        folder = Read(carrier, &host::Carrier::FileFolder).Text();
        // The folder must be there: a name made from no folder would land elsewhere.
        if (FolderExists(folder)) return true;
        LogLine(0, kOpenFile, "Invalid folder " + folder);
        return false;
      }))
    return;

  const DateTime now = Now();
  std::int32_t packCount = 0;
  if (!proc([&] { packCount = lstPacks ? lstPacks->Count() : 0; })) return;
  std::string file;
  if (!proc([&] {
        const Ref<host::Receiver> r = objConNote->Receiver();
        const Ref<host::Vendor> v = objConNote->Vendor();
        const std::string asnNo = Field(Read(objASN, &host::ASN::ASNNo));
        std::string text =
            CarrierLine("#SOT") + CarrierLine("#SOH") +
            CarrierLine("#City=" + Field(Read(r, &host::Receiver::City))) +
            CarrierLine("#Version=SEDIP 1.6") +
            CarrierLine("#Account_Code=" + Field(Read(carrier, &host::Carrier::AccountNumber))) +
            CarrierLine("#Company_Name=" + Field(Read(v, &host::Vendor::Name))) +
            CarrierLine("#Transmission_Date=" + Format(Var(now), "DD/MM/YYYY HH:MM:SS")) +
            CarrierLine("#Num_Record=" + std::to_string(packCount + 2)) + CarrierLine("#SOD");
        // Consignment: receiver's state and city, weight, cube and service.
        text += CarrierLine(
            "|H|" + Field(objConNote->ConNoteNo()) + "|" + asnNo + "|" +
            Field(Read(r, &host::Receiver::State)) + "|" + Field(Read(r, &host::Receiver::City)) +
            "|" + Field(objConNote->Weight()) + "|" + Field(objConNote->Cube()) + "|" +
            Field(objConNote->Service()) + "||||||" + "Allied Express" + "|" + asnNo + "||||");
        // Pickup: when, and the sender's address.
        const Var date = objConNote->ConNoteDate();
        text += CarrierLine("|P|" + Field(date, "dd/mm/yyyy") + "|" + Field(date, "hh:mm:ss") +
                            "|" + Field(Read(v, &host::Vendor::Postcode)) + "|" +
                            Field(Read(v, &host::Vendor::Name)) + "|" +
                            Field(Read(v, &host::Vendor::AddressLine2)) + "|" +
                            Field(Read(v, &host::Vendor::AddressLine3)) + "|" +
                            Field(Read(v, &host::Vendor::State)) + "|||||||" +
                            Field(Read(v, &host::Vendor::AddressLine1)) + "|");
        // Delivery, per pack: when, where, to whom, and the pack's SSCC.
        const Var scheduled = objConNote->ScheduledDate();
        const std::string delivery =
            "|D|" + Field(scheduled, "dd/mm/yyyy") + "|" + Field(scheduled, "hh:mm:ss") + "||" +
            Field(Read(r, &host::Receiver::Postcode)) + "|" +
            Field(Read(objConNote->Partner(), &host::Partner::Code)) + "|" +
            Field(Read(r, &host::Receiver::AddressLine2)) + "|" +
            Field(Read(r, &host::Receiver::Suburb)) + "|" + Field(Read(r, &host::Receiver::State)) +
            "||||" + Field(Read(r, &host::Receiver::Extra1)) + "|" +
            Field(Read(r, &host::Receiver::Extra2)) + "|";
        for (std::int32_t i = 1; i <= packCount; ++i)
          text += CarrierLine(delivery + Field(Read(lstPacks->Item(i), &host::Pack::SSCC)) +
                              "|1||||||||||||||");
        text += CarrierLine("#EOD") + CarrierLine("#EOT");
        file = std::move(text);
      }))
    return;

  // "al_" + account + date and time of the transmission, in the folder.
  std::string base = folder;
  while (!base.empty() && base.back() == kFolderSeparator) base.pop_back();
  const std::string prefix = base + kFolderSeparator + "al_" +
                             SafeNamePart(LCase(Read(carrier, &host::Carrier::AccountNumber).Text())) +
                             "_";
  proc([&] {
    std::string path;
    for (int second = 0; second < kSecondsToTry; ++second) {
      const DateTime at = now.AddSeconds(second);
      path = prefix + Format(Var(at), "YYYYMMDD") + "_" + Format(Var(at), "HHMMSS") + ".dat";
      switch (WriteNewFile(path, file)) {
        case NewFile::Written:
          return;
        case NewFile::Exists:
          continue;
        case NewFile::Failed:
          break;
      }
      break;
    }
    LogLine(err::kPathFileAccess, kOpenFile, "Cannot open file " + path);
  });
}

std::unique_ptr<Component> MakeAlliedExpressSEDIP() {
  return std::make_unique<clsAlliedExpressSEDIP>();
}

}  // namespace quendal
