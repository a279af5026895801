#include "SubjectStoreUI/VSubjectCalibrationQml.h"

#include "HostInterface/RunaCorePluginInterface/ICalibrationProvider.h"
#include "RunaCorePluginSubjectStore/SubjectCalibrationServices/VSubjectCalibrationServices.h"
#include "StoreInterface/SettingsPaths.h"
#include "SubjectStoreUI/PanelBackend.h"

#include <QPointer>

#include <array>
#include <string>
#include <utility>

namespace SubjectStoreUI
{

using NMX::EResult;
using NMX::IResult;
using Service = SubjectCalibrationServices::VSubjectCalibrationServices;

struct VSubjectCalibrationQml::Implementation
{
  explicit Implementation(std::shared_ptr<NMX::IStore> subjects) : store(std::move(subjects)) {}

  /// The subject of the new name, if there is one, is what a recalibration works on.
  void TargetNamedSubject()
  {
    std::string name;
    NMX::TSubjectStoreId subject;
    {
      const auto reader = store->Reader();
      const auto* value = reader->FindApplicationEntry(NMX::PathOf(NMX::ESetting::CreateSubjectName));
      if (const auto* text = value != nullptr ? std::get_if<std::string>(value) : nullptr)
        name = *text;
      (void)reader->FindByName(name, subject);
    }
    if (subject.Valid() && subject != target)
      (void)controller->SetTargetSubject(subject);
    target = subject;
  }

  using Can = bool (NMX::ISubjectCalibrationServices::*)(std::string&) const;

  /// Why something is not possible; empty when it is.
  [[nodiscard]] QString Obstacle(Can can) const
  {
    std::string reason;
    if ((service.get()->*can)(reason))
      return {};
    return reason.empty() ? QString("This is not possible at present.") : QString::fromStdString(reason);
  }

  /// Carries out an action; a failure has the obstacle for its reason, if there is one.
  template <class Act>
  [[nodiscard]] VResultGadget Perform(Can can, Act act)
  {
    const QString obstacle = Obstacle(can);
    if (!obstacle.isEmpty())
      return {EResult::NotAvailable, obstacle.toStdString()};
    return act(*service);
  }

  const std::shared_ptr<NMX::IStore> store;
  std::shared_ptr<ISubjectCalibrationController> controller;
  std::shared_ptr<Service> service;
  NMX::TSubjectStoreId target;
  std::array<NMX::Subscription, 3> subscriptions;
};

VSubjectCalibrationQml::VSubjectCalibrationQml(const PanelBackend& backend,
                                               const RunaCorePluginInterface::ICalibrationProvider& provider)
    : m_implementation(std::make_unique<Implementation>(backend.store))
{
  std::shared_ptr<ISubjectCreator> creator;
  std::shared_ptr<ICalibrationNotifications> notifications;
  provider.Controller(m_implementation->controller);
  provider.SubjectCreator(creator);
  provider.Notifications(notifications);
  m_implementation->service =
      Service::Make(backend.store, m_implementation->controller, creator, *notifications, backend.gui);
  const auto tell = [self = QPointer<VSubjectCalibrationQml>(this)]
  {
    if (!self)
      return;
    self->m_implementation->TargetNamedSubject();
    Q_EMIT self->changed();
  };
  m_implementation->TargetNamedSubject();
  m_implementation->subscriptions = {
      notifications->StateChanged()->Subscribe(backend.gui, tell),
      notifications->PossibilitiesChanged()->Subscribe(backend.gui, tell),
      backend.store->OnChange(std::string(NMX::PathOf(NMX::ESetting::Root).Text()) + "/*", backend.gui, tell)};
}

VSubjectCalibrationQml::~VSubjectCalibrationQml() = default;

QString VSubjectCalibrationQml::state() const
{
  switch (m_implementation->controller->Phase())
  {
  case 1:
    return tr("Looking for the T-pose");
  case 2:
    return tr("Calibrating, first pass");
  case 3:
    return tr("Calibrating, second pass");
  default:
    return tr("Not running");
  }
}

bool VSubjectCalibrationQml::running() const
{
  const std::uint32_t phase = m_implementation->controller->Phase();
  return phase >= 1 && phase <= 3;
}

QString VSubjectCalibrationQml::lastResult() const
{
  const IResult last = m_implementation->controller->LastResult();
  if (last == EResult::NotSet)
    return {};
  if (last == EResult::Canceled)
    return tr("The last calibration was cancelled.");
  return last.Succeeded() ? tr("The last calibration was completed.")
                          : tr("The last calibration failed: %1").arg(VResultGadget(last).Reason());
}

QString VSubjectCalibrationQml::cannotStart() const
{
  return m_implementation->Obstacle(&NMX::ISubjectCalibrationServices::CanStartSubjectCalibration);
}

QString VSubjectCalibrationQml::cannotRecalibrate() const
{
  return m_implementation->Obstacle(&NMX::ISubjectCalibrationServices::CanStartSubjectRecalibration);
}

QString VSubjectCalibrationQml::cannotAcceptTPose() const
{
  return m_implementation->Obstacle(&NMX::ISubjectCalibrationServices::CanAcceptTPose);
}

QString VSubjectCalibrationQml::cannotStop() const
{
  return m_implementation->Obstacle(&NMX::ISubjectCalibrationServices::CanStopSubjectCalibration);
}

QString VSubjectCalibrationQml::cannotCancel() const
{
  return m_implementation->Obstacle(&NMX::ISubjectCalibrationServices::CanCancelSubjectCalibration);
}

VResultGadget VSubjectCalibrationQml::start()
{
  return m_implementation->Perform(&NMX::ISubjectCalibrationServices::CanStartSubjectCalibration,
                                   [](Service& service)
                                   {
                                     NMX::TCalibrationSessionId session;
                                     return service.StartSubjectCalibration(session, {});
                                   });
}

VResultGadget VSubjectCalibrationQml::recalibrate()
{
  return m_implementation->Perform(&NMX::ISubjectCalibrationServices::CanStartSubjectRecalibration,
                                   [](Service& service)
                                   {
                                     NMX::TCalibrationSessionId session;
                                     return service.StartSubjectRecalibration(session, {});
                                   });
}

VResultGadget VSubjectCalibrationQml::acceptTPose()
{
  return m_implementation->Perform(&NMX::ISubjectCalibrationServices::CanAcceptTPose, [this](Service& service)
                                   { return service.AcceptTPose(m_implementation->controller->Session()); });
}

VResultGadget VSubjectCalibrationQml::stop()
{
  return m_implementation->Perform(&NMX::ISubjectCalibrationServices::CanStopSubjectCalibration,
                                   [this](Service& service)
                                   { return service.StopSubjectCalibration(m_implementation->controller->Session()); });
}

VResultGadget VSubjectCalibrationQml::cancel()
{
  return m_implementation->Perform(
      &NMX::ISubjectCalibrationServices::CanCancelSubjectCalibration,
      [this](Service& service) { return service.CancelSubjectCalibration(m_implementation->controller->Session()); });
}

}
