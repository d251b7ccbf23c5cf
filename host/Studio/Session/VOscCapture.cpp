#include "Studio/Session/VOscCapture.h"

#include "Channels/Contexts/VLiveContext.h"
#include "Studio/Session/ContextNames.h"
#include "TQL/Log.h"

#include <chrono>
#include <optional>
#include <utility>

namespace Studio
{

namespace
{

constexpr std::chrono::seconds warnEvery{30};

void Log(TQL::ELogSeverity i_Severity, const std::string& i_rText,
         const TQL::LogPlace& i_rPlace = std::source_location::current())
{
    TQL::Log::Write(TQL::Log::GetCategory("Live"), i_Severity, i_rText, i_rPlace);
}

} // namespace

struct VOscCapture::Shared
{
    std::shared_ptr<TQL::IPostalService> pUi;
    Show OnShow; ///< UI thread; empty when the capture is gone
    Warn OnWarn; ///< the same
    // The input's thread, or before it begins.
    std::shared_ptr<Channels::VLiveContext> pContext;
    std::optional<std::chrono::steady_clock::time_point> WarnedAt;

    static void PostShow(const std::shared_ptr<Shared>& i_rpShared)
    {
        i_rpShared->pUi->Post(
            [i_rpShared, pContext = i_rpShared->pContext]
            {
                if (i_rpShared->OnShow)
                    i_rpShared->OnShow(pContext);
            });
    }

    static void Report(const std::shared_ptr<Shared>& i_rpShared, const std::string& i_rText)
    {
        Log(TQL::ELogSeverity::Warning, i_rText);
        const auto now = std::chrono::steady_clock::now();
        if (i_rpShared->WarnedAt && now - *i_rpShared->WarnedAt < warnEvery)
            return;
        i_rpShared->WarnedAt = now;
        i_rpShared->pUi->Post(
            [i_rpShared, i_rText]
            {
                if (i_rpShared->OnWarn)
                    i_rpShared->OnWarn(i_rText);
            });
    }
};

VOscCapture::VOscCapture(const Streaming::VOscInput::Options& i_rOptions,
                         std::shared_ptr<Channels::VSubTypeTable> i_pSubTypes,
                         std::shared_ptr<TQL::IPostalService> i_pUi, Show i_Show, Warn i_Warn)
    : m_pShared(std::make_shared<Shared>())
{
    m_pShared->pUi = std::move(i_pUi);
    m_pShared->OnShow = std::move(i_Show);
    m_pShared->OnWarn = std::move(i_Warn);
    Streaming::VOscInput::Callbacks callbacks;
    callbacks.MakeContext = [pShared = m_pShared, i_pSubTypes](double, std::int64_t i_FramePeriod)
    {
        Channels::VLiveContext::Options options;
        options.FramePeriod = i_FramePeriod;
        pShared->pContext = std::make_shared<Channels::VLiveContext>(LiveContextName, i_pSubTypes, options);
        Shared::PostShow(pShared);
        return pShared->pContext;
    };
    callbacks.ChannelsAdded = [pShared = m_pShared]
    {
        Shared::PostShow(pShared);
    };
    callbacks.Note = [](const std::string& i_rText)
    {
        Log(TQL::ELogSeverity::Information, i_rText);
    };
    callbacks.Trouble = [pShared = m_pShared](const std::string& i_rText)
    {
        Shared::Report(pShared, i_rText);
    };
    m_pInput = std::make_unique<Streaming::VOscInput>(i_rOptions, std::move(callbacks));
}

VOscCapture::~VOscCapture()
{
    m_pInput.reset();
    m_pShared->OnShow = nullptr;
    m_pShared->OnWarn = nullptr;
}

} // namespace Studio
