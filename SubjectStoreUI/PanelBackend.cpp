#include "SubjectStoreUI/PanelBackend.h"

#include "StoreInterface/EntryPaths.h"

#include <algorithm>
#include <set>

namespace SubjectStoreUI
{

namespace
{

template <class T>
void AddOnce(std::vector<T>& values, const T& value)
{
  if (std::find(values.begin(), values.end(), value) == values.end())
    values.push_back(value);
}

}

QString PanelBackend::Name(NMX::TSubjectStoreId subject) const
{
  return QString::fromStdString(Entry<std::string>(subject, NMX::Paths::Name()).value_or(std::string{}));
}

std::vector<NMX::TSubjectStoreId> PanelBackend::SelectedSubjects() const
{
  return selection ? SubjectsOf(selection->Selection()) : std::vector<NMX::TSubjectStoreId>{};
}

std::vector<NMX::TSubjectStoreId> ToIds(const QVariantList& gadgets)
{
  std::vector<NMX::TSubjectStoreId> ids;
  std::set<NMX::TSubjectStoreId> known;
  for (const QVariant& gadget : gadgets)
    if (gadget.typeId() == qMetaTypeId<VStoreIdGadget>())
      if (const auto id = gadget.value<VStoreIdGadget>().Id(); id.Valid() && known.insert(id).second)
        ids.push_back(id);
  return ids;
}

QVariantList FromIds(const std::vector<NMX::TSubjectStoreId>& ids)
{
  QVariantList gadgets;
  for (const NMX::TSubjectStoreId id : ids)
    gadgets.append(QVariant::fromValue(VStoreIdGadget(id)));
  return gadgets;
}

std::vector<SelectionItem> ToItems(const QVariantList& gadgets)
{
  std::vector<SelectionItem> items;
  for (const QVariant& gadget : gadgets)
    if (gadget.typeId() == qMetaTypeId<VSelectionItemGadget>())
      items.push_back(gadget.value<VSelectionItemGadget>().Item());
  return items;
}

QVariantList FromItems(const std::vector<SelectionItem>& items)
{
  QVariantList gadgets;
  for (const SelectionItem& item : items)
    gadgets.append(QVariant::fromValue(VSelectionItemGadget(item)));
  return gadgets;
}

std::vector<NMX::TSubjectStoreId> SubjectsOf(const std::vector<SelectionItem>& items)
{
  std::vector<NMX::TSubjectStoreId> subjects;
  std::set<NMX::TSubjectStoreId> known;
  for (const SelectionItem& item : items)
    if (item.subject.Valid() && item.slot < 0 && known.insert(item.subject).second)
      subjects.push_back(item.subject);
  return subjects;
}

std::vector<std::string> DevicesOf(const std::vector<SelectionItem>& items)
{
  std::vector<std::string> devices;
  for (const SelectionItem& item : items)
    if (!item.device.empty())
      AddOnce(devices, item.device);
  return devices;
}

}
