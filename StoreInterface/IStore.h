#pragma once

#include "HostInterface/NMX/IMultiCallbackPostal.h"
#include "HostInterface/NMX/IResult.h"
#include "StoreInterface/EntryPath.h"
#include "StoreInterface/IEntryEditor.h"
#include "StoreInterface/IStoreReader.h"
#include "StoreInterface/SubjectKind.h"

#include <functional>
#include <memory>
#include <string>

namespace NMX
{

/// The host's store: the subjects of the capture stage and the application's settings. [any]
class IStore
{
public:
  using ChangeCallback = IMultiCallbackPostal<void()>;

  IStore() = default;
  IStore(const IStore&) = delete;
  IStore& operator=(const IStore&) = delete;
  virtual ~IStore() = default;

  /// Opens read access: nothing changes while it lives, so keep it briefly, and neither open nor commit an edit on a
  /// thread that still holds one: such an edit is refused with `Conflict`.
  [[nodiscard]] virtual std::unique_ptr<const IStoreReader> Reader() const = 0;

  /// Opens edit access, a transaction. There is one at a time; others wait for it.
  [[nodiscard]] virtual std::unique_ptr<IEntryEditor> Editor() = 0;

  /// Raised after each commit that changed, added or removed subjects of that kind.
  [[nodiscard]] virtual std::shared_ptr<ChangeCallback> SubjectsChanged(ESubjectKind kind) = 0;

  /// Calls `handler` on `postal` after each commit that changed an application entry that the pattern names. A
  /// pattern is a path, or a path followed by "/*" for all that lies beneath it.
  [[nodiscard]] virtual Subscription OnChange(std::string pattern, std::weak_ptr<IPostalService> postal,
                                              std::function<void()> handler) = 0;
};

}
