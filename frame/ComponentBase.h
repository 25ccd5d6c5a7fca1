// What every class keeps for the shared services: its identifier and
// module name, the System object it was given, and the id of the last log
// entry it wrote. Consignment and row classes add the lifecycle members.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>

#include "frame/Component.h"
#include "frame/FailSafe.h"

namespace quendal {

class ComponentBase : public virtual Component {
 public:
  std::string ClassName() const override { return identifier_; }

 protected:
  // className as in the catalogue, "clsStarTrackGenericSCM".
  explicit ComponentBase(std::string_view className);

  // "cStarTrackGenericSCM": the module name of the error reports.
  const std::string& ModuleName() const { return module_; }
  // procedureName must outlive the procedure (a literal, as it always is).
  Procedure Guard(std::string_view procedureName) const {
    return Procedure(Procedure::Lasting{}, module_, procedureName);
  }

  // Writes one entry into the host's log (under its own guard) and keeps
  // its id as the last log id. The entry's level is LogLevel(errorNumber).
  void WriteLog(long errorNumber, std::string_view procedure, std::string_view message);
  // Label classes log at level 0; consignment classes at the error number.
  virtual long LogLevel(long errorNumber) const;

  // A new host Log bound to the last entry this object wrote (ID 0 before any).
  Ref<host::Log> BoundLog() const;

  std::int32_t LastLogId() const { return lastLogId_; }

  Ref<host::System> system_;

 private:
  std::string identifier_;
  std::string module_;
  std::int32_t lastLogId_ = 0;
};

// PROCESSALL, Log, Cancel and Term of the consignment and row classes.
class Lifecycle : public virtual LifecycleInterface, public ComponentBase {
 public:
  bool PROCESSALL() const override { return processAll_; }
  void SetPROCESSALL(bool value) override { processAll_ = value; }
  Ref<host::Log> Log() override;
  void Cancel() override;
  bool Term() override { return true; }

 protected:
  using ComponentBase::ComponentBase;
  // Closes the file the object holds open; Cancel calls it.
  virtual void CloseOpenFile() {}

  bool processAll_ = false;
};

}  // namespace quendal
