#pragma once

#include "HostInterface/NMX/VShared.h"
#include "HostInterface/NotificationSystem/VMultiCallbackPostal.h"
#include "StandaloneHost/Store/StoreState.h"
#include "StandaloneHost/Store/VEntryEditor.h"
#include "StoreInterface/IStore.h"

#include <array>
#include <memory>
#include <mutex>
#include <shared_mutex>
#include <string>
#include <vector>

namespace Store
{

class IArchive;

/// The standalone host's store: the state in memory, for readers; an archive that makes each commit last, when there is
/// one; and the change callbacks. Readers share the state and never wait for the archive. [any]
class VStore : public NMX::IStore, public NMX::VShared, private ICommitter
{
public:
  /// A store that keeps nothing.
  explicit VStore(DerivationRules rules = {});

  /// Starts from what the archive holds, and derives afresh what follows from it. Throws ArchiveError when it cannot be
  /// read.
  explicit VStore(std::unique_ptr<IArchive> archive, DerivationRules rules = {});
  ~VStore() override;

  [[nodiscard]] std::unique_ptr<const NMX::IStoreReader> Reader() const override;
  [[nodiscard]] std::unique_ptr<NMX::IEntryEditor> Editor() override;
  [[nodiscard]] std::shared_ptr<ChangeCallback> SubjectsChanged(NMX::ESubjectKind kind) override;
  [[nodiscard]] NMX::Subscription OnChange(std::string pattern, std::weak_ptr<NMX::IPostalService> postal,
                                           std::function<void()> handler) override;

  /// True when there is neither a subject nor an application entry that is no setting.
  [[nodiscard]] bool Empty() const;

  /// Why edits cannot be kept at present, for people; empty when the latest could be kept.
  [[nodiscard]] std::string Fault() const;

private:
  using Callback = NotificationSystem::VMultiCallbackPostal<void()>;

  /// A subscription to application entries.
  struct PatternSubscription
  {
    std::string path;
    bool beneath; ///< what lies beneath the path, rather than the path itself
    std::shared_ptr<Callback> callback;
    std::weak_ptr<const void> alive;
  };

  NMX::IResult Commit(ChangeSet&& changes, std::unique_lock<std::mutex> edit) override;
  void BringUpToDate();
  void TellSubjects(unsigned kinds);
  void TellApplication(const std::vector<NMX::EntryPath>& paths);

  const DerivationRules m_rules;
  // Lock order: m_editMutex before m_stateMutex; m_patternMutex alone.
  std::mutex m_editMutex;
  mutable std::shared_mutex m_stateMutex;
  StoreState m_state; // written under both locks, so that the holder of either may read it
  std::unique_ptr<IArchive> m_archive;
  std::array<std::shared_ptr<Callback>, NMX::allSubjectKinds.size()> m_kindCallbacks;
  std::mutex m_patternMutex;
  std::vector<PatternSubscription> m_patterns;
};

}
