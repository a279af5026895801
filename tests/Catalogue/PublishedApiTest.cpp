#include "RunaCorePluginSubjectStore/BasicObjectServices/BasicObjectWarnings.h"
#include "RunaCorePluginSubjectStore/BasicObjectServices/VBasicObjectServices.h"
#include "RunaCorePluginSubjectStore/Catalogue/BasicObjectCatalogue.h"
#include "RunaCorePluginSubjectStore/Catalogue/CharacterFromClustersCatalogue.h"
#include "RunaCorePluginSubjectStore/Catalogue/ObjectEvaluationCatalogue.h"
#include "RunaCorePluginSubjectStore/Catalogue/SmartObjectCatalogue.h"
#include "RunaCorePluginSubjectStore/Catalogue/SubjectCalibrationCatalogue.h"
#include "RunaCorePluginSubjectStore/CharacterFromClustersServices/CharacterWarnings.h"
#include "RunaCorePluginSubjectStore/CharacterFromClustersServices/VCharacterFromClustersServices.h"
#include "RunaCorePluginSubjectStore/ObjectEvaluationServices/VObjectEvaluationServices.h"
#include "RunaCorePluginSubjectStore/SmartObjectServices/SmartObjectWarnings.h"
#include "RunaCorePluginSubjectStore/SmartObjectServices/VSmartObjectServices.h"
#include "RunaCorePluginSubjectStore/SubjectCalibrationServices/SubjectCalibrationStates.h"
#include "RunaCorePluginSubjectStore/SubjectCalibrationServices/VSubjectCalibrationServices.h"
#include "RunaCorePluginSubjectStore/Subjects/Warnings.h"
#include "StandaloneHost/Store/VStore.h"
#include "tests/Support/ManualPostal.h"

#include <boost/json.hpp>
#include <gmock/gmock.h>

#include <fstream>
#include <iterator>
#include <map>

using namespace TerminalServer2;
namespace json = boost::json;

namespace
{

/// What clients have been promised, kept apart from the tables that the plugin is built from.
const json::object& Promised()
{
  static const json::value document = []
  {
    std::ifstream in(SUBJECT_STORE_SOURCE_DIR "/tests/Catalogue/published-api.json");
    return json::parse(std::string(std::istreambuf_iterator<char>(in), {}));
  }();
  return document.as_object();
}

/// Remembers what was registered, in order; refuses one name.
struct RecordingServer : IServer
{
  NMX::IResult RegisterType(Level level, const TypeRecord& record) override
  {
    return Note(record.name, level, [&] { types.push_back(record); });
  }
  NMX::IResult RegisterCallback(Level level, std::shared_ptr<NMX::IServerCallback> callback) override
  {
    return Note(callback->Record().name, level, [&] { callbacks.push_back(callback); });
  }
  NMX::IResult RegisterFunction(Level level, std::shared_ptr<NMX::IServerFunction> function) override
  {
    return Note(function->Record().name, level, [&] { functions.push_back(function); });
  }

  template <class Keep>
  NMX::IResult Note(std::string_view name, Level level, Keep keep)
  {
    if (name == refused)
      return NMX::EResult::AlreadyPresent;
    order.emplace_back(name);
    levels[std::string(name)] = level;
    keep();
    return NMX::EResult::Ok;
  }

