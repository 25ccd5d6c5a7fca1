#include "tests/sweep/SweepHost.h"

#include <vector>

namespace quendal::test {

namespace {

// Known to the sweep as a proxy, so that values handed back to the host are unwrapped.
class ProxyBase {
 public:
  virtual ~ProxyBase() = default;
  virtual const std::shared_ptr<host::Object>& Inner() const = 0;
};

// A host object of type T that passes everything on to the object it wraps.
template <class T>
class Proxy final : public T, public ProxyBase {
 public:
  Proxy(std::shared_ptr<host::Object> inner, Sweep& sweep, std::string label)
      : inner_(std::move(inner)), sweep_(sweep), label_(std::move(label)) {}
  const std::shared_ptr<host::Object>& Inner() const override { return inner_; }
  std::string_view TypeName() const override { return inner_->TypeName(); }
  Var Get(std::string_view member) override {
    return sweep_.OnRead(label_, member, inner_->Get(member));
  }
  void Set(std::string_view member, const Var& value) override {
    inner_->Set(member, Sweep::Unwrap(value));
  }
  Var Call(std::string_view method, std::span<const Var> args) override {
    std::vector<Var> plain;
    plain.reserve(args.size());
    for (const Var& a : args) plain.push_back(Sweep::Unwrap(a));
    Var result = inner_->Call(method, std::span<const Var>(plain));
    return sweep_.OnRead(label_, std::string(method) + "()", std::move(result));
  }

 private:
  std::shared_ptr<host::Object> inner_;
  Sweep& sweep_;
  std::string label_;
};

template <class T>
bool TryProxy(const std::shared_ptr<host::Object>& object, Sweep& sweep, std::string_view label,
              std::shared_ptr<host::Object>& out) {
  if (out || !dynamic_cast<T*>(object.get())) return false;
  out = std::make_shared<Proxy<T>>(
      object, sweep, label.empty() ? std::string(object->TypeName()) : std::string(label));
  return true;
}

}  // namespace

void Sweep::Aim(std::optional<MemberKey> target, Answer answer) {
  target_ = std::move(target);
  answer_ = std::move(answer);
  answered_ = 0;
}

void Sweep::MoveRoot(std::string from, std::string to) {
  from_ = std::move(from);
  to_ = std::move(to);
}

Var Sweep::OnRead(const std::string& type, std::string_view member, Var real) {
  MemberKey key{type, std::string(member)};
  const Var::Type kind = real.IsNull() ? Var::Type::Null : real.type();
  auto [it, added] = read_.try_emplace(key, kind);
  if (!added && it->second == Var::Type::Null) it->second = kind;
  if (!from_.empty() && real.type() == Var::Type::Text) {
    const std::string text = real.Text();
    if (text.starts_with(from_)) real = Var(to_ + text.substr(from_.size()));
  }
  if (target_ && *target_ == key) {
    ++answered_;
    return Wrap(answer_(real));
  }
  return Wrap(real);
}

Var Sweep::Wrap(const Var& value) {
  if (!value.IsObject()) return value;
  return Var(Wrap(value.Object()));
}

std::shared_ptr<host::Object> Sweep::Wrap(const std::shared_ptr<host::Object>& object) {
  if (!object || dynamic_cast<ProxyBase*>(object.get())) return object;
  if (auto it = proxies_.find(object.get()); it != proxies_.end()) return it->second;
  using namespace host;
  std::shared_ptr<Object> p;
  // Collections first, each under a name of its own: they share one type name.
  TryProxy<ConNotes>(object, *this, "ConNotes", p) ||
      TryProxy<PackList>(object, *this, "PackList", p) ||
      TryProxy<PackLines>(object, *this, "PackLines", p) ||
      TryProxy<SlipLines>(object, *this, "SlipLines", p) ||
      TryProxy<Orders>(object, *this, "Orders", p) ||
      TryProxy<Collection<ConNote>>(object, *this, "ConNoteList", p) ||
      TryProxy<System>(object, *this, {}, p) || TryProxy<ConNote>(object, *this, {}, p) ||
      TryProxy<ASN>(object, *this, {}, p) || TryProxy<Pack>(object, *this, {}, p) ||
      TryProxy<PackLine>(object, *this, {}, p) || TryProxy<Product>(object, *this, {}, p) ||
      TryProxy<Order>(object, *this, {}, p) || TryProxy<PSlipLine>(object, *this, {}, p) ||
      TryProxy<Customer>(object, *this, {}, p) || TryProxy<Address>(object, *this, {}, p) ||
      TryProxy<Despatch>(object, *this, {}, p) || TryProxy<Carton>(object, *this, {}, p) ||
      TryProxy<Receiver>(object, *this, {}, p) || TryProxy<Vendor>(object, *this, {}, p) ||
      TryProxy<Carrier>(object, *this, {}, p) || TryProxy<Partner>(object, *this, {}, p) ||
      TryProxy<Job>(object, *this, {}, p) || TryProxy<EDIDocument>(object, *this, {}, p) ||
      TryProxy<Manifest>(object, *this, {}, p) || TryProxy<Log>(object, *this, {}, p);
  if (!p) return object;  // a type the sweep does not know passes unwatched
  proxies_.emplace(object.get(), p);
  return p;
}

Var Sweep::Unwrap(const Var& value) {
  if (!value.IsObject()) return value;
  if (auto* proxy = dynamic_cast<ProxyBase*>(value.Object().get())) return Var(proxy->Inner());
  return value;
}

}  // namespace quendal::test
