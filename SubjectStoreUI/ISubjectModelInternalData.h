#pragma once

#include "HostInterface/NMX/IMultiCallbackPostal.h"
#include "HostInterface/NMX/IResult.h"
#include "StoreInterface/IEntryEditor.h"
#include "StoreInterface/SubjectKind.h"

#include <QString>
#include <QVariant>

#include <functional>
#include <memory>
#include <span>
#include <vector>

namespace SubjectStoreUI
{

/// A slot of a character and the subject in it, if there is one.
struct SlotContent
{
  NMX::TSubjectStoreId slot;
  NMX::TSubjectStoreId subject;
  QString name;

  friend bool operator==(const SlotContent&, const SlotContent&) = default;
};

/// The store as the models of subjects see it. An access is open for as long as its object lives; nothing changes while
/// a read access does, so it is closed before any signal is sent. [gui]
class ISubjectModelInternalData
{
public:
  using ReadAccess = std::unique_ptr<const NMX::IStoreReader>;
  using WriteAccess = std::unique_ptr<NMX::IEntryEditor>;

  ISubjectModelInternalData() = default;
  ISubjectModelInternalData(const ISubjectModelInternalData&) = delete;
  ISubjectModelInternalData& operator=(const ISubjectModelInternalData&) = delete;
  virtual ~ISubjectModelInternalData() = default;

  [[nodiscard]] virtual ReadAccess OpenRead() const = 0;
  [[nodiscard]] virtual WriteAccess OpenWrite() = 0;

  /// The subjects of these kinds in ascending order of id; of no kind in particular: all that are to be shown.
  [[nodiscard]] virtual std::vector<NMX::TSubjectStoreId> Subjects(const NMX::IStoreReader& access,
                                                                   std::span<const NMX::ESubjectKind> kinds) const = 0;

  /// What is beneath a subject, in ascending order of id.
  [[nodiscard]] virtual std::vector<NMX::TSubjectStoreId> Children(const NMX::IStoreReader& access,
                                                                   NMX::TSubjectStoreId subject) const = 0;

  /// The slots of a character, in its order.
  [[nodiscard]] virtual std::vector<SlotContent> Slots(const NMX::IStoreReader& access,
                                                       NMX::TSubjectStoreId character) const = 0;

  /// The value of a role; empty when the subject has none.
  [[nodiscard]] virtual QVariant Value(const NMX::IStoreReader& access, NMX::TSubjectStoreId subject,
                                       int role) const = 0;

  /// The type ids of a subject's warnings, in ascending order.
  [[nodiscard]] virtual std::vector<int> Warnings(const NMX::IStoreReader& access,
                                                  NMX::TSubjectStoreId subject) const = 0;

  virtual NMX::IResult SetEnabled(NMX::IEntryEditor& access, NMX::TSubjectStoreId subject, bool enabled) = 0;
  virtual NMX::IResult Rename(NMX::IEntryEditor& access, NMX::TSubjectStoreId subject, const QString& name,
                              NMX::ENotify notify) = 0;

  /// Calls `handler` on the GUI thread after each change of subjects, for as long as the returned object lives.
  [[nodiscard]] virtual std::shared_ptr<const void> OnChange(std::function<void()> handler) = 0;
};

}
