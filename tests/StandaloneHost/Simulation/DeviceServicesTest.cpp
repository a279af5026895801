#include "StandaloneHost/Simulation/VDeviceServices.h"

#include "tests/Support/LogCapture.h"
#include "tests/Support/ManualAsioPostal.h"
#include "tests/Support/ManualPostal.h"
#include "tests/Support/StoreFixture.h"

#include <gmock/gmock.h>

using NMX::EResult;
using NMX::IResult;
using testing::ElementsAre;
using testing::HasSubstr;

namespace
{

class DeviceServicesTest : public StoreFixture
{
protected:
  void SetUp() override
  {
    EXPECT_TRUE(devices.Add("b", "Corvex1").Succeeded());
    EXPECT_TRUE(devices.Add("a", "Corvex1").Succeeded());
  }

  bool Connected(const std::string& urn) const
  {
    Simulation::DeviceState state;
    EXPECT_TRUE(devices.State(urn, state).Succeeded());
    return state.connected;
  }

  Simulation::Devices devices{store};
  std::shared_ptr<ManualAsioPostal> postal = std::make_shared<ManualAsioPostal>();
  std::shared_ptr<Simulation::VDeviceServices> services =
      std::make_shared<Simulation::VDeviceServices>(store, postal, std::chrono::milliseconds(1));
};

TEST_F(DeviceServicesTest, TellsTheDevicesAndTheirChanges)
{
  EXPECT_TRUE(devices.SetCharging("b", true).Succeeded());
  EXPECT_TRUE(devices.SetBattery("b", 40).Succeeded());
  EXPECT_THAT(services->Devices(),
              ElementsAre(Device{"a", "Corvex1", true, false, 100}, Device{"b", "Corvex1", true, true, 40}));

  const auto gui = std::make_shared<ManualPostal>();
  int told = 0;
  auto subscription = services->OnChange(gui, [&] { ++told; });
  SetApplication("Application/Devices2/a/Type", std::string("T"));
  EXPECT_TRUE(devices.Remove("b").Succeeded());
  gui->RunAll();
  EXPECT_EQ(told, 1);
  EXPECT_TRUE(services->Reboot("a").Succeeded());
  gui->RunAll();
  EXPECT_EQ(told, 2);
  subscription.reset();
  EXPECT_TRUE(postal->RunOne());
  EXPECT_EQ(gui->RunAll(), 0);
}

TEST_F(DeviceServicesTest, ARebootDisconnectsADeviceForATime)
{
  EXPECT_EQ(services->Reboot("none"), IResult(EResult::NotFound));
  EXPECT_EQ(services->Reboot("a"), IResult(EResult::Ok));
  EXPECT_FALSE(Connected("a"));
  EXPECT_TRUE(Connected("b"));
  EXPECT_EQ(services->Reboot("a"), IResult(EResult::NotConnected));
  EXPECT_TRUE(postal->RunOne());
  EXPECT_TRUE(Connected("a"));
  EXPECT_FALSE(postal->RunOne()) << "nothing is left to run";

  EXPECT_TRUE(devices.SetConnected("b", false).Succeeded());
  EXPECT_EQ(services->Reboot("b"), IResult(EResult::NotConnected));
  EXPECT_FALSE(postal->RunOne());

  archive.full = true;
  EXPECT_EQ(services->Reboot("a"), IResult(EResult::DiskFull));
  EXPECT_TRUE(Connected("a"));
  EXPECT_FALSE(postal->RunOne()) << "nothing was begun";
}

TEST_F(DeviceServicesTest, ARebootThatWasReplacedOrWhoseDeviceIsGoneHasNoEffect)
{
  EXPECT_TRUE(services->Reboot("a").Succeeded());
  EXPECT_TRUE(devices.SetConnected("a", true).Succeeded());
  EXPECT_TRUE(services->Reboot("a").Succeeded());
  EXPECT_TRUE(postal->RunOne());
  EXPECT_FALSE(Connected("a")) << "the first timer was replaced";
  EXPECT_TRUE(postal->RunOne());
  EXPECT_TRUE(Connected("a"));

  EXPECT_TRUE(services->Reboot("a").Succeeded());
  EXPECT_TRUE(devices.Remove("a").Succeeded());
  EXPECT_TRUE(devices.Add("a", "Corvex1").Succeeded());
  EXPECT_TRUE(devices.SetConnected("a", false).Succeeded());
  const LogCapture log;
  EXPECT_TRUE(postal->RunOne());
  EXPECT_FALSE(Connected("a")) << "another device of that name";
  EXPECT_TRUE(devices.SetConnected("a", true).Succeeded());
  EXPECT_TRUE(services->Reboot("a").Succeeded());
  EXPECT_TRUE(devices.Remove("a").Succeeded());
  EXPECT_TRUE(postal->RunOne());
  EXPECT_FALSE(postal->RunOne()) << "it is not tried again";
  EXPECT_THAT(log.messages, testing::IsEmpty());
}

TEST_F(DeviceServicesTest, ARebootOutlivesARestartAndAFullDisk)
{
  EXPECT_TRUE(services->Reboot("a").Succeeded());
  services->Stop();
  while (postal->RunOne())
    ;
  EXPECT_FALSE(Connected("a")) << "nothing edits the store any more";
  EXPECT_TRUE(services->Reboot("b").Succeeded());
  EXPECT_FALSE(postal->RunOne());

  services = std::make_shared<Simulation::VDeviceServices>(store, postal, std::chrono::milliseconds(1));
  EXPECT_TRUE(postal->RunOne() && postal->RunOne());
  EXPECT_TRUE(Connected("a") && Connected("b"));

  EXPECT_TRUE(services->Reboot("a").Succeeded());
  archive.full = true;
  const LogCapture log;
  EXPECT_TRUE(postal->RunOne());
  EXPECT_FALSE(Connected("a"));
  EXPECT_THAT(log.messages, ElementsAre(HasSubstr("DiskFull")));
  archive.full = false;
  EXPECT_TRUE(postal->RunOne());
  EXPECT_TRUE(Connected("a"));
}

}