  std::string refused;
  std::vector<std::string> order;
  std::map<std::string, Level> levels;
  std::vector<TypeRecord> types;
  std::vector<std::shared_ptr<NMX::IServerFunction>> functions;
  std::vector<std::shared_ptr<NMX::IServerCallback>> callbacks;
};

void RegisterBasicObjects(RecordingServer& server, std::uint32_t mask)
{
  const auto service = NMX::MakeShared<BasicObjectServices::VBasicObjectServices>(NMX::MakeShared<Store::VStore>());
  RegisterGroup<NMX::IBasicObjectServices>(server, Catalogue::BasicObjectGroup(), service,
                                           std::make_shared<ManualPostal>(), {mask});
}

void RegisterSmartObjects(RecordingServer& server, std::uint32_t mask)
{
  const auto service =
      NMX::MakeShared<SmartObjectServices::VSmartObjectServices>(NMX::MakeShared<Store::VStore>(), nullptr, nullptr);
  RegisterGroup<NMX::ISmartObjectServices>(server, Catalogue::SmartObjectGroup(), service,
                                           std::make_shared<ManualPostal>(), {mask});
}

void RegisterObjectEvaluation(RecordingServer& server, std::uint32_t mask)
{
  const auto service =
      ObjectEvaluationServices::VObjectEvaluationServices::Make(NMX::MakeShared<Store::VStore>(), nullptr);
  RegisterGroup<NMX::IObjectEvaluationServices>(server, Catalogue::ObjectEvaluationGroup(), service,
                                                std::make_shared<ManualPostal>(), {mask});
}

void RegisterCharacters(RecordingServer& server, std::uint32_t mask)
{
  const auto service = NMX::MakeShared<CharacterFromClustersServices::VCharacterFromClustersServices>(
      nullptr, NMX::MakeShared<Store::VStore>());
  RegisterGroup<NMX::ICharacterFromClustersServices>(server, Catalogue::CharacterFromClustersGroup(), service,
                                                     std::make_shared<ManualPostal>(), {mask});
}

void RegisterSubjectCalibration(RecordingServer& server, bool granted)
{
  const auto service = NMX::MakeShared<SubjectCalibrationServices::VSubjectCalibrationServices>(
      NMX::MakeShared<Store::VStore>(), nullptr, nullptr);
  RegisterGroup<NMX::ISubjectCalibrationServices>(server, Catalogue::SubjectCalibrationGroup(), service,
                                                  std::make_shared<ManualPostal>(), {0, granted});
}

std::string Name(EArgumentType type, const TypeRecord* enumeration)
{
  const auto enumerationName = [&] { return std::string(enumeration->name.substr(enumeration->name.find('.') + 1)); };
  switch (type)
  {
  case EArgumentType::Bool:
    return "bool";
  case EArgumentType::UInt32:
    return "unsigned 32-bit";
  case EArgumentType::UInt64:
    return "unsigned 64-bit";
  case EArgumentType::Double:
    return "double";
  case EArgumentType::Text:
    return "text";
  case EArgumentType::TextSet:
    return "set of texts";
  case EArgumentType::TextList:
    return "list of texts";
  case EArgumentType::WarningMap:
    return "map " + enumerationName() + " to text";
  case EArgumentType::Enumeration:
    return enumerationName();
  case EArgumentType::SessionId:
    return "calibration session id";
  }
  return "";
}

/// A record as the promise would have it.
json::object Describe(const FunctionRecord& record, std::span<const ArgumentType> types)
{
  json::array arguments;
  for (std::size_t i = 0; i < record.arguments.size(); ++i)
    arguments.push_back({{"name", record.arguments[i].name},
                         {"text", record.arguments[i].text},
                         {"direction", types[i].direction == EDirection::Input ? "input" : "output"},
                         {"type", Name(types[i].type, types[i].enumeration)}});
  return {{"name", record.name},
          {"description", record.description},
          {"arguments", std::move(arguments)},
          {"results", record.results}};
}

json::object Describe(const TypeRecord& record)
{
  json::array values;
  for (const auto& value : record.values)
    values.push_back({{"name", value.name}, {"number", value.number}, {"text", value.text}});
  return {{"name", record.name}, {"description", record.description}, {"values", std::move(values)}};
}

}

TEST(PublishedApi, GroupsAreRegisteredAsPromisedInTheirOrder)
{
  const std::map<std::string, void (*)(RecordingServer&, std::uint32_t)> groups{
      {"BasicObjectServices", RegisterBasicObjects},
      {"SmartObjectServices", RegisterSmartObjects},
      {"ObjectEvaluationServices", RegisterObjectEvaluation},
      {"CharacterFromClustersServices", RegisterCharacters},
      {"SubjectCalibrationServices",
       [](RecordingServer& server, std::uint32_t mask) { RegisterSubjectCalibration(server, mask != 0); }}};
  EXPECT_EQ(Promised().at("groups").as_array().size(), groups.size());
  for (const json::value& group : Promised().at("groups").as_array())
  {
    const std::string name(group.at("name").as_string());
    ASSERT_TRUE(groups.contains(name)) << name;
    RecordingServer server;
    groups.at(name)(server, 0xFFFFFFFF);

    std::vector<std::string> order{name};
    for (const json::value& type : Promised().at("enumerations").as_array())
      if (type.at("name").as_string().starts_with(name + '.'))
        order.emplace_back(type.at("name").as_string());
    for (const json::value& function : group.at("functions").as_array())
      order.emplace_back(function.at("name").as_string());
    EXPECT_EQ(server.order, order);
    EXPECT_EQ(server.types.at(0).description, group.at("description").as_string());
    EXPECT_TRUE(server.types.at(0).values.empty());

    json::array registered;
    for (const auto& function : server.functions)
      registered.emplace_back(Describe(function->Record(), function->Arguments()));
    for (const auto& callback : server.callbacks)
      registered.emplace_back(Describe(callback->Record(), callback->Arguments()));
    ASSERT_EQ(registered.size(), group.at("functions").as_array().size());
    for (std::size_t i = 0; i < registered.size(); ++i)
      EXPECT_EQ(registered[i], group.at("functions").as_array()[i]);
  }
}

