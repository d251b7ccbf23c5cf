#pragma once

#include "StoreInterface/IStoreWriter.h"

#include <string>

namespace Store
{

/// The text form of a property map that IStoreWriter::SetPropertyMap describes.
std::string WriteProperties(const TQL::PropertyMap& i_rProperties);

} // namespace Store
