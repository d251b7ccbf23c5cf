#pragma once

#include <QtCore/QObject>

#include <cstdint>

/// How traces are spread over subplots. The numbers are written to files.
namespace TQL::SubplotLayoutModes
{

Q_NAMESPACE

enum ESubplotLayoutModes : std::int32_t
{
    SubplotPerTraceType = 0, ///< one for each component of each channel subtype
    SingleSubplot = 1
};
Q_ENUM_NS(ESubplotLayoutModes)

} // namespace TQL::SubplotLayoutModes

namespace GraphPlotUI
{

using ESubplotLayoutModes = TQL::SubplotLayoutModes::ESubplotLayoutModes;

} // namespace GraphPlotUI
