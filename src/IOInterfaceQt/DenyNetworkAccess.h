#pragma once

class QQmlEngine;

namespace TQL::IO
{

/// Takes the network away from an engine: each request of what it loads ends at once with ContentAccessDenied, and
/// nothing leaves the computer. Resources and local files are no requests. To be called before the engine loads
/// anything. UI thread.
void DenyNetworkAccess(QQmlEngine& i_rEngine);

} // namespace TQL::IO
