#include "RunaCorePluginSubjectStore/SubjectCalibrationServices/Settings.h"

#include "RunaCorePluginSubjectStore/Subjects/SubjectAccess.h"
#include "StoreInterface/WideText.h"

#include <algorithm>
#include <utility>

namespace SubjectCalibrationServices
{

using NMX::EResult;
using NMX::ESetting;
using NMX::IResult;
using Subjects::Guarded;

std::wstring ChosenPath(const NMX::IStoreReader& access, ESetting setting)
{
  const auto* option = FindSetting<NMX::Option>(access, setting);
  return option != nullptr ? option->chosen : std::wstring{};
}

IResult OptionNames(const NMX::IStore& store, ESetting setting, std::vector<std::string>& names) noexcept
{
  return Guarded(
      [&]() -> IResult
      {
        const auto reader = store.Reader();
        std::vector<std::string> found;
        if (const auto* option = FindSetting<NMX::Option>(*reader, setting))
          for (const NMX::Choice& choice : option->choices)
            found.push_back(choice.name);
        names = std::move(found);
        return EResult::Ok;
      });
}

IResult Choose(NMX::IStore& store, ESetting setting, const std::string& name) noexcept
{
  return Guarded(
      [&]() -> IResult
      {
        const auto editor = store.Editor();
        const auto* option = FindSetting<NMX::Option>(*editor, setting);
        if (option == nullptr)
          return EResult::Failed;
        NMX::Option chosen = *option;
        const auto choice = std::find_if(chosen.choices.begin(), chosen.choices.end(),
                                         [&](const NMX::Choice& each) { return each.name == name; });
        if (choice == chosen.choices.end())
          return EResult::Failed;
        chosen.chosen = choice->path;
        if (const IResult set = editor->SetApplicationEntry(NMX::PathOf(setting), std::move(chosen)); set.Failed())
          return set;
        return editor->Commit();
      });
}

IResult Chosen(const NMX::IStore& store, ESetting setting, std::string& name, std::string& path) noexcept
{
  return Guarded(
      [&]() -> IResult
      {
        const auto reader = store.Reader();
        const auto* option = FindSetting<NMX::Option>(*reader, setting);
        if (option == nullptr)
          return EResult::Failed;
        const auto choice = std::find_if(option->choices.begin(), option->choices.end(),
                                         [&](const NMX::Choice& each) { return each.path == option->chosen; });
        const auto text = choice != option->choices.end() ? NMX::ToUtf8(choice->path) : std::nullopt;
        if (!text)
          return EResult::Failed;
        name = choice->name;
        path = *text;
        return EResult::Ok;
      });
}

}
