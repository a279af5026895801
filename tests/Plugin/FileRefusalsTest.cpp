#include "RunaCorePluginSubjectStore/CharacterFromClustersServices/VCharacterFromClustersServices.h"
#include "RunaCorePluginSubjectStore/SmartObjectServices/DeviceTypes.h"
#include "RunaCorePluginSubjectStore/SmartObjectServices/VSmartObjectServices.h"
#include "RunaCorePluginSubjectStore/SubjectCalibrationServices/VSubjectCalibrationServices.h"
#include "RunaCorePluginSubjectStore/TerminalServer2/VServerFunction.h"
#include "StandaloneHost/Calibration/VSubjectCalibrationController.h"
#include "StandaloneHost/Calibration/VSubjectCreator.h"
#include "StandaloneHost/Characters/VCharacterControls.h"
#include "StandaloneHost/SmartObjects/VSmartObjectControls.h"
#include "StoreInterface/WideText.h"
#include "tests/Support/LogCapture.h"
#include "tests/Support/ManualAsioPostal.h"
#include "tests/Support/ManualPostal.h"
#include "tests/Support/StoreFixture.h"
#include "tests/Support/TemporaryFolder.h"

#include <gmock/gmock.h>

#include <fstream>
#include <functional>
#include <optional>
#include <vector>

using NMX::EResult;
using NMX::ESetting;
using NMX::ESubjectKind;
using NMX::IResult;

namespace
{

/// The services that read files, over the standalone host's controls.
class FileRefusalsTest : public StoreFixture
{
protected:
  FileRefusalsTest()
  {
    SmartObjectServices::RegisterDeviceTypes(*layouts);
    Add(ESubjectKind::Props, "Taken");
    Add(ESubjectKind::Props, "Child Staff");
    Add(ESubjectKind::CharactersFromClusters, "Ada");
  }

  std::string Write(const char* name, const std::string& text) const
  {
    const auto file = folder.Path() / name;
    std::ofstream(file) << text;
    return file.string();
  }

  void Choose(ESetting setting, const std::string& file)
  {
    SetApplication(std::string(NMX::PathOf(setting).Text()), NMX::Option{NMX::ToWide(file).value(), {}});
  }

  /// Makes the call, once as the panel does and once as one over the wire, whose files are looked at elsewhere; takes
  /// back what it has added, and returns its result.
  IResult Result(const std::function<IResult()>& call, const char* added)
  {
    const IResult inPlace = TakeBack(call(), added);
    EXPECT_EQ(TakeBack(ResultOfRemoteCall(call), added).Name(), inPlace.Name());
    return inPlace;
  }

  static IResult ResultOfRemoteCall(const std::function<IResult()>& call)
  {
    constexpr TerminalServer2::ArgumentText none[] = {{"Unused", ""}};
    const auto strand = std::make_shared<ManualPostal>();
    const auto function = NMX::MakeShared<TerminalServer2::VServerFunction<IResult(const std::string&)>>(
        TerminalServer2::FunctionRecord{"Group.Function", "", none, ""}, [&](const std::string&) { return call(); },
        std::make_shared<TerminalServer2::CallQueue>(strand));
    std::optional<IResult> result;
    std::string_view text = R"([""])";
    function->Invoke(text, NMX::Caller{1}, [&](const NMX::IServerReply& reply) { result = reply.Result(); });
    while (!result)
      strand->RunAll();
    return *result;
  }

  IResult TakeBack(IResult result, const char* added)
  {
    const auto editor = store->Editor();
    for (const std::string& name : {std::string(added), std::string(added) + " Staff"})
      if (Id id; result.Succeeded() && editor->FindByName(name, id).Succeeded())
        (void)editor->Remove(id);
    EXPECT_TRUE(editor->Commit().Succeeded());
    return result;
  }

  const LogCapture log;
  const TemporaryFolder folder;
  const std::string missing = (folder.Path() / "missing").string();
  const std::string directory = folder.Path().string();
  const std::string noPath = std::string("/a\0b", 4);
  const std::string bad = Write("bad", "<Nonsense/>");
  std::shared_ptr<ManualAsioPostal> postal = std::make_shared<ManualAsioPostal>();
  std::shared_ptr<SmartObjects::DeviceLayouts> layouts = std::make_shared<SmartObjects::DeviceLayouts>();
};

constexpr const char* noNames[] = {" x", "", "A/B", "Taken", "New"};

}

