#pragma once

#include "HostInterface/NMX/IAsioPostalService.h"

#include <boost/asio/io_context.hpp>
#include <boost/asio/post.hpp>

#include <chrono>
#include <utility>

/// A postal service whose tasks and timers run when the test says so.
struct ManualAsioPostal : NMX::IAsioPostalService
{
  void Post(std::function<void()> task) override { boost::asio::post(context, std::move(task)); }
  boost::asio::io_context& Context() override { return context; }

  /// Runs the next task, for which it waits for a while if there is only a timer. False when there is nothing to run.
  bool RunOne()
  {
    context.restart();
    return context.run_one_for(std::chrono::seconds(20)) != 0;
  }

  boost::asio::io_context context;
};
