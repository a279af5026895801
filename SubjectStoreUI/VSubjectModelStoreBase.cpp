#include "SubjectStoreUI/VSubjectModelStoreBase.h"

#include "HostInterface/NMX/GlobalLog.h"
#include "SubjectStoreUI/SubjectGadgets.h"
#include "SubjectStoreUI/VSubjectElementModel.h"

#include <QThread>

#include <utility>

namespace SubjectStoreUI
{

namespace Role = SubjectsModelRole;

VSubjectModelStoreBase::VSubjectModelStoreBase(std::shared_ptr<ISubjectModelInternalData> data,
                                               VSubjectWarningSummary* summary)
    : m_data(std::move(data)), m_summary(summary)
{
  m_timer.setSingleShot(true);
}

VSubjectModelStoreBase::~VSubjectModelStoreBase() = default;

int VSubjectModelStoreBase::columnCount(const QModelIndex& /*parent*/) const
{
  return 1;
}

Qt::ItemFlags VSubjectModelStoreBase::flags(const QModelIndex& index) const
{
  return index.isValid() ? Qt::ItemIsSelectable | Qt::ItemIsEnabled : Qt::NoItemFlags;
}

QHash<int, QByteArray> VSubjectModelStoreBase::roleNames() const
{
  return Role::Names();
}

std::vector<std::shared_ptr<VSubjectElementModel>> VSubjectModelStoreBase::elementModels() const
{
  return m_elementModels;
}

void VSubjectModelStoreBase::attachElementModel(std::shared_ptr<VSubjectElementModel> elements)
{
  Q_ASSERT(thread() == QThread::currentThread());
  if (!elements)
    return;
  beginResetModel(); // proxies learn of a new source
  m_elementModels.push_back(std::move(elements));
  endResetModel();
}

void VSubjectModelStoreBase::RefreshElements()
{
  for (const auto& elements : m_elementModels)
    elements->refresh();
}

void VSubjectModelStoreBase::followStore(int intervalInMilliseconds)
{
  Q_ASSERT(thread() == QThread::currentThread());
  m_timer.setInterval(std::max(intervalInMilliseconds, 0));
  connect(&m_timer, &QTimer::timeout, this, [this] { refresh(); });
  if (m_data)
    m_changes = m_data->OnChange(
        [self = QPointer<VSubjectModelStoreBase>(this)]
        {
          if (self)
            self->onStoreChanged();
        });
}

void VSubjectModelStoreBase::onStoreChanged()
{
  Q_ASSERT(thread() == QThread::currentThread());
  if (m_timer.interval() <= 0)
    refresh();
  else if (!m_timer.isActive())
    m_timer.start();
}

QVariant VSubjectModelStoreBase::ReadRole(NMX::TSubjectStoreId subject, int role, ELevel level) const
{
  switch (role)
  {
  case Role::SubjectStoreId:
    return QVariant::fromValue(VStoreIdGadget(subject));
  case Role::SubjectSelectionItem:
    return QVariant::fromValue(VSelectionItemGadget(subject));
  case Role::SubjectHasParent:
  case Role::SubjectIsSlot:
    return level == ELevel::Second;
  case Role::SubjectIsSubjectElement:
    return false;
  case Role::SubjectSlotName:
  case Role::SubjectSlotShortName:
    return {};
  case Role::SubjectProxySortName:
    role = Role::SubjectName;
    break;
  default:
    if (role < Role::keys.front().role || role > Role::keys.back().role)
      return {};
  }
  return m_data->Value(*m_data->OpenRead(), subject, role);
}

bool VSubjectModelStoreBase::WriteRole(NMX::TSubjectStoreId subject, const QVariant& value, int role)
{
  Q_ASSERT(thread() == QThread::currentThread());
  if (role != Role::SubjectName && role != Role::SubjectEnabled)
    return false;
  const auto access = m_data->OpenWrite();
  NMX::IResult written;
  if (role == Role::SubjectName)
  {
    const QString name = value.toString();
    NMX::Log(NMX::subjectStoreLog, NMX::ESeverity::Debug, "Set subject [%1%] name: %2%", subject, name.toStdString());
    written = m_data->Rename(*access, subject, name, NMX::ENotify::Yes);
  }
  else
  {
    const bool enabled = value.toBool();
    NMX::Log(NMX::subjectStoreLog, NMX::ESeverity::Debug, "Set subject [%1%] enabled: %2%", subject, enabled);
    written = m_data->SetEnabled(*access, subject, enabled);
  }
  return written.Succeeded() && access->Commit().Succeeded();
}

void VSubjectModelStoreBase::TellChanged(const QModelIndex& index, const QList<int>& roles)
{
  if (!roles.isEmpty())
    Q_EMIT dataChanged(index, index, roles);
}

void VSubjectModelStoreBase::CountWarnings(const NMX::IStoreReader& access, NMX::TSubjectStoreId subject,
                                           std::map<int, int>& counts) const
{
  for (const int type : m_data->Warnings(access, subject))
    ++counts[type];
}

}
