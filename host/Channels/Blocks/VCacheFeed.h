#pragma once

#include "Channels/Blocks/ISampleSource.h"
#include "Channels/Blocks/VRotationUnwrapper.h"
#include "Channels/Samples/VSampleStore.h"

#include <cstdint>
#include <memory>
#include <mutex>
#include <optional>
#include <span>
#include <vector>

namespace Channels
{

struct BlockWindow;

/// Keeps the samples of a source, be they another block's or computed, in a store of its own as they come, with
/// rotations made continuous if asked to. Keeps at least the window that it was given; when the window grows it fetches
/// what the source still has of the time before, and it forgets what a source without a window has forgotten. A
/// channel's block asks it to follow, on the reader's thread. Thread-safe.
class VCacheFeed
{
public:
    /// i_pWindow null: everything that the source has.
    VCacheFeed(std::shared_ptr<const ISampleSource> i_pInput, std::optional<RotationPart> i_Rotation,
               std::shared_ptr<const BlockWindow> i_pWindow);

    const std::shared_ptr<VSampleStore>& GetSamples() const { return m_pSamples; }

    /// The source where its samples are kept as they are; null where they are altered.
    std::shared_ptr<const ISampleSource> GetPlainSource() const { return m_Rotation ? nullptr : m_pInput; }

    /// Takes over everything that the source has.
    void CatchUp();

    /// Takes over at most 8192 rows at either end, a millisecond or two of computing, for readers that come again and
    /// again and must not be kept waiting: a day of a recording takes seconds.
    void CatchUpByStep();

private:
    void CatchUp(std::int64_t i_MostTicks); ///< at either end
    void StartLocked(std::int64_t i_Tick);
    void AppendLocked(const TQL::TickRange& i_rRange);
    void PrependLocked(const TQL::TickRange& i_rRange);
    bool ReadLocked(const TQL::TickRange& i_rRange);
    VRotationUnwrapper BackwardsUnwrapperLocked();

    const std::shared_ptr<const ISampleSource> m_pInput;
    const std::optional<RotationPart> m_Rotation;
    const std::shared_ptr<const BlockWindow> m_pWindow;
    const std::int64_t m_Period;
    const std::size_t m_Components;
    const std::shared_ptr<VSampleStore> m_pSamples;
    std::mutex m_Mutex;
    std::vector<float> m_Scratch;                  // guarded by m_Mutex
    std::optional<VRotationUnwrapper> m_Unwrapper; // guarded by m_Mutex
    bool m_bStarted = false;                       // guarded by m_Mutex
};

} // namespace Channels
