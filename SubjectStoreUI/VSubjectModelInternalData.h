#pragma once

#include "HostInterface/NMX/IPostalService.h"
#include "StoreInterface/IStore.h"
#include "SubjectStoreUI/ISubjectModelInternalData.h"

namespace SubjectStoreUI
{

/// The host's store as the models of subjects see it. [gui]
class VSubjectModelInternalData final : public ISubjectModelInternalData
{
public:
  /// Changes are told on `gui`, which runs its tasks on the GUI thread.
  VSubjectModelInternalData(std::shared_ptr<NMX::IStore> store, std::weak_ptr<NMX::IPostalService> gui);

  [[nodiscard]] ReadAccess OpenRead() const override;
  [[nodiscard]] WriteAccess OpenWrite() override;
  [[nodiscard]] std::vector<NMX::TSubjectStoreId> Subjects(const NMX::IStoreReader& access,
                                                           std::span<const NMX::ESubjectKind> kinds) const override;
  [[nodiscard]] std::vector<NMX::TSubjectStoreId> Children(const NMX::IStoreReader& access,
                                                           NMX::TSubjectStoreId subject) const override;
  [[nodiscard]] std::vector<SlotContent> Slots(const NMX::IStoreReader& access,
                                               NMX::TSubjectStoreId character) const override;
  [[nodiscard]] QVariant Value(const NMX::IStoreReader& access, NMX::TSubjectStoreId subject, int role) const override;
  [[nodiscard]] std::vector<int> Warnings(const NMX::IStoreReader& access, NMX::TSubjectStoreId subject) const override;
  NMX::IResult SetEnabled(NMX::IEntryEditor& access, NMX::TSubjectStoreId subject, bool enabled) override;
  NMX::IResult Rename(NMX::IEntryEditor& access, NMX::TSubjectStoreId subject, const QString& name,
                      NMX::ENotify notify) override;
  [[nodiscard]] std::shared_ptr<const void> OnChange(std::function<void()> handler) override;

private:
  const std::shared_ptr<NMX::IStore> m_store;
  const std::weak_ptr<NMX::IPostalService> m_gui;
};

}
