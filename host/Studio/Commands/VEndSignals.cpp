#include "Studio/Commands/VEndSignals.h"

#include <QtCore/QSocketNotifier>
#include <QtCore/QtGlobal>

#include <utility>

#ifdef Q_OS_UNIX
#include <csignal>

#include <fcntl.h>
#include <unistd.h>
#endif

namespace Studio
{

#ifdef Q_OS_UNIX

namespace
{

constexpr int endingSignals[] = {SIGINT, SIGTERM, SIGHUP};

int s_Pipe[2] = {-1, -1}; // the end of a handler, which may do no more than write, and the end of the event loop

void HandleSignal(int i_Signal)
{
    const char byte = static_cast<char>(i_Signal);
    (void)!::write(s_Pipe[1], &byte, 1);
}

} // namespace

VEndSignals::VEndSignals(QObject* i_pParent) : QObject(i_pParent)
{
    if (::pipe2(s_Pipe, O_CLOEXEC | O_NONBLOCK) != 0)
        return;
    m_pNotifier = new QSocketNotifier(s_Pipe[0], QSocketNotifier::Read, this);
    connect(m_pNotifier, &QSocketNotifier::activated, this,
            [this]
            {
                char byte = 0;
                if (::read(s_Pipe[0], &byte, 1) == 1)
                    Q_EMIT Asked();
            });
    for (const int number : endingSignals)
    {
        struct sigaction before = {};
        struct sigaction action = {};
        action.sa_handler = HandleSignal;
        action.sa_flags = static_cast<int>(SA_RESETHAND | SA_RESTART);
        if (::sigaction(number, nullptr, &before) == 0 && before.sa_handler != SIG_IGN)
            ::sigaction(number, &action, nullptr);
    }
}

VEndSignals::~VEndSignals()
{
    for (const int number : endingSignals)
    {
        struct sigaction action = {};
        if (::sigaction(number, nullptr, &action) == 0 && action.sa_handler == HandleSignal)
            std::signal(number, SIG_DFL);
    }
    delete m_pNotifier;
    for (int& rEnd : s_Pipe)
        if (rEnd >= 0)
            ::close(std::exchange(rEnd, -1));
}

#else

VEndSignals::VEndSignals(QObject* i_pParent) : QObject(i_pParent) {}
VEndSignals::~VEndSignals() = default;

#endif

} // namespace Studio
