// The operations of VSubjectStoreQml on smart objects, their patterns and clusters, and on characters and their slots.

#include "HostInterface/ICharacterControls.h"
#include "HostInterface/ISmartObjectControls.h"
#include "RunaCorePluginSubjectStore/Subjects/ClusterEdits.h"
#include "RunaCorePluginSubjectStore/Subjects/SlotAssignment.h"
#include "StoreUI/ResultSentence.h"
#include "SubjectStoreUI/PanelBackend.h"
#include "SubjectStoreUI/VSubjectStoreQml.h"

namespace SubjectStoreUI
{

using NMX::EResult;
using NMX::IResult;
using NMX::TSubjectStoreId;
using RunaCorePluginInterface::IPanelServices;

namespace
{

/// One of the host's operations on each of some characters.
VResultGadget EditCharacters(const PanelBackend& backend, const QVariantList& characters,
                             IResult (ICharacterControls::*operation)(NMX::IEntryEditor&, TSubjectStoreId))
{
  const auto controls = backend.Get(&IPanelServices::CharacterControls);
  if (!controls)
    return IResult(EResult::NotAvailable);
  return backend.EditEach(ToIds(characters),
                          [&](NMX::IEntryEditor& editor, TSubjectStoreId id)
                          {
                            const IResult is = Subjects::MustBeCharacter(editor, id);
                            return is.Failed() ? is : ((*controls).*operation)(editor, id);
                          });
}

}

bool VSubjectStoreQml::canCreateSmartObjects(const QVariantList& i_SelectionItems) const
{
  const auto controls = Backend().Get(&IPanelServices::SmartObjectControls);
  std::vector<std::string> names;
  return controls &&
         controls->CreateForDevices(DevicesOf(ToItems(i_SelectionItems)), ISmartObjectControls::ECreate::No, names)
             .Succeeded();
}

VResultGadget VSubjectStoreQml::createSmartObjects(const QVariantList& i_SelectionItems)
{
  const auto controls = Backend().Get(&IPanelServices::SmartObjectControls);
  if (!controls)
    return IResult(EResult::NotAvailable);
  std::vector<std::string> names;
  const IResult created =
      controls->CreateForDevices(DevicesOf(ToItems(i_SelectionItems)), ISmartObjectControls::ECreate::Yes, names);
  if (created == EResult::InvalidArgument)
    return {created, "No device is selected."};
  if (created == EResult::AlreadyPresent)
    return {created, "A device is linked to a smart object already."};
  if (created == EResult::NotFound)
    return {created, "There is no smart object for that type of device."};
  TSubjectStoreId first;
  if (created.Succeeded() && !names.empty() && Backend().store->Reader()->FindByName(names.front(), first).Succeeded())
    Q_EMIT focusSubject(VStoreIdGadget(first));
  return created;
}

VResultGadget VSubjectStoreQml::assignOptimalActiveMarkerPatterns(const QVariantList& /*i_SelectionItems*/)
{
  const auto controls = Backend().Get(&IPanelServices::SmartObjectControls);
  if (!controls)
    return IResult(EResult::NotAvailable);
  const IResult assigned = controls->AssignOptimalPatterns();
  return {assigned, StoreUI::PatternSentence(assigned)};
}

bool VSubjectStoreQml::canMergeSelectedSmartObjects(const QVariantList& i_SelectionItems) const
{
  const auto objects = SubjectsOf(ToItems(i_SelectionItems));
  return Backend().Can([&](const NMX::IStoreReader& access) { return Subjects::CheckMerge(access, objects); });
}

VResultGadget VSubjectStoreQml::mergeSelectedSmartObjects(const QVariantList& i_SelectionItems)
{
  const auto objects = SubjectsOf(ToItems(i_SelectionItems));
  return Backend().Edit([&](NMX::IEntryEditor& editor) { return Subjects::Merge(editor, objects); });
}

bool VSubjectStoreQml::canSplitSelectedSmartObjects(const QVariantList& i_SelectionItems) const
{
  const auto objects = SubjectsOf(ToItems(i_SelectionItems));
  return Backend().Can([&](const NMX::IStoreReader& access) { return Subjects::CheckSplit(access, objects); });
}

VResultGadget VSubjectStoreQml::splitSelectedSmartObjects(const QVariantList& i_SelectionItems)
{
  const auto objects = SubjectsOf(ToItems(i_SelectionItems));
  return Backend().Edit([&](NMX::IEntryEditor& editor) { return Subjects::Split(editor, objects); });
}

bool VSubjectStoreQml::canSwapSmartClusters(const VStoreIdGadget& i_FirstSubjectId,
                                            const VStoreIdGadget& i_SecondSubjectId) const
{
  return Backend().Can([&](const NMX::IStoreReader& access)
                       { return Subjects::CheckSwap(access, i_FirstSubjectId.Id(), i_SecondSubjectId.Id()); });
}

VResultGadget VSubjectStoreQml::swapSmartClusters(const VStoreIdGadget& i_FirstSubjectId,
                                                  const VStoreIdGadget& i_SecondSubjectId, int i_FirstClusterIndex,
                                                  int i_SecondClusterIndex)
{
  return Backend().Edit(
      [&](NMX::IEntryEditor& editor)
      {
        // A negative index becomes one far past the end.
        return Subjects::Swap(editor, i_FirstSubjectId.Id(), static_cast<std::uint32_t>(i_FirstClusterIndex),
                              i_SecondSubjectId.Id(), static_cast<std::uint32_t>(i_SecondClusterIndex));
      });
}

VResultGadget VSubjectStoreQml::calibrateCFC(const QVariantList& i_SubjectStoreIds)
{
  return EditCharacters(Backend(), i_SubjectStoreIds, &ICharacterControls::Calibrate);
}

VResultGadget VSubjectStoreQml::decalibrateCFC(const QVariantList& i_SubjectStoreIds)
{
  return EditCharacters(Backend(), i_SubjectStoreIds, &ICharacterControls::ClearCalibration);
}

bool VSubjectStoreQml::canAssignSubjectToSlot(const VStoreIdGadget& i_SubjectStoreId,
                                              const VSelectionItemGadget& i_EmptySubjectSlotSelectionItem) const
{
  const SelectionItem& slot = i_EmptySubjectSlotSelectionItem.Item();
  return Backend().Can(
      [&](const NMX::IStoreReader& access)
      {
        return Subjects::CheckAssign(access, i_SubjectStoreId.Id(), slot.subject,
                                     static_cast<std::uint32_t>(slot.slot));
      });
}

VResultGadget VSubjectStoreQml::assignSubjectToSlot(const VStoreIdGadget& i_SubjectStoreId,
                                                    const VSelectionItemGadget& i_EmptySubjectSlotSelectionItem)
{
  const SelectionItem& slot = i_EmptySubjectSlotSelectionItem.Item();
  return Backend().Edit(
      [&](NMX::IEntryEditor& editor)
      { return Subjects::Assign(editor, i_SubjectStoreId.Id(), slot.subject, static_cast<std::uint32_t>(slot.slot)); });
}

bool VSubjectStoreQml::canUnassignSubjects(const QVariantList& i_SubjectStoreIds) const
{
  const auto objects = ToIds(i_SubjectStoreIds);
  return Backend().Can([&](const NMX::IStoreReader& access) { return Subjects::CheckUnassign(access, objects); });
}

VResultGadget VSubjectStoreQml::unassignSubjects(const QVariantList& i_SubjectStoreIds)
{
  const auto objects = ToIds(i_SubjectStoreIds);
  return Backend().Edit([&](NMX::IEntryEditor& editor) { return Subjects::Unassign(editor, objects); });
}

bool VSubjectStoreQml::anySubjectManuallyAssignable() const
{
  const auto access = Backend().store->Reader();
  return !Subjects::UnassignedObjects(*access).empty() && !Subjects::EmptySlots(*access).empty();
}

bool VSubjectStoreQml::canDetachClusters(const QVariantList& i_SubjectStoreIds) const
{
  return canUnassignSubjects(i_SubjectStoreIds);
}

VResultGadget VSubjectStoreQml::detachClusters(const QVariantList& i_SubjectStoreIds)
{
  const auto objects = ToIds(i_SubjectStoreIds);
  return Backend().Edit([&](NMX::IEntryEditor& editor) { return Subjects::Detach(editor, objects); });
}

}
