// An in-memory host for tests: every host object is a bag of members, and
// a few lines build packs, consignments and what they reach.
//
//   MemoryHost host;                       // registered for the test's life
//   auto carrier = host.Make<host::Carrier>({{"Name", "Southern Road Express"}});
//   auto pack = host.Make<host::Pack>({{"SSCC", "00093123450000000012"}, {"Carrier", carrier}});
#pragma once

#include <deque>
#include <functional>
#include <map>
#include <memory>
#include <string>
#include <string_view>
#include <unordered_map>
#include <utility>
#include <vector>

#include "frame/FailSafe.h"
#include "frame/host/Host.h"

namespace quendal::test {

using Fields = std::vector<std::pair<std::string, Var>>;
using Method = std::function<Var(std::span<const Var>)>;

// Hashes member names, so that a look-up by string_view builds no string.
struct NameHash {
  using is_transparent = void;
  std::size_t operator()(std::string_view name) const noexcept {
    return std::hash<std::string_view>{}(name);
  }
};
// An object's members by name.
using Members = std::unordered_map<std::string, Var, NameHash, std::equal_to<>>;

// A host object whose members are a map; methods are callbacks.
template <class T>
class MemoryObject : public T {
 public:
  explicit MemoryObject(std::string_view type) : type_(type) {}
  std::string_view TypeName() const override { return type_; }
  Var Get(std::string_view member) override {
    if (!getters.empty())
      if (auto getter = getters.find(member); getter != getters.end()) return getter->second();
    auto it = fields.find(member);
    return it == fields.end() ? Var() : it->second;
  }
  void Set(std::string_view member, const Var& value) override {
    fields[std::string(member)] = value;
  }
  Var Call(std::string_view method, std::span<const Var> args) override {
    auto it = methods.find(method);
    if (it == methods.end()) throw Error(err::kNoSuchMember);
    return it->second(args);
  }
  using T::Call;

  Members fields;
  std::map<std::string, Method, std::less<>> methods;
  // Members the host works out when they are read (a manifest's consignments).
  std::map<std::string, std::function<Var()>, std::less<>> getters;

 private:
  std::string type_;
};

// A host collection over a list of objects.
template <class C>
class MemoryCollection : public C {
 public:
  std::string_view TypeName() const override { return "Collection"; }
  Var Get(std::string_view member) override {
    if (member == "Count") return Var(static_cast<std::int32_t>(items.size()));
    throw Error(err::kNoSuchMember);
  }
  void Set(std::string_view, const Var&) override { throw Error(err::kNoSuchMember); }
  Var Call(std::string_view method, std::span<const Var> args) override {
    if (method == "Item" && args.size() == 1) {
      const auto i = args[0].Whole();
      if (i < 1 || i > static_cast<std::int64_t>(items.size())) throw Error(err::kSubscript);
      return Var(items[static_cast<std::size_t>(i - 1)]);
    }
    if (method == "Add" && !args.empty()) {
      items.push_back(args[0].Object());
      return {};
    }
    throw Error(err::kNoSuchMember);
  }
  std::vector<std::shared_ptr<host::Object>> items;
};

class MemoryHost : public host::Library {
 public:
  MemoryHost();
  ~MemoryHost() override;
  MemoryHost(const MemoryHost&) = delete;
  MemoryHost& operator=(const MemoryHost&) = delete;

  // A new object of type T with the given members (object members as Var holding the object).
  template <class T>
  std::shared_ptr<MemoryObject<T>> Make(const Fields& fields = {});

  template <class T>
  static std::shared_ptr<MemoryCollection<host::Collection<T>>> List(
      std::initializer_list<std::shared_ptr<T>> items) {
    auto list = std::make_shared<MemoryCollection<host::Collection<T>>>();
    for (const auto& item : items) list->items.push_back(item);
    return list;
  }
  template <class T>
  static std::shared_ptr<MemoryCollection<host::Collection<T>>> List(
      const std::vector<std::shared_ptr<T>>& items) {
    auto list = std::make_shared<MemoryCollection<host::Collection<T>>>();
    for (const auto& item : items) list->items.push_back(item);
    return list;
  }
  // Sets conNote.Packs to the packs and each pack's ConNote to the consignment.
  static void Attach(const std::shared_ptr<MemoryObject<host::ConNote>>& conNote,
                     const std::vector<std::shared_ptr<MemoryObject<host::Pack>>>& packs);

  std::shared_ptr<MemoryObject<host::System>> system;
  // Saved log entries, in order; entry i has LogId i + 1.
  std::vector<std::map<std::string, Var, std::less<>>> logs;
  // What the look-ups by key find: Receiver.Load, Vendor.Load and the like.
  std::vector<std::shared_ptr<MemoryObject<host::Receiver>>> receivers;
  std::vector<std::shared_ptr<MemoryObject<host::Vendor>>> vendors;
  std::vector<std::shared_ptr<MemoryObject<host::Carrier>>> carriers;
  std::vector<std::shared_ptr<MemoryObject<host::Partner>>> partners;
  std::vector<std::shared_ptr<MemoryObject<host::EDIDocument>>> ediDocuments;
  std::vector<std::shared_ptr<MemoryObject<host::Order>>> orders;
  std::vector<std::shared_ptr<MemoryObject<host::Pack>>> packs;
  std::vector<std::shared_ptr<MemoryObject<host::ConNote>>> conNotes;
  std::int32_t nextManifestId = 1;
  std::int32_t nextManifestNumber = 1000;
  bool manifestSaveFails = false;

