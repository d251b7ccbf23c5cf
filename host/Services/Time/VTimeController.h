#pragma once

#include "NotificationSystem/VSubscriptions.h"
#include "Services/Time/VSourceMap.h"
#include "Services/Time/VTimeSource.h"

#include <map>
#include <memory>
#include <string>

namespace Services
{

/// Chooses the current time source, seeks and plays it. Held by shared pointer; UI thread. All signals are raised
/// later, on the UI postal service, once for a burst.
class VTimeController : public OrvanePluginInterface::ITimeController,
                        public std::enable_shared_from_this<VTimeController>
{
public:
    explicit VTimeController(std::shared_ptr<TQL::IPostalService> i_pUiPostalService,
                             ThreadCheckPointer i_pCheck = nullptr);

    std::shared_ptr<OrvanePluginInterface::ISourceMap> GetSourceMap() const override;
    void GetCurrentSourceName(std::string& o_rName) const override;
    std::shared_ptr<OrvanePluginInterface::ITimeSource> GetCurrentSource() const override;
    void SeekTo(std::int64_t i_Tick) override; ///< no effect in live mode or without a source
    std::shared_ptr<TQL::IChangeSignal> SourceListChanged() const override;
    std::shared_ptr<TQL::IChangeSignal> CurrentSourceChanged() const override;

    /// Makes a source and adds it; i_Mode is an OrvanePluginInterface::ETimeMode. One of that name is replaced.
    std::shared_ptr<VTimeSource> AddSource(const std::string& i_rName, int i_Mode);
    /// When it was the current one there is none until another is chosen. False for an unknown name.
    bool RemoveSource(const std::string& i_rName);
    std::shared_ptr<VTimeSource> FindSource(std::string_view i_Name) const; ///< null when unknown
    /// Stops play. False for an unknown name, which changes nothing; the empty name leaves no current source.
    bool SetCurrentSource(const std::string& i_rName);

    /// Plays the current source if it is in review mode; at the end of the range it starts again from the other end.
    void Play(double i_Rate = 1.0);
    void Pause();
    bool IsPlaying() const { return m_bPlaying; }
    double Rate() const { return m_Rate; }
    void SetRate(double i_Rate); ///< of this play and the ones that follow; 0 does nothing
    /// Whether play goes round and round: over the marks of the current source, or all of it where it has none.
    void SetLooping(bool i_bLooping);
    bool IsLooping() const { return m_bLooping; }
    void SetMarks(const TQL::TickRange& i_rMarks); ///< of the current source; an empty range takes them away
    TQL::TickRange Marks() const;                  ///< of the current source; empty when it has none
    /// Moves a playing source on by this much real time, in ticks. Without a loop it is paused at the end.
    void Advance(std::int64_t i_ElapsedTicks);

    /// Play began or ended, or rate, loop or marks changed. Not part of the interface that a plug-in sees.
    std::shared_ptr<TQL::IChangeSignal> PlayChanged() const;

private:
    std::shared_ptr<VTimeSource> CurrentReview() const;
    void FollowCurrent();
    void HandleModeChanged();
    void SetPlaying(bool i_bPlaying, double i_Rate);

    const std::shared_ptr<TQL::IPostalService> m_pUiPostalService;
    const ThreadCheckPointer m_pCheck;
    VDeferredSignal m_SourceListSignal;
    VDeferredSignal m_CurrentSourceSignal;
    VDeferredSignal m_PlaySignal;
    const std::shared_ptr<VSourceMap> m_pSourceMap;
    std::string m_CurrentName;
    std::map<std::string, TQL::TickRange> m_Marks;         ///< by source name
    NotificationSystem::VSubscriptions m_ModeSubscription; ///< of the current source
    bool m_bPlaying = false;
    double m_Rate = 1.0;
    bool m_bLooping = false;
};

} // namespace Services
