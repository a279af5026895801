#include "StandaloneHost/SmartObjects/AutoPatternManagement.h"

#include "HostInterface/NMX/GlobalLog.h"
#include "StoreInterface/EntryPaths.h"

#include <exception>
#include <utility>

namespace SmartObjects
{

namespace
{

bool Enabled(const NMX::IStore& store)
{
  const auto reader = store.Reader();
  const NMX::Value* value = reader->FindApplicationEntry(NMX::Paths::AutoPatternManagement());
  const bool* enabled = value != nullptr ? std::get_if<bool>(value) : nullptr;
  return enabled != nullptr && *enabled;
}

/// An assignment that finds nothing to do changes nothing, so that it does not call itself for ever.
void AssignIfEnabled(const NMX::IStore& store, ISmartObjectControls& controls)
{
  try
  {
    if (!Enabled(store))
      return;
    if (const NMX::IResult assigned = controls.AssignOptimalPatterns(); assigned.Failed())
      NMX::Log(NMX::subjectStoreLog, NMX::ESeverity::Info, "Active marker patterns were not assigned: %1%",
               assigned.Name());
  }
  catch (const std::exception& failure)
  {
    NMX::Log(NMX::subjectStoreLog, NMX::ESeverity::Error, "Active marker patterns were not assigned: %1%",
             failure.what());
  }
  catch (...)
  {
    NMX::Log(NMX::subjectStoreLog, NMX::ESeverity::Error, "Active marker patterns were not assigned.");
  }
}

struct Management
{
  std::shared_ptr<NMX::IPostalService> postal;
  NMX::Subscription objects;
  NMX::Subscription setting;
};

}

std::shared_ptr<const void> ManagePatterns(const std::shared_ptr<NMX::IStore>& store,
                                           const std::shared_ptr<ISmartObjectControls>& controls,
                                           const std::shared_ptr<NMX::IPostalService>& postal)
{
  const auto assign = [store, controls] { AssignIfEnabled(*store, *controls); };
  auto management = std::make_shared<Management>();
  management->postal = postal;
  management->objects = store->SubjectsChanged(NMX::ESubjectKind::SmartObjects)->Subscribe(postal, assign);
  management->setting = store->OnChange(std::string(NMX::Paths::AutoPatternManagement().Text()), postal, assign);
  postal->Post(assign);
  return management;
}

}
