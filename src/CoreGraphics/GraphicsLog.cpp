#include "CoreGraphics/GraphicsLog.h"

namespace CoreGraphics
{

TQL::VLogCategory& GraphicsLog()
{
    static TQL::VLogCategory& rCategory = TQL::Log::GetCategory("CoreGraphics");
    return rCategory;
}

} // namespace CoreGraphics
