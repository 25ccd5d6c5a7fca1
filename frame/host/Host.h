// The host object model as the library sees it.
//
// Every host object implements one small late-bound core (Get, Set, Call by
// member name), the way an automation object is reached; the typed classes
// below give each object its members by name, so library code reads
// `pack->Carrier()->Options()` and a host implements four functions per
// object instead of one per member. Scalars come back as Var (any may be
// Null); object members come back as Ref, which raises "Object variable not
// set" (91) when dereferenced while it holds Nothing; collections are never
// Nothing.
#pragma once

#include <cstdint>
#include <initializer_list>
#include <iterator>
#include <memory>
#include <span>
#include <string>
#include <string_view>
#include <vector>

#include "frame/Error.h"
#include "frame/Var.h"

namespace quendal {

// A host object reference that may be Nothing.
template <class T>
class Ref {
 public:
  Ref() = default;
  Ref(std::nullptr_t) {}
  Ref(std::shared_ptr<T> p) : p_(std::move(p)) {}
  template <class U>
    requires std::convertible_to<U*, T*>
  Ref(const Ref<U>& other) : p_(other.ptr()) {}
  template <class U>
    requires std::convertible_to<U*, T*>
  Ref(std::shared_ptr<U> p) : p_(std::move(p)) {}

  T* operator->() const {
    if (!p_) throw Error(err::kObjectNotSet);
    return p_.get();
  }
  T& operator*() const { return *operator->(); }
  bool IsNothing() const { return !p_; }
  explicit operator bool() const { return p_ != nullptr; }
  const std::shared_ptr<T>& ptr() const { return p_; }
  bool operator==(const Ref& other) const { return p_ == other.p_; }

 private:
  std::shared_ptr<T> p_;
};

namespace host {

class Object : public std::enable_shared_from_this<Object> {
 public:
  virtual ~Object() = default;
  // The host type name ("Pack", "ConNote", ...).
  virtual std::string_view TypeName() const = 0;
  // A property: a scalar, an object (Var holding it; Null for Nothing) or a collection.
  virtual Var Get(std::string_view member) = 0;
  virtual void Set(std::string_view member, const Var& value) = 0;
  virtual Var Call(std::string_view method, std::span<const Var> args) = 0;

 protected:
  Var Call(std::string_view method, std::initializer_list<Var> args) {
    return Call(method, std::span<const Var>(args.begin(), args.size()));
  }
  template <class T>
  Ref<T> GetRef(std::string_view member) {
    return As<T>(Get(member));
  }

 public:
  // The object a Var holds, as type T; Nothing for Null; "Type mismatch" for anything else.
  template <class T>
  static Ref<T> As(const Var& v) {
    if (v.IsNull()) return {};
    auto typed = std::dynamic_pointer_cast<T>(v.Object());
    if (!typed) throw Error(err::kTypeMismatch);
    return Ref<T>(std::move(typed));
  }
};

// A host collection: Count, Item(1..Count), iteration in order.
class CollectionBase : public Object {
 public:
  std::int32_t Count() { return static_cast<std::int32_t>(Get("Count").Whole()); }
};

template <class T>
class Collection : public CollectionBase {
 public:
  Ref<T> Item(std::int32_t index) { return As<T>(Call("Item", {Var(index)})); }

  class iterator {
   public:
    using iterator_category = std::input_iterator_tag;
    using value_type = Ref<T>;
    using difference_type = std::ptrdiff_t;
    iterator(Collection* c, std::int32_t i) : c_(c), i_(i) {}
    Ref<T> operator*() const { return c_->Item(i_); }
    iterator& operator++() {
      ++i_;
      return *this;
    }
    bool operator==(const iterator& o) const { return i_ == o.i_; }

