#include "HostInterface/NotificationSystem/VAsioPostalServiceStrand.h"

#include <boost/asio/io_context.hpp>
#include <boost/asio/post.hpp>
#include <boost/asio/strand.hpp>

#include <utility>

namespace NotificationSystem
{

struct VAsioPostalServiceStrand::State
{
  std::shared_ptr<NMX::IAsioPostalService> postal;
  boost::asio::strand<boost::asio::io_context::executor_type> strand;
};

VAsioPostalServiceStrand::VAsioPostalServiceStrand(std::shared_ptr<NMX::IAsioPostalService> postal)
{
  auto strand = boost::asio::make_strand(postal->Context().get_executor());
  m_state = std::unique_ptr<State>(new State{std::move(postal), std::move(strand)});
}

VAsioPostalServiceStrand::~VAsioPostalServiceStrand() = default;

void VAsioPostalServiceStrand::Post(std::function<void()> task)
{
  boost::asio::post(m_state->strand, std::move(task));
}

}