  // The messages of the saved log entries, in order.
  std::vector<std::string> LogMessages() const;

  Ref<host::Log> NewLog() override;
  Ref<host::Receiver> NewReceiver() override;
  Ref<host::Vendor> NewVendor() override;
  Ref<host::Carrier> NewCarrier() override;
  Ref<host::Partner> NewPartner() override;
  Ref<host::EDIDocument> NewEDIDocument() override;
  Ref<host::Manifest> NewManifest() override;
  Ref<host::ConNotes> NewConNotes() override;
  Ref<host::Order> NewOrder() override;
  Ref<host::Pack> NewPack() override;

 private:
  std::shared_ptr<host::Library> previous_;
  std::shared_ptr<host::Library> self_;
};

// An error prompt that gives the queued answers in turn (then Abort) and keeps what it was shown.
class ScriptedPrompt : public ErrorPrompt {
 public:
  explicit ScriptedPrompt(std::deque<Answer> answers = {}) : answers(std::move(answers)) {}
  Answer Ask(const std::string& title, const std::string& message) override {
    titles.push_back(title);
    messages.push_back(message);
    if (answers.empty()) return Answer::Abort;
    const Answer a = answers.front();
    answers.pop_front();
    return a;
  }
  std::deque<Answer> answers;
  std::vector<std::string> titles;
  std::vector<std::string> messages;
};

// Installs a prompt for the life of the object.
class PromptScope {
 public:
  explicit PromptScope(std::shared_ptr<ErrorPrompt> prompt)
      : previous_(SetErrorPrompt(std::move(prompt))) {}
  ~PromptScope() { SetErrorPrompt(previous_); }

 private:
  std::shared_ptr<ErrorPrompt> previous_;
};

template <class T>
constexpr std::string_view HostTypeName() {
  using namespace host;
  if constexpr (std::is_same_v<T, System>) return "System";
  else if constexpr (std::is_same_v<T, ConNote>) return "ConNote";
  else if constexpr (std::is_same_v<T, ASN>) return "ASN";
  else if constexpr (std::is_same_v<T, Pack>) return "Pack";
  else if constexpr (std::is_same_v<T, PackLine>) return "PackLine";
  else if constexpr (std::is_same_v<T, Product>) return "Product";
  else if constexpr (std::is_same_v<T, Order>) return "Order";
  else if constexpr (std::is_same_v<T, PSlipLine>) return "PSlipLine";
  else if constexpr (std::is_same_v<T, Customer>) return "Customer";
  else if constexpr (std::is_same_v<T, Address>) return "Address";
  else if constexpr (std::is_same_v<T, Despatch>) return "Despatch";
  else if constexpr (std::is_same_v<T, Carton>) return "Carton";
  else if constexpr (std::is_same_v<T, Receiver>) return "Receiver";
  else if constexpr (std::is_same_v<T, Vendor>) return "Vendor";
  else if constexpr (std::is_same_v<T, Carrier>) return "Carrier";
  else if constexpr (std::is_same_v<T, Partner>) return "Partner";
  else if constexpr (std::is_same_v<T, Job>) return "Job";
  else if constexpr (std::is_same_v<T, EDIDocument>) return "EDIDocument";
  else if constexpr (std::is_same_v<T, Manifest>) return "Manifest";
  else if constexpr (std::is_same_v<T, Log>) return "Log";
  else return "Object";
}

// Gives an object of type T its methods (Load, Save, Update and the like).
void AddMethods(MemoryHost& host, MemoryObject<host::Log>& object);
void AddMethods(MemoryHost& host, MemoryObject<host::Receiver>& object);
void AddMethods(MemoryHost& host, MemoryObject<host::Vendor>& object);
void AddMethods(MemoryHost& host, MemoryObject<host::Carrier>& object);
void AddMethods(MemoryHost& host, MemoryObject<host::Partner>& object);
void AddMethods(MemoryHost& host, MemoryObject<host::EDIDocument>& object);
void AddMethods(MemoryHost& host, MemoryObject<host::Order>& object);
void AddMethods(MemoryHost& host, MemoryObject<host::Pack>& object);
void AddMethods(MemoryHost& host, MemoryObject<host::ConNote>& object);
void AddMethods(MemoryHost& host, MemoryObject<host::Manifest>& object);
template <class T>
void AddMethods(MemoryHost&, MemoryObject<T>&) {}

template <class T>
std::shared_ptr<MemoryObject<T>> MemoryHost::Make(const Fields& fields) {
  auto object = std::make_shared<MemoryObject<T>>(HostTypeName<T>());
  for (const auto& [name, value] : fields) object->fields[name] = value;
  AddMethods(*this, *object);
  if constexpr (std::is_same_v<T, host::Receiver>) receivers.push_back(object);
  if constexpr (std::is_same_v<T, host::Vendor>) vendors.push_back(object);
  if constexpr (std::is_same_v<T, host::Carrier>) carriers.push_back(object);
  if constexpr (std::is_same_v<T, host::Partner>) partners.push_back(object);
  if constexpr (std::is_same_v<T, host::EDIDocument>) ediDocuments.push_back(object);
  if constexpr (std::is_same_v<T, host::Order>) orders.push_back(object);
  if constexpr (std::is_same_v<T, host::Pack>) packs.push_back(object);
  if constexpr (std::is_same_v<T, host::ConNote>) conNotes.push_back(object);
  return object;
}

}  // namespace quendal::test