   private:
    Collection* c_;
    std::int32_t i_;
  };
  iterator begin() { return iterator(this, 1); }
  iterator end() { return iterator(this, Count() + 1); }
};

class System;
class ConNote;
class ASN;
class Pack;
class PackLine;
class Product;
class Order;
class PSlipLine;
class Customer;
class Address;
class Despatch;
class Carton;
class Receiver;
class Vendor;
class Carrier;
class Partner;
class Job;
class EDIDocument;
class Manifest;
class Log;

using PackList = Collection<Pack>;
using PackLines = Collection<PackLine>;
using SlipLines = Collection<PSlipLine>;
using Orders = Collection<Order>;

class ConNotes : public Collection<ConNote> {
 public:
  void Add(const Ref<ConNote>& item, const std::string& key);
};

#define QUENDAL_SCALAR(name) \
  Var name() { return Get(#name); }
#define QUENDAL_SETTABLE(name)                     \
  Var name() { return Get(#name); }                \
  void Set##name(const Var& v) { Set(#name, v); }
#define QUENDAL_OBJECT(type, name) \
  Ref<type> name() { return GetRef<type>(#name); }

class System : public Object {
 public:
  QUENDAL_SCALAR(PrinterLanguage)
  QUENDAL_SCALAR(PrinterBatchMode)
  QUENDAL_SCALAR(SpoolerMode)
  QUENDAL_SCALAR(PDTType)
  QUENDAL_SCALAR(UserName)
  QUENDAL_SCALAR(DocumentPrinter)
  QUENDAL_SETTABLE(LastError)
  Ref<ConNotes> GetManifestConNotes(const Var& vendorId, const Var& carrierId) {
    return As<ConNotes>(Call("GetManifestConNotes", {vendorId, carrierId}));
  }
  Ref<ConNotes> GetConNotesByDate(const Var& begin, const Var& end, const Var& vendorId,
                                  const Var& carrierId) {
    return As<ConNotes>(Call("GetConNotesByDate", {begin, end, vendorId, carrierId}));
  }
  std::int32_t OrderPackCount(const Ref<Pack>& pack);
  std::int32_t ConNotePackCount(const Ref<ConNote>& conNote);
};

class ConNote : public Object {
 public:
  QUENDAL_SCALAR(ConNoteId)
  QUENDAL_SCALAR(ConNoteNo)
  QUENDAL_SCALAR(ConNoteDate)
  QUENDAL_SCALAR(Service)
  QUENDAL_SCALAR(ServiceLevel)
  QUENDAL_SCALAR(CarrierPrefix)
  QUENDAL_SCALAR(Weight)
  QUENDAL_SCALAR(Volume)
  QUENDAL_SCALAR(Cube)
  QUENDAL_SETTABLE(CubicTotal)
  QUENDAL_SETTABLE(CubicOverride)
  QUENDAL_SCALAR(DeliveryInstructions)
  QUENDAL_SCALAR(BillOfLading)
  QUENDAL_SCALAR(BookingNo)
  QUENDAL_SCALAR(ScheduledDate)
  QUENDAL_SCALAR(OrderStatusFlag)
  QUENDAL_SCALAR(PartnerCode)
  QUENDAL_SCALAR(DeliveryLocation)
  QUENDAL_SETTABLE(ManifestId)
  QUENDAL_SCALAR(Status)
  void Update() { Call("Update", {}); }
  void Update(const Var& statusCode) { Call("Update", {statusCode}); }
  QUENDAL_OBJECT(PackList, Packs)
  QUENDAL_OBJECT(host::Orders, Orders)
  QUENDAL_OBJECT(host::Carrier, Carrier)
  QUENDAL_OBJECT(host::Receiver, Receiver)
  QUENDAL_OBJECT(host::Vendor, Vendor)
  QUENDAL_OBJECT(host::Partner, Partner)
};

class ASN : public Object {
 public:
  QUENDAL_SCALAR(ID)
  QUENDAL_SCALAR(ASNNo)
  QUENDAL_SCALAR(ASNNumber)
  QUENDAL_SCALAR(ASNDate)
  QUENDAL_SCALAR(OriginCode)
};

class Pack : public Object {
 public:
  QUENDAL_SETTABLE(PackId)
  QUENDAL_SCALAR(SSCC)
  QUENDAL_SCALAR(StoreCode)
  QUENDAL_SCALAR(PartnerId)
  QUENDAL_SCALAR(SalesOrderNo)
  QUENDAL_SCALAR(PackType)
  QUENDAL_SCALAR(Weight)
  QUENDAL_SCALAR(ASNId)
  QUENDAL_SCALAR(CarrierId)
  QUENDAL_SCALAR(BuyStoreCode)
  QUENDAL_SCALAR(ItemCount)
  QUENDAL_SCALAR(Cubic)
  void SetCubic(const Var& value) { Call("SetCubic", {value}); }
  void Update() { Call("Update", {}); }
  Var GetAttribute(const Var& key) { return Call("GetAttribute", {key}); }
  bool Load() { return Call("Load", {}).Flag(); }
  QUENDAL_OBJECT(host::ConNote, ConNote)
  QUENDAL_OBJECT(host::ASN, ASN)
  QUENDAL_OBJECT(host::Carrier, Carrier)
  QUENDAL_OBJECT(host::Vendor, Vendor)
  QUENDAL_OBJECT(host::Receiver, Receiver)
  QUENDAL_OBJECT(host::Receiver, ShipTo)
  QUENDAL_OBJECT(host::Order, Order)
  QUENDAL_OBJECT(host::Despatch, Despatch)
  QUENDAL_OBJECT(host::Carton, Carton)
  QUENDAL_OBJECT(host::Partner, Partner)
  QUENDAL_OBJECT(PackLines, Lines)
};

class PackLine : public Object {
 public:
  QUENDAL_OBJECT(host::Product, Product)
  QUENDAL_SCALAR(Qty)
  QUENDAL_OBJECT(host::Pack, Pack)
};

class Product : public Object {
 public:
  QUENDAL_SCALAR(IsDangerous)
  QUENDAL_SCALAR(DGClass)
  QUENDAL_SCALAR(UnitWeight)
  QUENDAL_SCALAR(Text1)
  QUENDAL_SCALAR(Text2)
  QUENDAL_SCALAR(Text3)
  QUENDAL_SCALAR(HasComponents)
  QUENDAL_SCALAR(ComponentItem)
  QUENDAL_SCALAR(ComponentQty)
};

class Order : public Object {
 public:
  QUENDAL_SETTABLE(OrderNo)
  QUENDAL_SCALAR(StoreNo)
  QUENDAL_SCALAR(VendorCode)
  bool Load() { return Call("Load", {}).Flag(); }
  QUENDAL_OBJECT(Address, DeliveryAddress)
  QUENDAL_OBJECT(host::Receiver, Receiver)
  QUENDAL_OBJECT(host::SlipLines, SlipLines)
};

class PSlipLine : public Object {
 public:
  QUENDAL_SCALAR(LineNo)
  QUENDAL_SCALAR(APN)
  QUENDAL_SCALAR(Qty)
  QUENDAL_SCALAR(QtyPacked)
  QUENDAL_OBJECT(host::Product, Product)
  QUENDAL_OBJECT(host::Order, Order)
  QUENDAL_OBJECT(host::Despatch, Despatch)
  QUENDAL_OBJECT(host::Customer, Customer)
};

class Customer : public Object {
 public:
  QUENDAL_SCALAR(Name)
  QUENDAL_OBJECT(host::Address, Address)
};

class Address : public Object {
 public:
  QUENDAL_SCALAR(Name)
  QUENDAL_SCALAR(Line1)
  QUENDAL_SCALAR(Line2)
  QUENDAL_SCALAR(Suburb)
  QUENDAL_SCALAR(State)
  QUENDAL_SCALAR(Postcode)
  QUENDAL_SCALAR(Phone)
  QUENDAL_SCALAR(Email)
  QUENDAL_SCALAR(Reference)
  QUENDAL_SCALAR(Company)
};

class Despatch : public Object {
 public:
  QUENDAL_SCALAR(DespatchNo)
  QUENDAL_SCALAR(NotBefore)
  QUENDAL_SCALAR(NotAfter)
  QUENDAL_SCALAR(OrderDate)
  QUENDAL_SCALAR(CompanyCode)
  QUENDAL_SCALAR(SupplierNo)
  QUENDAL_SCALAR(DeliveryText1)
  QUENDAL_SCALAR(DeliveryText2)
  QUENDAL_SCALAR(DeliveryText3)
  QUENDAL_SCALAR(ZoneDeptA)
  QUENDAL_SCALAR(ZoneDeptB)
  QUENDAL_SCALAR(ZoneDeptC)
  QUENDAL_OBJECT(host::Vendor, Vendor)
  QUENDAL_OBJECT(host::Receiver, Receiver)
};

class Carton : public Object {
 public:
  QUENDAL_SCALAR(Code)
  QUENDAL_SCALAR(Weight)
  QUENDAL_SCALAR(Length)
  QUENDAL_SCALAR(Width)
  QUENDAL_SCALAR(Height)
};

class Receiver : public Object {
 public:
  QUENDAL_SCALAR(Name)
  QUENDAL_SCALAR(AddressLine1)
  QUENDAL_SCALAR(AddressLine2)
  QUENDAL_SCALAR(Suburb)
  QUENDAL_SCALAR(State)
  QUENDAL_SCALAR(Postcode)
  QUENDAL_SCALAR(City)
  QUENDAL_SCALAR(CountryCode)
  QUENDAL_SCALAR(StoreCode)
  QUENDAL_SCALAR(CarrierServiceCode)
  QUENDAL_SCALAR(Extra1)
  QUENDAL_SCALAR(Extra2)
  QUENDAL_SCALAR(CarrierId)
  QUENDAL_OBJECT(host::Carrier, Carrier)
  QUENDAL_SETTABLE(Code)
  QUENDAL_SETTABLE(PartnerId)
  bool Load() { return Call("Load", {}).Flag(); }
  void Refresh() { Call("Refresh", {}); }
};

class Vendor : public Object {
 public:
  QUENDAL_SETTABLE(VendorId)
  bool Load() { return Call("Load", {}).Flag(); }
  QUENDAL_SCALAR(VendorCode)
  QUENDAL_SCALAR(Name)
  QUENDAL_SCALAR(AddressLine1)
  QUENDAL_SCALAR(AddressLine2)
  QUENDAL_SCALAR(AddressLine3)
  QUENDAL_SCALAR(Suburb)
  QUENDAL_SCALAR(State)
  QUENDAL_SCALAR(Postcode)
  QUENDAL_SCALAR(Country)
};

class Carrier : public Object {
 public:
  QUENDAL_SETTABLE(CarrierId)
  bool Load() { return Call("Load", {}).Flag(); }
  QUENDAL_SCALAR(CarrierCode)
  QUENDAL_SCALAR(Name)
  QUENDAL_SCALAR(Options)
  QUENDAL_SCALAR(NotifyOptions)
  QUENDAL_SCALAR(AccountRef)
  QUENDAL_SCALAR(AccountNumber)
  QUENDAL_SCALAR(FileFolder)
};

class Partner : public Object {
 public:
  QUENDAL_SETTABLE(PartnerId)
  bool Load() { return Call("Load", {}).Flag(); }
  QUENDAL_SCALAR(Code)
  QUENDAL_SCALAR(ShortName)
  QUENDAL_SCALAR(SupplierNo)
};

class Job : public Object {
 public:
  QUENDAL_SCALAR(Reference)
  QUENDAL_SCALAR(Customer)
};

class EDIDocument : public Object {
 public:
  QUENDAL_SETTABLE(ID)
  bool Load() { return Call("Load", {}).Flag(); }
  QUENDAL_SCALAR(VendorId)
  QUENDAL_SCALAR(PartnerId)
  QUENDAL_SCALAR(CarrierId)
  QUENDAL_SCALAR(OutputFolder)
};

class Manifest : public Object {
 public:
  QUENDAL_SCALAR(ManifestId)
  QUENDAL_SCALAR(ManifestNumber)
  QUENDAL_SETTABLE(VendorId)
  QUENDAL_SETTABLE(CarrierId)
  QUENDAL_SETTABLE(ManifestDate)
  bool Save() { return Call("Save", {}).Flag(); }
  QUENDAL_OBJECT(host::ConNotes, ConNotes)
};

class Log : public Object {
 public:
  void Clear() { Call("Clear", {}); }
  QUENDAL_SETTABLE(LogDate)
  QUENDAL_SETTABLE(UserName)
  QUENDAL_SETTABLE(ComputerName)
  QUENDAL_SETTABLE(Source)
  QUENDAL_SETTABLE(Procedure)
  QUENDAL_SETTABLE(ErrorNumber)
  QUENDAL_SETTABLE(Level)
  QUENDAL_SETTABLE(Message)
  void Save() { Call("Save", {}); }
  QUENDAL_SCALAR(LogId)
  QUENDAL_SETTABLE(ID)
};

#undef QUENDAL_SCALAR
#undef QUENDAL_SETTABLE
#undef QUENDAL_OBJECT

inline void ConNotes::Add(const Ref<ConNote>& item, const std::string& key) {
  Call("Add", {Var(item.ptr()), Var(key)});
}
inline std::int32_t System::OrderPackCount(const Ref<Pack>& pack) {
  return static_cast<std::int32_t>(Call("OrderPackCount", {Var(pack.ptr())}).Whole());
}
inline std::int32_t System::ConNotePackCount(const Ref<ConNote>& conNote) {
  return static_cast<std::int32_t>(Call("ConNotePackCount", {Var(conNote.ptr())}).Whole());
}

// The host library's creatable objects: what the library makes for its own
// use (log entries, receiver look-ups, the records of a row run). A host
// registers one for the process, as an automation host registers its
// classes.
class Library {
 public:
  virtual ~Library() = default;
  virtual Ref<host::Log> NewLog() = 0;
  virtual Ref<host::Receiver> NewReceiver() = 0;
  virtual Ref<host::Vendor> NewVendor() = 0;
  virtual Ref<host::Carrier> NewCarrier() = 0;
  virtual Ref<host::Partner> NewPartner() = 0;
  virtual Ref<host::EDIDocument> NewEDIDocument() = 0;
  virtual Ref<host::Manifest> NewManifest() = 0;
  virtual Ref<host::ConNotes> NewConNotes() = 0;
  virtual Ref<host::Order> NewOrder() = 0;
  virtual Ref<host::Pack> NewPack() = 0;
};

// Installs the host library for the process and returns the previous one.
std::shared_ptr<Library> RegisterLibrary(std::shared_ptr<Library> library);
// The registered library; raises 429 ("ActiveX component can't create object") when none is.
Library& CurrentLibrary();

}  // namespace host
}  // namespace quendal
