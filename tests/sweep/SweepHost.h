// A host that wraps another one and watches every member the library reads.
//
// Each object the library reaches is handed out behind a proxy of the same
// host type. The proxy passes every read on and notes which member of which
// type was read; when a member is the sweep's target it answers in its place
// (Null for a scalar, Nothing for an object or a collection, or a given text).
// So one clean run lists the members a class reads, and a run per member
// replays the class with that member alone answered differently.
#pragma once

#include <compare>
#include <functional>
#include <map>
#include <memory>
#include <optional>
#include <set>
#include <string>
#include <vector>

#include "frame/host/Host.h"

namespace quendal::test {

// A member of a host type: "Pack"/"Weight", a collection's "PackList"/"Count",
// or a method's result "Pack"/"GetAttribute()".
struct MemberKey {
  std::string type;
  std::string member;
  auto operator<=>(const MemberKey&) const = default;
  std::string Name() const { return type + "." + member; }
};

class Sweep {
 public:
  // What a read answers when it is the target: given the real value, the answer.
  using Answer = std::function<Var(const Var& real)>;

  // Answers Null in place of the target (Nothing for an object member).
  static Var Null(const Var&) { return Var(); }

  // Aims the sweep at one member (or none, for a recording run).
  void Aim(std::optional<MemberKey> target, Answer answer = Null);
  // How many reads the target answered since the last Aim.
  int Answered() const { return answered_; }

  // Every member read since construction, with the kind of value it first
  // gave that was not Null (Var::Type::Null when it was always Null).
  const std::map<MemberKey, Var::Type>& Read() const { return read_; }

  // Texts that start with `from` are answered starting with `to` instead
  // (the data's folders, moved to a run's own folder).
  void MoveRoot(std::string from, std::string to);

  // The object behind a proxy (and the other way round), by identity:
  // one proxy per host object, so that the library's comparisons hold.
  std::shared_ptr<host::Object> Wrap(const std::shared_ptr<host::Object>& object);
  Var Wrap(const Var& value);
  static Var Unwrap(const Var& value);

  template <class T>
  Ref<T> Wrap(const Ref<T>& object) {
    return host::Object::As<T>(Wrap(Var(std::static_pointer_cast<host::Object>(object.ptr()))));
  }

  // Called by the proxies for each value read.
  Var OnRead(const std::string& type, std::string_view member, Var real);

  // The proxies made, released with the sweep.
  void Forget() { proxies_.clear(); }
  ~Sweep() { Forget(); }

 private:
  std::map<MemberKey, Var::Type> read_;
  std::optional<MemberKey> target_;
  Answer answer_ = Null;
  int answered_ = 0;
  std::string from_, to_;
  std::map<const host::Object*, std::shared_ptr<host::Object>> proxies_;
};

// The host library's creatable objects, made by another library and handed
// out behind the sweep's proxies.
class SweepLibrary : public host::Library {
 public:
  SweepLibrary(std::shared_ptr<host::Library> inner, Sweep& sweep)
      : inner_(std::move(inner)), sweep_(sweep) {}
  Ref<host::Log> NewLog() override { return sweep_.Wrap(inner_->NewLog()); }
  Ref<host::Receiver> NewReceiver() override { return sweep_.Wrap(inner_->NewReceiver()); }
  Ref<host::Vendor> NewVendor() override { return sweep_.Wrap(inner_->NewVendor()); }
  Ref<host::Carrier> NewCarrier() override { return sweep_.Wrap(inner_->NewCarrier()); }
  Ref<host::Partner> NewPartner() override { return sweep_.Wrap(inner_->NewPartner()); }
  Ref<host::EDIDocument> NewEDIDocument() override { return sweep_.Wrap(inner_->NewEDIDocument()); }
  Ref<host::Manifest> NewManifest() override { return sweep_.Wrap(inner_->NewManifest()); }
  Ref<host::ConNotes> NewConNotes() override { return sweep_.Wrap(inner_->NewConNotes()); }
  Ref<host::Order> NewOrder() override { return sweep_.Wrap(inner_->NewOrder()); }
  Ref<host::Pack> NewPack() override { return sweep_.Wrap(inner_->NewPack()); }

 private:
  std::shared_ptr<host::Library> inner_;
  Sweep& sweep_;
};

}  // namespace quendal::test
