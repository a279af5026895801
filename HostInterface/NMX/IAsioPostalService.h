#pragma once

#include "HostInterface/NMX/IPostalService.h"

namespace boost::asio
{
class io_context;
}

namespace NMX
{

/// A postal service over an asio context, on which strands can be made. [any]
class IAsioPostalService : public IPostalService
{
public:
  /// The context; it lives as long as the postal service.
  virtual boost::asio::io_context& Context() = 0;
};

}
