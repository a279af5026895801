#include "StandaloneHost/PluginModule.h"
#include "StandaloneHost/Calibration/VCalibrationProvider.h"
#include "StandaloneHost/VPluginHost.h"
#include "tests/Support/TemporaryFolder.h"

#include "HostInterface/NMX/VShared.h"
#include "HostInterface/TerminalServer2/IServer.h"
#include "StandaloneHost/Postal/VAsioPostalService.h"
#include "StandaloneHost/Store/VStore.h"

#include <gmock/gmock.h>

#include <chrono>
#include <dlfcn.h>
#include <fstream>
#include <future>

namespace
{

struct CountingServer : TerminalServer2::IServer
{
  NMX::IResult RegisterType(TerminalServer2::Level, const TerminalServer2::TypeRecord&) override
  {
    ++count;
    return NMX::EResult::Ok;
  }
  NMX::IResult RegisterCallback(TerminalServer2::Level, std::shared_ptr<NMX::IServerCallback>) override
  {
    ++count;
    return NMX::EResult::Ok;
  }
  NMX::IResult RegisterFunction(TerminalServer2::Level, std::shared_ptr<NMX::IServerFunction> function) override
  {
    ++count;
    kept = std::move(function);
    return NMX::EResult::Ok;
  }

  int count = 0;
  std::shared_ptr<NMX::IServerFunction> kept;
};

}

TEST(PluginModule, ExportsThreeFunctionsThatWorkWithoutAPluginObject)
{
  void* module = dlopen(SUBJECT_STORE_PLUGIN_FILE, RTLD_NOW | RTLD_LOCAL);
  ASSERT_NE(module, nullptr) << dlerror();
  const auto revision = reinterpret_cast<PluginBuildRevisionFunction*>(dlsym(module, "PluginBuildRevision"));
  const auto destroy = reinterpret_cast<DestroyPluginFunction*>(dlsym(module, "DestroyPlugin"));
  ASSERT_NE(revision, nullptr);
  ASSERT_NE(destroy, nullptr);
  EXPECT_EQ(revision(), 155050U);
  destroy(nullptr);
}

TEST(PluginModule, RegistersTheGroupsThatTheMaskAllowsAndSurvivesItsDestruction)
{
  const auto postal = NMX::MakeShared<Postal::VAsioPostalService>();
  for (const auto& [mask, count] :
       {std::pair(0U, 0), {1U, 20}, {2U, 36}, {0x200U, 11}, {0x203U, 67}, {4U, 20}, {0x4000U, 20}, {0x4004U, 20}})
  {
    auto plugin = LoadPlugin(SUBJECT_STORE_PLUGIN_FILE);
    EXPECT_STREQ(plugin->PluginName(), "");
    EXPECT_STREQ(plugin->DisplayName(), "Subject and object UI");
    const auto server = std::make_shared<CountingServer>();
    VPluginHost host(
        {NMX::MakeShared<Store::VStore>(), postal, server, std::make_shared<VPluginSettings>(mask), nullptr});
    EXPECT_TRUE(plugin->RegisterServices(host));
    EXPECT_EQ(server->count, count);

    // A host that still holds a function after the plugin has gone can call it: the function holds its service.
    plugin.reset();
    if (server->kept)
    {
      const bool evaluates = (mask & 0x200U) != 0;
      std::string_view text = evaluates ? "[\"Nobody\", \"Crate\"]" : "[\"Nobody\"]";
      const auto reply = std::make_shared<std::promise<NMX::IResult>>();
      auto result = reply->get_future();
      server->kept->Invoke(text, NMX::Caller{},
                           [reply](const NMX::IServerReply& made) { reply->set_value(made.Result()); });
      ASSERT_EQ(result.wait_for(std::chrono::seconds(20)), std::future_status::ready);
      // This host has no object evaluation.
      EXPECT_EQ(result.get(), NMX::IResult(evaluates ? NMX::EResult::NotSupported : NMX::EResult::NotFound));
    }
  }
  postal->Stop();
}

TEST(PluginModule, SubjectCalibrationIsThereWhenTheHostProvidesItWhateverTheMask)
{
  const auto postal = NMX::MakeShared<Postal::VAsioPostalService>();
  const auto store = NMX::MakeShared<Store::VStore>();
  const auto calibration =
      std::make_shared<Calibration::VCalibrationProvider>(store, postal, Calibration::CalibrationTimes{});
  auto plugin = LoadPlugin(SUBJECT_STORE_PLUGIN_FILE);
  const auto server = std::make_shared<CountingServer>();
  VPluginHost host({store, postal, server, std::make_shared<VPluginSettings>(0), nullptr, calibration});
  EXPECT_TRUE(plugin->RegisterServices(host));
  EXPECT_EQ(server->count, 29);
  plugin.reset();
  server->kept.reset();
  postal->Stop();
}

TEST(PluginModule, AHostWithoutServerOrSettingsIsNoReasonToFail)
{
  auto plugin = LoadPlugin(SUBJECT_STORE_PLUGIN_FILE);
  VPluginHost nothing({});
  EXPECT_TRUE(plugin->RegisterServices(nothing));
  VPluginHost noServer(
      {NMX::MakeShared<Store::VStore>(), nullptr, nullptr, std::make_shared<VPluginSettings>(1), nullptr});
  EXPECT_TRUE(plugin->RegisterServices(noServer));
}

TEST(PluginModule, FilesThatCannotBeUsedAreRefusedByName)
{
  const TemporaryFolder folder;
  const auto textFile = folder.Path() / "text.so";
  std::ofstream(textFile) << "not a module";
  const auto message = [](const std::filesystem::path& file)
  {
    try
    {
      (void)LoadPlugin(file);
    }
    catch (const PluginError& failure)
    {
      return std::string(failure.what());
    }
    return std::string("loaded");
  };
  EXPECT_THAT(message(folder.Path() / "missing.so"), testing::HasSubstr("missing.so"));
  EXPECT_THAT(message(textFile), testing::HasSubstr("text.so"));
  EXPECT_THAT(message(SUBJECT_STORE_OTHER_PLUGIN_FILE),
              testing::HasSubstr("its build revision is 155049, this host needs 155050"));
  EXPECT_THAT(message("libsqlite3.so.0"), testing::HasSubstr("it has no function PluginBuildRevision"));
}