TEST_F(FileRefusalsTest, ACharactersNameIsRefusedBeforeItsTemplate)
{
  const auto service = NMX::MakeShared<CharacterFromClustersServices::VCharacterFromClustersServices>(
      std::make_shared<Characters::VCharacterControls>(store, postal, std::chrono::milliseconds(1)), store);
  const std::string good =
      Write("good.cct", R"(<CharacterTemplate version="1"><Segments><Segment name="Hip"/></Segments>
    <Slots><Slot name="Belt" segment="Hip"/></Slots></CharacterTemplate>)");
  using enum EResult;
  const std::pair<std::string, std::vector<EResult>> rows[] = {
      {"", {InvalidName, InvalidName, InvalidName, AlreadyPresent, InvalidArgument}},
      {noPath, {InvalidName, InvalidArgument, InvalidArgument, InvalidArgument, InvalidArgument}},
      {"\xFF", {InvalidName, InvalidArgument, InvalidArgument, InvalidArgument, InvalidArgument}},
      {missing, {InvalidName, InvalidName, InvalidName, AlreadyPresent, FileNotFound}},
      {directory, {InvalidName, InvalidName, InvalidName, AlreadyPresent, FileIOFailure}},
      {bad, {InvalidName, InvalidName, InvalidName, AlreadyPresent, SerialisationFailure}},
      {good, {InvalidName, InvalidName, InvalidName, AlreadyPresent, Ok}},
  };
  for (const auto& [path, results] : rows)
    for (std::size_t name = 0; name < results.size(); ++name)
      EXPECT_EQ(Result([&] { return service->CreateCharacter(noNames[name], path); }, noNames[name]).Name(),
                IResult(results[name]).Name())
          << '"' << noNames[name] << "\" from " << path;
}

TEST_F(FileRefusalsTest, ASmartObjectsNameIsRefusedBeforeItsTemplate)
{
  const auto service = NMX::MakeShared<SmartObjectServices::VSmartObjectServices>(
      store, std::make_shared<SmartObjects::VSmartObjectControls>(store, layouts), nullptr);
  const auto sot = [](const std::string& type)
  {
    return R"(<SmartObjectTemplate version="1"><SmartClusters><SmartCluster label="A" type=")" + type +
           R"("/></SmartClusters></SmartObjectTemplate>)";
  };
  using enum EResult;
  const std::pair<std::string, std::vector<EResult>> rows[] = {
      {"", {InvalidName, InvalidName, InvalidName, AlreadyPresent, FileNotFound}},
      {noPath, {InvalidName, InvalidArgument, InvalidArgument, InvalidArgument, InvalidArgument}},
      {missing, {InvalidName, InvalidName, InvalidName, AlreadyPresent, FileNotFound}},
      {directory, {InvalidName, InvalidName, InvalidName, AlreadyPresent, Failed}},
      {bad, {InvalidName, InvalidName, InvalidName, AlreadyPresent, Failed}},
      {Write("toaster.sot", sot("Toaster")), {InvalidName, InvalidName, InvalidName, AlreadyPresent, Failed}},
      {Write("good.sot", sot("Corvex1")), {InvalidName, InvalidName, InvalidName, AlreadyPresent, Ok}},
  };
  for (const auto& [path, results] : rows)
    for (std::size_t name = 0; name < results.size(); ++name)
      EXPECT_EQ(Result([&] { return service->AddFromTemplate(noNames[name], path); }, noNames[name]).Name(),
                IResult(results[name]).Name())
          << '"' << noNames[name] << "\" from " << path;
  EXPECT_EQ(service->Add("Taken"), IResult(AlreadyPresent));
  EXPECT_EQ(service->Add("New"), IResult(FileNotFound)) << "there is no folder of templates";
}

