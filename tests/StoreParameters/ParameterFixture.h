#pragma once

#include "Store/VStore.h"
#include "StoreInterface/ScopedAccess.h"
#include "StoreParameters/ParameterDefinition.h"
#include "TQL/SchemaIntern.h"
#include "support/LogGuard.h"

#include <memory>
#include <string>
#include <utility>

namespace ParameterTest
{

using namespace Store;

inline std::shared_ptr<TQL::IStore> MakeStore()
{
    return TQL::MakeShared<VStore>();
}

inline ParameterDefinition Define(std::string i_Key, TagTable i_Tags = {}, TQL::EType i_Type = TQL::EType::Int32)
{
    return {std::move(i_Key), &TQL::IO::GetUniquePodSchema(i_Type), std::move(i_Tags), {}, 0};
}

/// The lines that were logged, each with its severity.
inline std::string TakeLog(TestSupport::LogGuard& io_rGuard)
{
    std::string text;
    for (const auto& rEntry : io_rGuard.Take())
        text += std::to_string(static_cast<int>(rEntry.Severity)) + " " + rEntry.Text + "\n";
    return text;
}

} // namespace ParameterTest
