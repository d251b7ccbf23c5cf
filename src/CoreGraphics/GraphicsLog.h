#pragma once

#include "TQL/Log.h"

namespace CoreGraphics
{

/// The category of all messages of this library.
TQL::VLogCategory& GraphicsLog();

} // namespace CoreGraphics
