#include "frame/ComponentBase.h"

#include "frame/VB.h"
#include "platform/Clock.h"
#include "platform/Machine.h"

namespace quendal {

ComponentBase::ComponentBase(std::string_view className)
    : identifier_("Quendal." + std::string(className)),
      module_("c" + std::string(className.starts_with("cls") ? className.substr(3) : className)) {}

long ComponentBase::LogLevel(long) const { return 0; }

void ComponentBase::WriteLog(long errorNumber, std::string_view procedure,
                             std::string_view message) {
  Procedure proc = Guard("Sub WriteLog");
  Ref<host::Log> log;
  if (!proc([&] {
        log = host::CurrentLibrary().NewLog();
        log->Clear();
      }))
    return;
  if (!proc([&] { log->SetLogDate(Now()); })) return;
  // An object asked to log before it was given a System (a consignment
  // class's OpenMapFile or Load) still logs, without a user name.
  if (!proc([&] {
        if (system_) log->SetUserName(system_->UserName());
      }))
    return;
  if (!proc([&] {
        if (auto name = ComputerName()) log->SetComputerName(*name);
      }))
    return;
  if (!proc([&] {
        log->SetSource(identifier_);
        log->SetProcedure(std::string(procedure));
        log->SetErrorNumber(static_cast<std::int32_t>(errorNumber));
        log->SetLevel(static_cast<std::int32_t>(LogLevel(errorNumber)));
        log->SetMessage(std::string(message));
      }))
    return;
  if (!proc([&] { log->Save(); })) return;
  proc([&] { lastLogId_ = static_cast<std::int32_t>(log->LogId().Whole()); });
}

Ref<host::Log> ComponentBase::BoundLog() const {
  Ref<host::Log> log = host::CurrentLibrary().NewLog();
  log->SetID(lastLogId_);
  return log;
}

Ref<host::Log> Lifecycle::Log() {
  Ref<host::Log> result;
  Procedure proc = Guard("Property (Get) Log");
  proc([&] { result = BoundLog(); });
  return result;
}

void Lifecycle::Cancel() {
  Procedure proc = Guard("Sub Cancel");
  proc([&] { CloseOpenFile(); });
}

}  // namespace quendal
