#pragma once

// The one place that includes Boost.Asio, so that a repair for a compiler or a Boost version has one home.

#include <utility> // Boost 1.74 uses std::exchange without it

#include <boost/asio/any_io_executor.hpp>
#include <boost/asio/basic_waitable_timer.hpp>
#include <boost/asio/executor_work_guard.hpp>
#include <boost/asio/io_context.hpp>
#include <boost/asio/post.hpp>
#include <boost/asio/strand.hpp>

namespace NotificationSystem
{

/// The polymorphic executor that postal services hand on.
using Executor = boost::asio::any_io_executor;

} // namespace NotificationSystem
