#include "StandaloneHost/Postal/VAsioPostalService.h"

#include "HostInterface/DebugServices/CallAssertFailHandler.h"
#include "HostInterface/NMX/GlobalLog.h"

#include <boost/asio/executor_work_guard.hpp>
#include <boost/asio/io_context.hpp>
#include <boost/asio/post.hpp>

#include <exception>
#include <optional>
#include <thread>
#include <utility>

namespace Postal
{

struct VAsioPostalService::State
{
  boost::asio::io_context context{1}; // one thread runs it
  std::optional<boost::asio::executor_work_guard<boost::asio::io_context::executor_type>> open{context.get_executor()};
  std::thread thread;

  void Run()
  {
    for (;;)
    {
      try
      {
        context.run();
        return;
      }
      catch (const std::exception& failure)
      {
        // A task must not throw; one that does ends alone.
        NMX::Log(NMX::systemLog, NMX::ESeverity::Critical, "A posted task failed: %1%", failure.what());
      }
      catch (...)
      {
        NMX::Log(NMX::systemLog, NMX::ESeverity::Critical, "A posted task failed.");
      }
    }
  }
};

VAsioPostalService::VAsioPostalService() : m_state(std::make_unique<State>())
{
  m_state->thread = std::thread([state = m_state.get()] { state->Run(); });
}

VAsioPostalService::~VAsioPostalService()
{
  if (m_state->thread.joinable())
  {
    DebugServices::CallAssertFailHandler("the postal service was stopped", __FILE__, __LINE__);
    Stop();
  }
}

void VAsioPostalService::Post(std::function<void()> task)
{
  boost::asio::post(m_state->context.get_executor(), std::move(task));
}

boost::asio::io_context& VAsioPostalService::Context()
{
  return m_state->context;
}

void VAsioPostalService::Stop()
{
  m_state->open.reset();
  if (m_state->thread.joinable())
    m_state->thread.join();
}

}
