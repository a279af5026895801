#pragma once

#include "StoreInterface/IStore.h"

#include <gmock/gmock.h>

/// An edit access whose answers the test decides.
class MockEditor : public NMX::IEntryEditor
{
public:
  using Id = NMX::TSubjectStoreId;

  MOCK_METHOD(NMX::IResult, FindByName, (std::string_view, Id&), (const, override));
  MOCK_METHOD(NMX::IResult, ObjectKind, (Id, std::uint32_t&), (const, override));
  MOCK_METHOD(NMX::IResult, Kind, (Id, NMX::ESubjectKind&), (const, override));
  MOCK_METHOD(NMX::IResult, Subjects, (NMX::ESubjectKind, std::vector<Id>&), (const, override));
  MOCK_METHOD(NMX::IResult, Children, (Id, std::vector<Id>&), (const, override));
  MOCK_METHOD(NMX::IResult, Descendants, (Id, std::vector<Id>&), (const, override));
  MOCK_METHOD(NMX::IResult, Stamps, (Id, NMX::ChangeStamps&), (const, override));
  MOCK_METHOD(NMX::IResult, Find, (Id, NMX::EntryPath, const NMX::Value*&), (const, override));
  MOCK_METHOD(const NMX::Value*, FindApplicationEntry, (NMX::EntryPath), (const, override));
  MOCK_METHOD(std::vector<NMX::EntryPath>, ApplicationEntries, (NMX::EntryPath), (const, override));
  MOCK_METHOD(std::string, NamePattern, (), (const, override));
  MOCK_METHOD(NMX::IResult, Add, (NMX::ESubjectKind, std::string_view, Id&), (override));
  MOCK_METHOD(NMX::IResult, Remove, (Id), (override));
  MOCK_METHOD(NMX::IResult, Rename, (Id, std::string_view, NMX::ENotify), (override));
  MOCK_METHOD(NMX::IResult, SetValue, (Id, NMX::EntryPath, NMX::Value, NMX::ENotify), (override));
  MOCK_METHOD(NMX::IResult, SetApplicationEntry, (NMX::EntryPath, NMX::Value), (override));
  MOCK_METHOD(NMX::IResult, Commit, (), (override));
};

class MockStore : public NMX::IStore
{
public:
  MOCK_METHOD(std::unique_ptr<const NMX::IStoreReader>, Reader, (), (const, override));
  MOCK_METHOD(std::unique_ptr<NMX::IEntryEditor>, Editor, (), (override));
  MOCK_METHOD(std::shared_ptr<ChangeCallback>, SubjectsChanged, (NMX::ESubjectKind), (override));
  MOCK_METHOD(NMX::Subscription, OnChange, (std::string, std::weak_ptr<NMX::IPostalService>, std::function<void()>),
              (override));
};
