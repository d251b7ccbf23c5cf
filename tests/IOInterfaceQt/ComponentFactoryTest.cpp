#include "IOInterfaceQt/QmlComponentFactory.h"
#include "support/LogGuard.h"

#include <QtCore/QCoreApplication>
#include <QtCore/QDir>
#include <QtCore/QFile>
#include <QtCore/QTemporaryDir>
#include <QtQml/QQmlComponent>
#include <QtQml/QQmlEngine>

#include <gtest/gtest.h>

namespace
{

using TQL::IO::QmlComponentFactory;

class ComponentFactory : public ::testing::Test
{
protected:
    ComponentFactory() { TQL::Log::SetDefaultThreshold(TQL::ELogSeverity::Detail); }
    ~ComponentFactory() override { TQL::Log::SetDefaultThreshold(TQL::ELogSeverity::Information); }

    void Write(const char* i_pName, const char* i_pText)
    {
        QFile file(m_Folder.filePath(i_pName));
        QDir().mkpath(QFileInfo(file).path());
        ASSERT_TRUE(file.open(QIODevice::WriteOnly));
        file.write(i_pText);
    }

    /// What was logged, with the folder cut out: "6 Component a.qml ready." a line.
    std::string TakeLog()
    {
        std::string text;
        for (const TestSupport::LogGuard::Entry& rEntry : m_Log.Take())
            text += std::to_string(static_cast<int>(rEntry.Severity)) + " " + rEntry.Text + "\n";
        return QString::fromStdString(text).replace("file://" + m_Folder.path() + "/", "").toStdString();
    }

    TestSupport::LogGuard m_Log;
    QTemporaryDir m_Folder;
    QQmlEngine m_Engine;
};

TEST_F(ComponentFactory, TakesTheFirstFolderThatHasIt)
{
    Write("a/x/Thing.qml", "import QtQml\nQtObject { property int number: 1 }");
    Write("b/x/Thing.qml", "import QtQml\nQtObject { property int number: 2 }");
    Write("b/Broken.qml", "import QtQml\nQtObject { property nothing number }");
    const QStringList folders{m_Folder.filePath("none"), m_Folder.filePath("a"), m_Folder.filePath("b")};
    const QmlComponentFactory factory(&m_Engine, true);

    const auto pComponent = factory.CreateComponent("x/../x/Thing.qml", folders);
    EXPECT_EQ(TakeLog(), "6 Component a/x/Thing.qml ready.\n");
    int number = 0;
    QmlComponentFactory::CreateObject(pComponent, [&number](std::unique_ptr<QObject> i_pObject)
                                      { number = i_pObject ? i_pObject->property("number").toInt() : -1; });
    EXPECT_EQ(number, 1);

    EXPECT_FALSE(factory.CreateComponent("Broken.qml", folders));
    EXPECT_NE(TakeLog().find("2 Component b/Broken.qml failed to load: "), std::string::npos);
    EXPECT_FALSE(factory.CreateComponent("Absent.qml", folders));
    EXPECT_EQ(TakeLog(), "2 Component Absent.qml was null.\n");
    EXPECT_FALSE(QmlComponentFactory(&m_Engine, false).CreateComponent("x/Thing.qml", folders)) << "no folders wanted";
    EXPECT_EQ(TakeLog(), "2 Component x/Thing.qml was null.\n");
}

TEST_F(ComponentFactory, WaitsForAComponentThatIsLoading)
{
    Write("Slow.qml", "import QtQml\nQtObject {}");
    const auto pComponent = std::make_shared<QQmlComponent>(&m_Engine);
    pComponent->loadUrl(QUrl::fromLocalFile(m_Folder.filePath("Slow.qml")), QQmlComponent::Asynchronous);
    ASSERT_TRUE(pComponent->isLoading());
    int objects = 0;
    QmlComponentFactory::CreateObject(pComponent, [&objects](std::unique_ptr<QObject> i_pObject)
                                      { objects += i_pObject ? 1 : 100; });
    EXPECT_EQ(objects, 0);
    while (pComponent->isLoading())
        QCoreApplication::processEvents(QEventLoop::WaitForMoreEvents);
    EXPECT_EQ(objects, 1);
}

} // namespace
