#include "GraphPlotSystem/Common/SharedObject.h"

#include <QtCore/QCoreApplication>
#include <QtCore/QEvent>

#include <gtest/gtest.h>

#include <thread>

using namespace GraphPlotUI;

namespace
{

class Probe : public QObject, public TQL::VShared
{
public:
    explicit Probe(std::thread::id& o_rDiedOn) : m_rDiedOn(o_rDiedOn) {}
    ~Probe() override { m_rDiedOn = std::this_thread::get_id(); }

    bool bHookRan = false;

protected:
    void OnPostCreation() override { bHookRan = WeakSelf(this).lock().get() == this; }

private:
    std::thread::id& m_rDiedOn;
};

} // namespace

TEST(SharedObject, DiesOnItsOwnThreadWhoeverLetsGoLast)
{
    std::thread::id diedOn;
    auto pProbe = MakeSharedObject<Probe>(diedOn);
    EXPECT_TRUE(pProbe->bHookRan);
    pProbe.reset();
    EXPECT_EQ(diedOn, std::this_thread::get_id()) << "at once on its own thread";

    diedOn = {};
    pProbe = MakeSharedObject<Probe>(diedOn);
    std::thread([pLast = std::move(pProbe)]() mutable { pLast.reset(); }).join();
    EXPECT_EQ(diedOn, std::thread::id()) << "not on the other thread";
    QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
    EXPECT_EQ(diedOn, std::this_thread::get_id());
}
