#include "tests/support/MemoryHost.h"

#include "platform/Clock.h"

namespace quendal::test {

namespace {

// Finds the first object of `list` whose member `key` equals `value` as text
// (Null matches Null), copies its members into `target` and reports success.
template <class T>
bool LoadInto(MemoryObject<T>& target, const std::vector<std::shared_ptr<MemoryObject<T>>>& list,
              std::initializer_list<std::string_view> keys) {
  for (const auto& candidate : list) {
    if (candidate.get() == &target) continue;
    bool match = true;
    for (std::string_view key : keys) {
      const Var a = target.Get(key);
      const Var b = candidate->Get(key);
      if (a.IsNull() != b.IsNull() || a.Text() != b.Text()) match = false;
    }
    if (match) {
      target.fields = candidate->fields;
      return true;
    }
  }
  return false;
}

}  // namespace

void AddMethods(MemoryHost& host, MemoryObject<host::Log>& log) {
  log.methods["Clear"] = [&log](std::span<const Var>) {
    log.fields.clear();
    return Var();
  };
  log.methods["Save"] = [&host, &log](std::span<const Var>) {
    const auto id = static_cast<std::int32_t>(host.logs.size() + 1);
    log.fields["LogId"] = Var(id);
    log.fields["ID"] = Var(id);
    host.logs.emplace_back(log.fields.begin(), log.fields.end());
    return Var();
  };
}

void AddMethods(MemoryHost& host, MemoryObject<host::Receiver>& r) {
  r.methods["Load"] = [&host, &r](std::span<const Var>) {
    return Var(LoadInto(r, host.receivers, {"Code", "PartnerId"}));
  };
  r.methods["Refresh"] = [](std::span<const Var>) { return Var(); };
}

void AddMethods(MemoryHost& host, MemoryObject<host::Vendor>& o) {
  o.methods["Load"] = [&host, &o](std::span<const Var>) {
    return Var(LoadInto(o, host.vendors, {"VendorId"}));
  };
}

void AddMethods(MemoryHost& host, MemoryObject<host::Carrier>& o) {
  o.methods["Load"] = [&host, &o](std::span<const Var>) {
    return Var(LoadInto(o, host.carriers, {"CarrierId"}));
  };
}

void AddMethods(MemoryHost& host, MemoryObject<host::Partner>& o) {
  o.methods["Load"] = [&host, &o](std::span<const Var>) {
    return Var(LoadInto(o, host.partners, {"PartnerId"}));
  };
}

void AddMethods(MemoryHost& host, MemoryObject<host::EDIDocument>& o) {
  o.methods["Load"] = [&host, &o](std::span<const Var>) {
    return Var(LoadInto(o, host.ediDocuments, {"ID"}));
  };
}

void AddMethods(MemoryHost& host, MemoryObject<host::Order>& o) {
  o.methods["Load"] = [&host, &o](std::span<const Var>) {
    return Var(LoadInto(o, host.orders, {"OrderNo"}));
  };
}

void AddMethods(MemoryHost& host, MemoryObject<host::Pack>& p) {
  p.methods["Load"] = [&host, &p](std::span<const Var>) {
    return Var(LoadInto(p, host.packs, {"PackId"}));
  };
  p.methods["SetCubic"] = [&p](std::span<const Var> args) {
    p.fields["Cubic"] = args.empty() ? Var() : args[0];
    return Var();
  };
  p.methods["Update"] = [](std::span<const Var>) { return Var(); };
  p.methods["GetAttribute"] = [&p](std::span<const Var> args) {
    return args.empty() ? Var() : p.Get("Attribute:" + args[0].Text());
  };
}

void AddMethods(MemoryHost&, MemoryObject<host::ConNote>& c) {
  c.methods["Update"] = [&c](std::span<const Var> args) {
    if (!args.empty()) c.fields["Status"] = args[0];
    c.fields["Updated"] = Var(true);
    return Var();
  };
}

void AddMethods(MemoryHost& host, MemoryObject<host::Manifest>& m) {
  m.fields["ManifestId"] = Var(0);
  // The consignments that bear this manifest's id, in the order they were made.
  m.getters["ConNotes"] = [&host, &m] {
    auto list = std::make_shared<MemoryCollection<host::ConNotes>>();
    const double id = m.Get("ManifestId").NumberOr(0);
    for (const auto& c : host.conNotes)
      if (id != 0 && c->Get("ManifestId").NumberOr(0) == id) list->items.push_back(c);
    return Var(list);
  };
  m.methods["Save"] = [&host, &m](std::span<const Var>) {
    if (host.manifestSaveFails) return Var(false);
    if (m.Get("ManifestId").Whole() == 0) {
      m.fields["ManifestId"] = Var(host.nextManifestId++);
      m.fields["ManifestNumber"] = Var(host.nextManifestNumber++);
    }
    return Var(true);
  };
}

// True when the consignment's vendor and carrier carry the given ids or
// codes (compared as text), as a row run passes ids and the summary codes.
static bool SameVendorAndCarrier(MemoryObject<host::ConNote>& c, const Var& vendorId,
                                 const Var& carrierId) {
  auto vendor = host::Object::As<host::Vendor>(c.Get("Vendor"));
  auto carrier = host::Object::As<host::Carrier>(c.Get("Carrier"));
  const bool sameVendor = vendor && (vendor->VendorId().Text() == vendorId.Text() ||
                                     vendor->VendorCode().Text() == vendorId.Text());
  const bool sameCarrier = carrier && (carrier->CarrierId().Text() == carrierId.Text() ||
                                       carrier->CarrierCode().Text() == carrierId.Text());
  return sameVendor && sameCarrier;
}

MemoryHost::MemoryHost() : self_(std::shared_ptr<host::Library>(this, [](host::Library*) {})) {
  system = Make<host::System>({{"PrinterLanguage", "VPCLII"},
                               {"PrinterBatchMode", 1},
                               {"SpoolerMode", 2},
                               {"UserName", "packer1"}});
  // The consignments made so far, in order: those awaiting a manifest
  // (ManifestId Null or 0), and those of a date range (end excluded).
  system->methods["GetManifestConNotes"] = [this](std::span<const Var> args) {
    auto list = std::make_shared<MemoryCollection<host::ConNotes>>();
    for (const auto& c : conNotes)
      if (c->Get("ManifestId").NumberOr(0) == 0 && args.size() == 2 &&
          SameVendorAndCarrier(*c, args[0], args[1]))
        list->items.push_back(c);
    return Var(list);
  };
  system->methods["GetConNotesByDate"] = [this](std::span<const Var> args) {
    auto list = std::make_shared<MemoryCollection<host::ConNotes>>();
    if (args.size() != 4) return Var(list);
    const DateTime begin = args[0].Date();
    const DateTime end = args[1].Date();
    for (const auto& c : conNotes) {
      const Var date = c->Get("ConNoteDate");
      if (date.IsNull() || !SameVendorAndCarrier(*c, args[2], args[3])) continue;
      if (begin <= date.Date() && date.Date() < end) list->items.push_back(c);
    }
    return Var(list);
  };
  // The packs of the pack's order among those made so far (a pack without
  // an order has none), and the packs of a consignment.
  system->methods["OrderPackCount"] = [this](std::span<const Var> args) {
    const auto pack = args.empty() ? nullptr : args[0].Object();
    if (!pack) throw Error(err::kObjectRequired);
    const auto order = pack->Get("Order").Object();
    std::int32_t count = 0;
    for (const auto& p : packs) count += order && p->Get("Order").Object() == order ? 1 : 0;
    return Var(count);
  };
  system->methods["ConNotePackCount"] = [](std::span<const Var> args) {
    const auto conNote = args.empty() ? nullptr : args[0].Object();
    if (!conNote) throw Error(err::kObjectRequired);
    const auto list = host::Object::As<host::PackList>(conNote->Get("Packs"));
    return Var(list ? list->Count() : 0);
  };
  previous_ = host::RegisterLibrary(self_);
}

MemoryHost::~MemoryHost() {
  // Attach links consignments and packs both ways; undo that so neither outlives the host.
  for (const auto& conNote : conNotes) conNote->fields.clear();
  for (const auto& pack : packs) pack->fields.clear();
  host::RegisterLibrary(previous_);
}

std::vector<std::string> MemoryHost::LogMessages() const {
  std::vector<std::string> out;
  for (const auto& entry : logs) {
    auto it = entry.find("Message");
    out.push_back(it == entry.end() ? std::string() : it->second.Text());
  }
  return out;
}

void MemoryHost::Attach(const std::shared_ptr<MemoryObject<host::ConNote>>& conNote,
                        const std::vector<std::shared_ptr<MemoryObject<host::Pack>>>& packList) {
  auto list = std::make_shared<MemoryCollection<host::PackList>>();
  for (const auto& pack : packList) {
    list->items.push_back(pack);
    pack->fields["ConNote"] = Var(conNote);
  }
  conNote->fields["Packs"] = Var(list);
}

Ref<host::Log> MemoryHost::NewLog() { return Make<host::Log>(); }
Ref<host::Receiver> MemoryHost::NewReceiver() {
  auto r = std::make_shared<MemoryObject<host::Receiver>>("Receiver");
  AddMethods(*this, *r);
  return r;
}
Ref<host::Vendor> MemoryHost::NewVendor() {
  auto o = std::make_shared<MemoryObject<host::Vendor>>("Vendor");
  AddMethods(*this, *o);
  return o;
}
Ref<host::Carrier> MemoryHost::NewCarrier() {
  auto o = std::make_shared<MemoryObject<host::Carrier>>("Carrier");
  AddMethods(*this, *o);
  return o;
}
Ref<host::Partner> MemoryHost::NewPartner() {
  auto o = std::make_shared<MemoryObject<host::Partner>>("Partner");
  AddMethods(*this, *o);
  return o;
}
Ref<host::EDIDocument> MemoryHost::NewEDIDocument() {
  auto o = std::make_shared<MemoryObject<host::EDIDocument>>("EDIDocument");
  AddMethods(*this, *o);
  return o;
}
Ref<host::Manifest> MemoryHost::NewManifest() { return Make<host::Manifest>(); }
Ref<host::ConNotes> MemoryHost::NewConNotes() {
  return std::make_shared<MemoryCollection<host::ConNotes>>();
}
Ref<host::Order> MemoryHost::NewOrder() {
  auto o = std::make_shared<MemoryObject<host::Order>>("Order");
  AddMethods(*this, *o);
  return o;
}
Ref<host::Pack> MemoryHost::NewPack() {
  auto o = std::make_shared<MemoryObject<host::Pack>>("Pack");
  AddMethods(*this, *o);
  return o;
}

}  // namespace quendal::test
