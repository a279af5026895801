#pragma once

#include "HostInterface/SelectionItem.h"
#include "StoreInterface/EntryPath.h"

#include <QString>
#include <QStringList>
#include <QVariantList>

namespace SubjectStoreUI
{
struct PanelBackend;
}

/// What the panel asks store and host for its menus, dialogs and pictures. The answers are those of VSubjectPanelQml's
/// operations of the same names. [gui]
namespace SubjectStoreUI::PanelQuestions
{

/// Why a subject cannot have that name; the invalid id stands for a new subject.
[[nodiscard]] QString NameProblem(const PanelBackend& backend, const QString& name, NMX::TSubjectStoreId subject);

/// The texts that objects have for an entry, each once, in alphabetical order.
[[nodiscard]] QStringList Texts(const PanelBackend& backend, NMX::EntryPath path);

[[nodiscard]] QVariantList CandidatesFor(const PanelBackend& backend, const SelectionItem& slot);
[[nodiscard]] QVariantList SlotsFor(const PanelBackend& backend, NMX::TSubjectStoreId subject);
[[nodiscard]] QVariantList Markers(const PanelBackend& backend, NMX::TSubjectStoreId subject);
[[nodiscard]] QVariantList ConfusableWith(const PanelBackend& backend, NMX::TSubjectStoreId subject);
[[nodiscard]] QVariantList WarningsOf(const PanelBackend& backend, NMX::TSubjectStoreId subject);

}
