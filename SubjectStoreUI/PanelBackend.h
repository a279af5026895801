#pragma once

#include "HostInterface/ISelectionManager.h"
#include "HostInterface/NMX/IPostalService.h"
#include "HostInterface/RunaCorePluginInterface/IPanelServices.h"
#include "RunaCorePluginSubjectStore/Subjects/SubjectAccess.h"
#include "StoreInterface/IStore.h"
#include "SubjectStoreUI/ResultGadget.h"
#include "SubjectStoreUI/SubjectGadgets.h"

#include <QVariantList>

#include <memory>
#include <optional>
#include <vector>

namespace SubjectStoreUI
{

/// What the panel's objects work on. Selection and services may be null. [gui]
struct PanelBackend
{
  std::shared_ptr<NMX::IStore> store;
  std::shared_ptr<NMX::IPostalService> gui;
  std::shared_ptr<ISelectionManager> selection;
  std::shared_ptr<RunaCorePluginInterface::IPanelServices> services;

  /// One of the host's services; null when it has none.
  template <class Service>
  [[nodiscard]] std::shared_ptr<Service>
  Get(void (RunaCorePluginInterface::IPanelServices::*getter)(std::shared_ptr<Service>&) const) const
  {
    std::shared_ptr<Service> service;
    if (services)
      ((*services).*getter)(service);
    return service;
  }

  /// One edit of the store: `step(editor)`, committed when it succeeds.
  template <class Step>
  [[nodiscard]] VResultGadget Edit(Step step) const
  {
    return Subjects::Guarded(
        [&]() -> NMX::IResult
        {
          const auto editor = store->Editor();
          const NMX::IResult edited = step(*editor);
          return edited.Failed() ? edited : editor->Commit();
        });
  }

  /// The same for each of some subjects: `step(editor, id)`. `InvalidArgument` without any.
  template <class Step>
  [[nodiscard]] VResultGadget EditEach(const std::vector<NMX::TSubjectStoreId>& subjects, Step step) const
  {
    return Edit(
        [&](NMX::IEntryEditor& editor) -> NMX::IResult
        {
          for (const NMX::TSubjectStoreId subject : subjects)
            if (const NMX::IResult edited = step(editor, subject); edited.Failed())
              return edited;
          return subjects.empty() ? NMX::EResult::InvalidArgument : NMX::EResult::Ok;
        });
  }

  /// Whether the rule of an operation is kept at present: `check(reader)`.
  template <class Check>
  [[nodiscard]] bool Can(Check check) const
  {
    return Subjects::Guarded([&]() -> NMX::IResult { return check(*store->Reader()); }).Succeeded();
  }

  /// An entry that has a value of type `T`; none otherwise, without a word.
  template <class T>
  [[nodiscard]] std::optional<T> Entry(NMX::TSubjectStoreId subject, NMX::EntryPath path) const
  {
    const auto access = store->Reader();
    const NMX::Value* value = nullptr;
    if (access->Find(subject, path, value).Failed() || value == nullptr)
      return std::nullopt;
    const T* typed = std::get_if<T>(value);
    return typed != nullptr ? std::optional<T>(*typed) : std::nullopt;
  }

  [[nodiscard]] QString Name(NMX::TSubjectStoreId subject) const;

  /// The selected subjects, each once, in the order of the selection.
  [[nodiscard]] std::vector<NMX::TSubjectStoreId> SelectedSubjects() const;
};

/// The ids in an array of VStoreIdGadget, each once; what is of another type or invalid is left out.
[[nodiscard]] std::vector<NMX::TSubjectStoreId> ToIds(const QVariantList& gadgets);
[[nodiscard]] QVariantList FromIds(const std::vector<NMX::TSubjectStoreId>& ids);

/// The same of VSelectionItemGadget.
[[nodiscard]] std::vector<SelectionItem> ToItems(const QVariantList& gadgets);
[[nodiscard]] QVariantList FromItems(const std::vector<SelectionItem>& items);

/// The subjects among the items, each once; a slot is none.
[[nodiscard]] std::vector<NMX::TSubjectStoreId> SubjectsOf(const std::vector<SelectionItem>& items);
/// The devices among them.
[[nodiscard]] std::vector<std::string> DevicesOf(const std::vector<SelectionItem>& items);

}