TEST_F(FileRefusalsTest, ACharacterIsFoundBeforeItsRetargetPathIsLookedAt)
{
  const auto service = NMX::MakeShared<CharacterFromClustersServices::VCharacterFromClustersServices>(nullptr, store);
  using enum EResult;
  const char* const names[] = {"Nobody", "Taken", "Ada"};
  const std::pair<std::string, std::vector<EResult>> rows[] = {
      {"", {NotFound, NotSupported, Ok}},
      {noPath, {NotFound, NotSupported, InvalidArgument}},
      {"\xFF", {NotFound, NotSupported, InvalidArgument}},
      {missing, {NotFound, NotSupported, FileNotFound}},
      {bad + "/under a file", {NotFound, NotSupported, FileNotFound}},
      {std::string(5000, 'x'), {NotFound, NotSupported, FileNotFound}},
      {directory, {NotFound, NotSupported, Ok}},
      {bad, {NotFound, NotSupported, Ok}},
  };
  for (const auto& [path, results] : rows)
    for (std::size_t name = 0; name < results.size(); ++name)
      EXPECT_EQ(Result([&] { return service->SetCharacterRetargetPath(names[name], path); }, "-").Name(),
                IResult(results[name]).Name())
          << names[name] << ' ' << path;
}

TEST_F(FileRefusalsTest, ASubjectsNameIsRefusedBeforeItsTemplateAndThatBeforeItsSkin)
{
  const auto controller = std::make_shared<Calibration::VSubjectCalibrationController>(
      store, postal, std::make_shared<Calibration::VCalibrationNotifications>(), Calibration::CalibrationTimes{});
  const auto service = NMX::MakeShared<SubjectCalibrationServices::VSubjectCalibrationServices>(
      store, controller, std::make_shared<Calibration::VSubjectCreator>());
  const std::string segments = "<Segments><Segment name='Hip'/></Segments>";
  const std::string lbt = Write("good.lbt", "<LabellingTemplate version='1'>" + segments +
                                                "<Children><Child kind='Props' name='Staff'/></Children>"
                                                "</LabellingTemplate>");
  const std::string skin = Write("good.skin", "<SubjectSkin version='1'>" + segments + "</SubjectSkin>");
  using enum EResult;
  struct Row
  {
    const char* name;
    std::string labellingTemplate;
    std::string skin;
    EResult result;
  };
  std::vector<Row> rows = {
      {"New", "", bad, InvalidArgument},
      {"New", missing, missing, FileNotFound},
      {"New", directory, bad, FileIOFailure},
      {"New", bad, missing, SerialisationFailure},
      {"New", lbt, missing, FileNotFound},
      {"New", lbt, directory, FileIOFailure},
      {"New", lbt, bad, SerialisationFailure},
      {"Child", missing, skin, FileNotFound},
      {"Child", lbt, bad, SerialisationFailure},
      {"Child", lbt, skin, AlreadyPresent},
      {"New", lbt, "", Ok},
      {"New", lbt, skin, Ok},
  };
  for (const std::string& path : {std::string(), missing, bad, lbt})
  {
    rows.push_back({"", path, bad, InvalidName});
    rows.push_back({"A/B", path, skin, InvalidName});
    rows.push_back({"Taken", path, bad, AlreadyPresent});
  }
  for (const Row& row : rows)
  {
    SetApplication(std::string(NMX::PathOf(ESetting::CreateSubjectName).Text()), std::string(row.name));
    Choose(ESetting::CreateSubjectTemplate, row.labellingTemplate);
    Choose(ESetting::CreateSubjectSkin, row.skin);
    NMX::TCalibrationSessionId session;
    EXPECT_EQ(service->StartSubjectCalibration(session, "a.b"), IResult(InvalidArgument)) << row.name;
    const auto startAndCancel = [&]
    {
      const IResult started = service->StartSubjectCalibration(session, "");
      if (started.Succeeded())
        (void)service->CancelSubjectCalibration(session);
      return started;
    };
    EXPECT_EQ(Result(startAndCancel, row.name).Name(), IResult(row.result).Name())
        << '"' << row.name << "\" from " << row.labellingTemplate << " and " << row.skin;
  }
  controller->Stop();
}