TEST(PublishedApi, EnumerationsAreAsPromisedAndEachWarningHasItsEntry)
{
  const std::map<std::string, const TypeRecord*> tables{
      {"BasicObjectServices.EBasicObjectWarning", &NMX::basicObjectWarnings},
      {"SmartObjectServices.ESmartObjectWarning", &NMX::smartObjectWarnings},
      {"CharacterFromClustersServices.ECharacterWarning", &NMX::characterWarnings},
      {"CharacterFromClustersServices.ECharacterCalibrationState", &NMX::characterCalibrationStates},
      {"SubjectCalibrationServices.ESubjectCalibrationState", &NMX::subjectCalibrationStates}};
  for (const json::value& promised : Promised().at("enumerations").as_array())
  {
    const std::string name(promised.at("name").as_string());
    ASSERT_TRUE(tables.contains(name)) << name;
    EXPECT_EQ(json::value(Describe(*tables.at(name))), promised) << name;
  }
  // Numbers are those of the enumerators: the last of each stands for all before it.
  using Character = NMX::ICharacterFromClustersServices;
  EXPECT_EQ(static_cast<unsigned>(NMX::IBasicObjectServices::EBasicObjectWarning::ObjectConfusionCritical), 6U);
  EXPECT_EQ(static_cast<unsigned>(NMX::ISmartObjectServices::ESmartObjectWarning::ActiveMarkersOff), 13U);
  EXPECT_EQ(static_cast<unsigned>(Character::ECharacterWarning::InsufficientAutoAssignCandidates), 3U);
  EXPECT_EQ(static_cast<unsigned>(Character::ECharacterCalibrationState::Calibrated), 2U);
  EXPECT_EQ(static_cast<unsigned>(NMX::ISubjectCalibrationServices::ESubjectCalibrationState::Cancelled), 4U);

  // Every subject has an entry for every warning, and a character's slot objects are warned of by one of another name.
  const auto store = NMX::MakeShared<Store::VStore>();
  const auto editor = store->Editor();
  NMX::TSubjectStoreId id;
  ASSERT_TRUE(editor->Add(NMX::ESubjectKind::CharactersFromClusters, "Ada", id).Succeeded());
  const NMX::EntryPath childWarning("Warnings/WarningCFCChildWarning");
  const Subjects::WarningEntries entries(NMX::characterWarnings, "SlotObjectWarning", childWarning);
  std::map<Character::ECharacterWarning, std::string> warnings;
  EXPECT_TRUE(editor->SetValue(id, childWarning, true).Succeeded());
  EXPECT_TRUE(entries.ReadActive(*editor, id, warnings).Succeeded());
  EXPECT_THAT(warnings, testing::ElementsAre(testing::Pair(Character::ECharacterWarning::SlotObjectWarning,
                                                           "Character has one or more warnings on slot objects.")));
  std::map<NMX::ISmartObjectServices::ESmartObjectWarning, std::string> smart;
  EXPECT_TRUE(Subjects::WarningEntries(NMX::smartObjectWarnings).ReadActive(*editor, id, smart).Succeeded());
}

TEST(PublishedApi, FeatureBitsLowerTheLevelOfTheirFunctionsAndOfNoOthers)
{
  const std::set<std::string> autoAssign{"AutoAssignEnabled", "SetAutoAssignEnabled", "AutoAssignedName"};
  const std::set<std::string> grouping{"ProximityGroupName", "SetProximityGroupName", "TemplateGroupName",
                                       "SetTemplateGroupName"};
  for (const auto& [registerGroup, count] : {std::pair(&RegisterBasicObjects, 20U), {&RegisterSmartObjects, 36U}})
    for (const std::uint32_t mask : {0x3U, 0x103U, 0x8003U, 0x8103U})
    {
      RecordingServer server;
      registerGroup(server, mask);
      EXPECT_EQ(server.order.size(), count) << mask;
      for (const auto& [full, level] : server.levels)
      {
        const std::string name = full.substr(full.find('.') + 1);
        const bool lowered =
            (autoAssign.contains(name) && (mask & 0x8000) == 0) || (grouping.contains(name) && (mask & 0x100) == 0);
        EXPECT_EQ(level, lowered ? 1U : 2U) << full << " under " << mask;
      }
    }
}

TEST(PublishedApi, EverythingOfObjectEvaluationHasTheLevelOfItsFeature)
{
  for (const std::uint32_t mask : {0x200U, 0xFFFFFDFFU})
  {
    RecordingServer server;
    RegisterObjectEvaluation(server, mask);
    EXPECT_EQ(server.levels.size(), 11U);
    for (const auto& [name, level] : server.levels)
      EXPECT_EQ(level, mask == 0x200 ? 2U : 1U) << name;
  }
}

TEST(PublishedApi, EverythingOfSubjectCalibrationHasTheLevelThatTheHostGrants)
{
  for (const bool granted : {true, false})
  {
    RecordingServer server;
    RegisterSubjectCalibration(server, granted);
    EXPECT_EQ(server.levels.size(), 29U) << "27 functions and callbacks, the group and its enumeration";
    for (const auto& [name, level] : server.levels)
      EXPECT_EQ(level, granted ? 2U : 1U) << name;
  }
}

TEST(PublishedApi, ARefusedRegistrationLeavesOutThatFunctionAlone)
{
  RecordingServer server;
  server.refused = "BasicObjectServices.Rename";
  RegisterBasicObjects(server, 1);
  EXPECT_EQ(server.order.size(), 19U);
  EXPECT_EQ(server.order.back(), "BasicObjectServices.BasicObjectChangedCallback");
}
