#include "SubjectStoreUI/SubjectSection.h"

#include "SubjectStoreUI/VSubjectElementModel.h"
#include "SubjectStoreUI/VSubjectStoreProxyModel.h"
#include "SubjectStoreUI/VSubjectTreeModelStore.h"
#include "SubjectStoreUI/VSubjectWithSlotsTreeModelStore.h"

#include <QCoreApplication>
#include <QTimer>

namespace SubjectStoreUI
{

using NMX::ESubjectKind;

namespace
{

QString Heading(ESubjectKind kind)
{
  switch (kind)
  {
  case ESubjectKind::BasicObjects:
    return "Basic objects";
  case ESubjectKind::SmartObjects:
    return "Smart objects";
  case ESubjectKind::CharactersFromClusters:
    return "Characters";
  case ESubjectKind::GeneralSubjects:
    return "Subjects";
  case ESubjectKind::LabellingClusters:
    return "Labelling clusters";
  case ESubjectKind::Markerless:
    return "Markerless";
  case ESubjectKind::Props:
    return "Props";
  case ESubjectKind::SceneMeshes:
    return "Scene meshes";
  }
  return {};
}

}

SubjectSection::SubjectSection(const std::shared_ptr<ISubjectModelInternalData>& data, ESubjectKind kind,
                               int intervalInMilliseconds)
    : m_data(data), m_hasElements(kind == ESubjectKind::BasicObjects || kind == ESubjectKind::SmartObjects)
{
  if (kind == ESubjectKind::CharactersFromClusters)
    m_tree = NMX::MakeShared<VSubjectWithSlotsTreeModelStore>(data, kind, &m_summary);
  else
    m_tree = NMX::MakeShared<VSubjectTreeModelStore>(data, kind, &m_summary);
  AttachElements();
  m_tree->followStore(intervalInMilliseconds);
  m_sorted = std::make_unique<VSortSubjectsProxyModel>(NMX::MakeShared<VSubjectStoreProxyModel>(m_tree),
                                                       VSubjectTypeGadget(kind), Heading(kind), &m_summary);
  // Not within the reset: whoever hears of it after this has not been reset yet.
  connect(m_tree.get(), &QAbstractItemModel::modelReset, this,
          [this] { QTimer::singleShot(0, this, [this] { AttachElements(); }); });
}

SubjectSection::~SubjectSection() = default;

void SubjectSection::AttachElements()
{
  if (m_hasElements && m_tree->elementModels().empty())
    m_tree->attachElementModel(NMX::MakeShared<VSubjectElementModel>(m_data, *m_tree));
}

}
