#include "OrvanePluginInterface/IQuickWidget.h"
#include "OrvanePluginInterface/IWorkspaceContent.h"
#include "Services/Selection/VSelectionSource.h"
#include "Services/Ui/VContentRegistry.h"
#include "Services/Ui/VQmlEngineHost.h"
#include "Services/Ui/VQuickWidgetPersistence.h"
#include "support/LogGuard.h"

#include <gmock/gmock.h>

#include <QtCore/QEventLoop>
#include <QtNetwork/QNetworkAccessManager>
#include <QtNetwork/QNetworkReply>
#include <QtNetwork/QTcpServer>
#include <QtQml/QJSValue>
#include <QtQml/QQmlComponent>
#include <QtQml/QQmlEngine>
#include <QtQml/QQmlPropertyMap>
#include <QtWidgets/QWidget>

namespace Services
{
namespace
{

using ::testing::ElementsAre;
using ::testing::Pair;

/// The value of an expression in a scene of the engine, as text.
std::string Evaluate(QQmlEngine& i_rEngine, const QByteArray& i_rExpression)
{
    QQmlComponent component(&i_rEngine);
    component.setData("import QtQml\nQtObject { property string result: " + i_rExpression + " }", QUrl());
    const std::unique_ptr<QObject> pObject(component.create());
    return pObject ? pObject->property("result").toString().toStdString() : component.errorString().toStdString();
}

TEST(VQmlEngineHost, ANullObjectLeavesThePropertyPresent)
{
    VQmlEngineHost host;
    QQmlEngine& rEngine = *host.GetEngine();
    const QByteArray look = "typeof hostThing + ' ' + (hostThing === null)";
    EXPECT_EQ(Evaluate(rEngine, "typeof hostThing"), "undefined");
    host.SetRootContextProperty("hostThing", nullptr);
    EXPECT_EQ(Evaluate(rEngine, look), "object true");
    QObject object;
    object.setObjectName(QStringLiteral("thing"));
    host.SetRootContextProperty("hostThing", &object);
    EXPECT_EQ(Evaluate(rEngine, "hostThing.objectName"), "thing");
    EXPECT_THAT(host.PropertiesWithObject(), ElementsAre("hostThing"));
    host.SetRootContextProperty("hostThing", nullptr);
    EXPECT_EQ(Evaluate(rEngine, look), "object true");
    EXPECT_THAT(host.PropertiesWithObject(), ElementsAre());
    host.ReleaseUnused();
    EXPECT_EQ(Evaluate(rEngine, look), "object true");
    EXPECT_EQ(Evaluate(rEngine, "Qt.point(3, 4).y"), "4") << "the engine is still of use";
}

TEST(VQmlEngineHost, HasNoNetwork)
{
    QTcpServer server; // somebody who would answer
    ASSERT_TRUE(server.listen(QHostAddress::LocalHost));
    const QUrl url(QStringLiteral("http://127.0.0.1:%1/picture.png").arg(server.serverPort()));
    VQmlEngineHost host;
    const std::unique_ptr<QNetworkReply> pReply(host.GetEngine()->networkAccessManager()->get(QNetworkRequest(url)));
    QEventLoop loop;
    QObject::connect(pReply.get(), &QNetworkReply::finished, &loop, &QEventLoop::quit);
    QObject::connect(&server, &QTcpServer::newConnection, &loop, &QEventLoop::quit);
    loop.exec();
    EXPECT_EQ(pReply->error(), QNetworkReply::ContentAccessDenied);
    EXPECT_FALSE(server.hasPendingConnections());
}

TEST(VContentRegistry, KeepsAFactoryUntilItIsUnregistered)
{
    class Factory : public OrvanePluginInterface::IWorkspaceContentFactory
    {
        void CreateContent(QPointer<QWidget>&, std::shared_ptr<OrvanePluginInterface::ITimeController>,
                           QPointer<QWidget>) override
        {
        }
    };
    TestSupport::LogGuard log;
    VContentRegistry registry;
    int changes = 0;
    registry.Changed()->AddDirect([&] { ++changes; });
    std::weak_ptr<Factory> pWatched;
    {
        const auto pFactory = std::make_shared<Factory>();
        pWatched = pFactory;
        registry.RegisterContent("Window", pFactory);
    }
    EXPECT_NE(registry.Find("Window"), nullptr);
    EXPECT_EQ(registry.Find("Other"), nullptr);
    registry.RegisterContent("Nothing", nullptr);
    EXPECT_THAT(registry.Names(), ElementsAre("Window"));
    EXPECT_EQ(log.Take().size(), 1u) << "a warning for the null factory";
    registry.UnregisterContent("Other");
    EXPECT_EQ(changes, 1);
    registry.UnregisterContent("Window");
    EXPECT_TRUE(pWatched.expired());
    EXPECT_EQ(changes, 2);
}

/// A widget with a property map and no scene.
class FakeQuickWidget : public TQL::IQuickWidget
{
public:
    void SetContextProperty(const QString&, QObject*) override {}
    void SetContextProperty(const QString&, const QVariant&) override {}
    void AddImportPath(const QString&) override {}
    QStringList ImportPaths() const override { return {}; }
    void SetSource(const QString&, const QStringList&) override {}
    QUrl Source() const override { return {}; }
    void SetSearchFolders(const QStringList&) override {}
    QStringList SearchFolders() const override { return {}; }
    QQmlPropertyMap* PersistentProperties() const override { return m_pMap.get(); }
    void EmitPreSave() override { m_pMap->insert(QStringLiteral("late"), 7); }
    void EmitPostLoad() override { m_bLoaded = m_pMap->contains(QStringLiteral("flag")); }
    QQuickWidget* Widget() override { return nullptr; }

