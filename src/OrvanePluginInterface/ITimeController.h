#pragma once

#include "TQL/IMultiCallback.h"

#include <cstdint>
#include <functional>
#include <memory>
#include <set>
#include <string>
#include <string_view>

namespace OrvanePluginInterface
{

/// Where a time source stands, in ticks. N frames of period P from frame f: FirstTick = f P, LengthTicks = N P, so the
/// latest frame is f + N - 1.
struct TimeState
{
    std::int64_t FirstTick = 0;
    std::int64_t LengthTicks = 0;
    std::int64_t Unused2 = 0;
    std::int64_t FramePeriodTicks = 0;
    std::int64_t Unused4 = 0;
    std::int64_t Unused5 = 0;
    std::int64_t CurrentTick = 0;
};

namespace ETimeMode
{
constexpr int Live = 0;
constexpr int Review = 2;
} // namespace ETimeMode

/// One time: the live capture or a recording. Its name is that of its channel context. UI thread for calls; the signals
/// may be raised on any thread.
class ITimeSource
{
public:
    virtual int GetMode() const = 0; ///< an ETimeMode; any other value is neither live nor review
    virtual bool GetTimeState(TimeState& o_rState) const = 0; ///< false when there is none
    virtual std::shared_ptr<TQL::IChangeSignal> StateChanged() const = 0;
    virtual std::shared_ptr<TQL::IChangeSignal> SecondStateChanged() const = 0; ///< may be the same signal
    virtual ~ITimeSource() = default;
};

/// The known time sources by name. UI thread.
class ISourceMap
{
public:
    virtual std::set<std::string> GetNames() const = 0;
    virtual std::shared_ptr<ITimeSource> Find(std::string_view i_Name) const = 0; ///< null when unknown
    /// In the order of the names.
    virtual void
    ForEach(const std::function<void(const std::string&, const std::shared_ptr<ITimeSource>&)>& i_rVisit) const = 0;
    virtual std::shared_ptr<TQL::IChangeSignal> Changed() const = 0;
    virtual ~ISourceMap() = default;
};

/// Chooses the current time source and moves it. UI thread for calls; the signals may be raised on any thread.
class ITimeController
{
public:
    virtual std::shared_ptr<ISourceMap> GetSourceMap() const = 0;
    virtual void GetCurrentSourceName(std::string& o_rName) const = 0; ///< empty when there is none
    virtual std::shared_ptr<ITimeSource> GetCurrentSource() const = 0; ///< null when there is none

    /// Clamps to the range of the source; StateChanged follows later, never from inside this call.
    virtual void SeekTo(std::int64_t i_Tick) = 0;

    virtual std::shared_ptr<TQL::IChangeSignal> SourceListChanged() const = 0;
    /// The current source, or the mode of the current source, has changed.
    virtual std::shared_ptr<TQL::IChangeSignal> CurrentSourceChanged() const = 0;
    virtual ~ITimeController() = default;
};

class ITimeControllerRegistry
{
public:
    /// Null for an unknown name. "default" exists before a plug-in is initialised.
    virtual void GetTimeController(std::string_view i_Name, std::shared_ptr<ITimeController>& o_rpController) const = 0;
    virtual ~ITimeControllerRegistry() = default;
};

} // namespace OrvanePluginInterface
