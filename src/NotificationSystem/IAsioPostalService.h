#pragma once

#include "NotificationSystem/Asio.h"
#include "TQL/IPostalService.h"

#include <memory>

namespace TQL
{

/// A postal service that stands on an io_context, so that strands and timers can be built on it. Thread-safe.
class IAsioPostalService : public IPostalService
{
public:
    virtual const std::shared_ptr<NotificationSystem::Executor>& GetExecutor() const = 0;
    virtual const std::shared_ptr<boost::asio::io_context>& GetContext() const = 0;
};

} // namespace TQL
