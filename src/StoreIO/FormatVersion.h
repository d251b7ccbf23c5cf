#pragma once

#include "TQL/RapidJson.h"

namespace StoreIO
{

/// Whether the document, an object, is of a format version that this system reads. If not, why is in the log.
bool HasSupportedVersion(const rapidjson::Value& i_rRoot);

} // namespace StoreIO