    std::unique_ptr<QQmlPropertyMap> m_pMap = std::make_unique<QQmlPropertyMap>();
    bool m_bLoaded = false;
};

TEST(VQuickWidgetPersistence, ValuesComeBackAsWhatTheyWere)
{
    struct Case
    {
        QVariant Value;
        const char* pText;
    };
    const Case cases[] = {
        {true, "true"},
        {42, "42"},
        {0.1, "0.1"},
        {QString(), "\"\""},
        {QStringLiteral("12"), "\"12\""},
        {QStringLiteral("a \"b\"\n\u00B0"), "\"a \\\"b\\\"\\n\u00B0\""},
        {QVariantList{1, QStringLiteral("x"), false}, "[1,\"x\",false]"},
        {QVariantMap{{QStringLiteral("k"), 1.5}}, "{\"k\":1.5}"},
    };
    for (const Case& rCase : cases)
    {
        ASSERT_EQ(PersistentText(rCase.Value), rCase.pText);
        const QVariant back = PersistentValue(rCase.pText);
        EXPECT_EQ(PersistentText(back), rCase.pText);
        EXPECT_EQ(back.toString(), rCase.Value.toString()) << rCase.pText;
        EXPECT_EQ(back.typeId() == QMetaType::QString, rCase.Value.typeId() == QMetaType::QString) << rCase.pText;
    }
    EXPECT_EQ(PersistentValue("no json"), QVariant(QStringLiteral("no json")));
    EXPECT_EQ(PersistentValue("1,2"), QVariant(QStringLiteral("1,2")));
    QObject object;
    EXPECT_EQ(PersistentText(QVariant::fromValue(&object)), std::nullopt);

    QQmlEngine engine;
    EXPECT_EQ(PersistentText(QVariant::fromValue(engine.evaluate(QStringLiteral("[1, {a: 2}]")))), "[1,{\"a\":2}]");
}

TEST(VQuickWidgetPersistence, AsksTheSceneBeforeReadingAndAfterWriting)
{
    VQuickWidgetPersistence persistence;
    FakeQuickWidget widget;
    widget.m_pMap->insert(QStringLiteral("zoom"), QStringLiteral("big"));
    OrvanePluginInterface::IQuickWidgetPersistence::Entries entries = {{"old", "1"}};
    persistence.ReadProperties(&widget, entries);
    EXPECT_THAT(entries, ElementsAre(Pair("late", "7"), Pair("zoom", "\"big\"")));
    persistence.WriteProperties({{"flag", "true"}}, &widget);
    EXPECT_TRUE(widget.m_bLoaded) << "the load signal comes when the map is filled";
    EXPECT_EQ(widget.m_pMap->value(QStringLiteral("flag")), QVariant(true));
    persistence.ReadProperties(nullptr, entries);
    EXPECT_TRUE(entries.empty());
    persistence.WriteProperties({{"flag", "true"}}, nullptr);
}

TEST(VSelectionSource, KeepsEachItemOnceAndTellsOfChanges)
{
    using TQL::ESelectionKind;
    const TQL::SelectionItem marker{ESelectionKind::Label, 1, 5, "LASI"};
    const TQL::SelectionItem other{ESelectionKind::Label, 1, 6, "RASI"};
    const TQL::SelectionItem subject{ESelectionKind::Subject, 1, 0, "Anna"};
    VSelectionSource source;
    std::string told;
    source.Changed()->AddDirect([&](bool i_bForce) { told += i_bForce ? "force " : "changed "; });
    source.Set({marker, subject, marker});
    const auto pSnapshot = source.GetSelection();
    source.Add({marker});
    EXPECT_EQ(told, "changed ") << "nothing new was added";
    source.Add({other});
    EXPECT_EQ(told, "changed changed ");
    EXPECT_THAT(source.GetSelection()->Items(ESelectionKind::Label), ElementsAre(marker, other));
    EXPECT_THAT(pSnapshot->Items(ESelectionKind::Label), ElementsAre(marker)) << "a snapshot does not move";
    EXPECT_THAT(pSnapshot->Items(ESelectionKind::Camera), ElementsAre());
    source.Set({});
    source.Set({});
    source.RaiseForced();
    EXPECT_EQ(told, "changed changed changed force ");

    EXPECT_EQ(source.RootSegment(3), 0u);
    source.SetRootSegments([](std::uint64_t i_Subject) { return i_Subject * 10; });
    EXPECT_EQ(source.RootSegment(3), 30u);
}

} // namespace
} // namespace Services
