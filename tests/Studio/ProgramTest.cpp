#include <gtest/gtest.h>

#include <QtCore/QDir>
#include <QtCore/QFile>
#include <QtCore/QJsonArray>
#include <QtCore/QJsonDocument>
#include <QtCore/QProcess>
#include <QtCore/QProcessEnvironment>
#include <QtCore/QTemporaryDir>
#include <QtNetwork/QHostAddress>
#include <QtNetwork/QUdpSocket>
#include <QtTest/QTest>

#include "Recordings/C3d/C3dWriter.h"
#include "Simulation/RecordWalk.h"
#include "Simulation/VWalkSimulator.h"

#include <csignal>
#include <cstdlib>
#include <string>

namespace
{

struct StudioRun
{
    int Status = -1;
    QByteArray Output;
    QByteArray Error;
};

QProcessEnvironment WithoutDisplay()
{
    QProcessEnvironment environment = QProcessEnvironment::systemEnvironment();
    for (const char* pName : {"DISPLAY", "WAYLAND_DISPLAY", "QT_QPA_PLATFORM"})
        environment.remove(QString::fromLatin1(pName));
    return environment;
}

/// The real program.
StudioRun RunStudio(const QStringList& i_rArguments, const QProcessEnvironment& i_rEnvironment = WithoutDisplay())
{
    QProcess process;
    process.setProcessEnvironment(i_rEnvironment);
    process.start(QStringLiteral(STUDIO_PROGRAM), i_rArguments);
    EXPECT_TRUE(process.waitForFinished(60'000)) << process.errorString().toStdString();
    EXPECT_EQ(process.exitStatus(), QProcess::NormalExit);
    return {process.exitCode(), process.readAllStandardOutput(), process.readAllStandardError()};
}

class StudioProgram : public ::testing::Test
{
protected:
    void SetUp() override
    {
        const Simulation::VWalkSimulator simulator({1, 1});
        std::string error;
        ASSERT_TRUE(
            Recordings::WriteC3d(Simulation::RecordWalk(simulator, 0, 60), Path("walk.c3d").toStdString(), error)
                .IsSuccess())
            << error;
        QFile text(Path("text.c3d"));
        ASSERT_TRUE(text.open(QIODevice::WriteOnly));
        text.write("not a recording\n");
    }

    QString Path(const char* i_pName) const { return m_Folder.filePath(QString::fromLatin1(i_pName)); }

    QTemporaryDir m_Folder;
};

TEST_F(StudioProgram, ListsChannels)
{
    const StudioRun table = RunStudio({"channels", Path("walk.c3d")});
    EXPECT_EQ(table.Status, 0);
    EXPECT_EQ(table.Error, "");
    EXPECT_EQ(table.Output.count('\n'), 1 + 53 + 16);
    EXPECT_TRUE(table.Output.contains("Walker1:LFHD"));

    const StudioRun json = RunStudio({"channels", "--json", Path("walk.c3d")});
    EXPECT_EQ(json.Status, 0);
    EXPECT_EQ(QJsonDocument::fromJson(json.Output).array().size(), 53 + 16);
}

TEST_F(StudioProgram, ExportsATable)
{
    const StudioRun run = RunStudio(
        {"export", Path("walk.c3d"), "--csv", Path("o.csv"), "--channel", "Walker1:LFHD", "--channel", "Fz1"});
    EXPECT_EQ(run.Status, 0) << run.Error.toStdString();
    EXPECT_EQ(run.Error, "");
    QFile file(Path("o.csv"));
    ASSERT_TRUE(file.open(QIODevice::ReadOnly));
    const QByteArray content = file.readAll();
    EXPECT_EQ(content.left(content.indexOf('\n')), "frame,time,Walker1:LFHD.X,Walker1:LFHD.Y,Walker1:LFHD.Z,Fz1");
    EXPECT_EQ(content.count('\n'), 1 + 600);
}

TEST_F(StudioProgram, ChecksAStoreFile)
{
    const struct
    {
        const char* pText;
        int Status;
        const char* pOutput;
    } rows[] = {{"{ \"Version\" : \"3.0\", \"Children\" : { } }", 0, "FILE: no problems\n"},
                {"{ \"Version\" : \"3.0\" \n}", 1,
                 "FILE:1:1: expected a member \"Children\", an object that holds the entries\nFILE: 1 problem\n"}};
    for (const auto& rRow : rows)
    {
        QFile file(Path("store.json"));
        ASSERT_TRUE(file.open(QIODevice::WriteOnly));
        file.write(rRow.pText);
        file.close();
        const StudioRun run = RunStudio({"check-store", file.fileName()});
        EXPECT_EQ(run.Status, rRow.Status);
        EXPECT_EQ(run.Error, "");
        EXPECT_EQ(QString(run.Output), QString(rRow.pOutput).replace("FILE", file.fileName()));
    }
}

TEST_F(StudioProgram, FailuresAreOneLineAndStatusTwo)
{
    const QString walk = Path("walk.c3d");
    ASSERT_TRUE(QFile::copy(walk, Path("other.c3d")));
    ASSERT_TRUE(QFile::link(walk, Path("link.csv")));
    const struct
    {
        QStringList Arguments;
        const char* pPart;
    } rows[] = {
        {{"--frob"}, "unknown option --frob"},
        {{"channels", Path("missing.c3d")}, "missing.c3d"},
        {{"channels", m_Folder.path()}, "folder"},
        {{"channels", Path("text.c3d")}, "text.c3d"},
        {{"export", walk, "--csv", Path("no/such/o.csv")}, "o.csv"},
        {{"check-store", Path("missing.json")}, "missing.json"},
        {{"export", walk, "--csv", Path("o.csv"), "--channel", "Nobody*"}, "Nobody*"},
        {{"snapshot", walk, "--out", Path("p.png")},
         "no display: DISPLAY is not set; run it on a desktop or under xvfb-run"},
        {{walk}, "no display"},
        {{"export", walk, "--csv", walk, "--force"}, "this is the recording that is read"},
        {{"export", walk, "--csv", Path("link.csv")}, "this is the recording that is read"},
        {{"export", walk, "--csv", Path("other.c3d")}, "--force"},
        {{"record", "--osc", "9", "--seconds", "1", Path("other.c3d")}, "--force"},
        {{"record", "--osc", "9", "--seconds", "1", Path("no/such.c3d")}, "such.c3d"},
    };
    for (const auto& rRow : rows)
    {
        const StudioRun run = RunStudio(rRow.Arguments);
        const std::string words = rRow.Arguments.join(' ').toStdString();
        EXPECT_EQ(run.Status, 2) << words;
        EXPECT_EQ(run.Output, "") << words;
        EXPECT_TRUE(run.Error.startsWith("graphplots-studio: ")) << words << ": " << run.Error.toStdString();
        EXPECT_EQ(run.Error.count('\n'), 1) << words << ": " << run.Error.toStdString();
        EXPECT_TRUE(run.Error.contains(rRow.pPart)) << words << ": " << run.Error.toStdString();
    }
    EXPECT_FALSE(QFile::exists(Path("o.csv")));
    EXPECT_FALSE(QFile::exists(Path("p.png")));
    QFile one(walk), two(Path("other.c3d"));
    ASSERT_TRUE(one.open(QIODevice::ReadOnly) && two.open(QIODevice::ReadOnly));
    EXPECT_TRUE(one.readAll() == two.readAll()) << "a recording was overwritten";
    EXPECT_EQ(RunStudio({"export", walk, "--csv", two.fileName(), "--force"}).Status, 0);
}

TEST_F(StudioProgram, WithoutOpenGLThereIsOneSentence)
{
    QProcessEnvironment environment = QProcessEnvironment::systemEnvironment();
    if (environment.value(QStringLiteral("DISPLAY")).isEmpty())
        GTEST_SKIP() << "no X display";
    environment.insert(QStringLiteral("QT_QPA_PLATFORM"), QStringLiteral("xcb"));
    environment.insert(QStringLiteral("QT_XCB_GL_INTEGRATION"), QStringLiteral("none"));
    for (const QStringList& rArguments :
         {QStringList{"snapshot", Path("walk.c3d"), "--out", Path("p.png")}, QStringList{Path("walk.c3d")}})
    {
        const StudioRun run = RunStudio(rArguments, environment);
        EXPECT_EQ(run.Status, 2);
        EXPECT_TRUE(run.Error.contains("no OpenGL")) << run.Error.toStdString();
        EXPECT_EQ(run.Error.count('\n'), 1) << run.Error.toStdString();
    }
}

TEST_F(StudioProgram, SaysItsVersion)
{
    const StudioRun run = RunStudio({"--version"});
    EXPECT_EQ(run.Status, 0);
    EXPECT_TRUE(run.Output.startsWith("graphplots-studio ")) << run.Output.toStdString();
}

#ifdef Q_OS_UNIX
TEST_F(StudioProgram, SignalsEndARecordingAndSaveIt)
{
    for (const int number : {SIGINT, SIGTERM, SIGHUP})
    {
        const QString out = Path("out") + QString::number(number) + ".c3d";
        QUdpSocket port; // one that is free
        ASSERT_TRUE(port.bind(QHostAddress::LocalHost));
        const quint16 listen = port.localPort();
        port.close();
        QProcess process;
        process.setReadChannel(QProcess::StandardError);
        process.start(QStringLiteral(STUDIO_PROGRAM),
                      {"record", "--osc", QString::number(listen), "--osc-rate", "100", "--seconds", "600", out});
        QByteArray said;
        while (!said.contains("Listening") && process.waitForReadyRead(60'000))
            said += process.readAllStandardError();
        ASSERT_TRUE(said.contains("Listening")) << said.toStdString();
        const QByteArray packet("/a\0\0,f\0\0\x3f\x80\0\0", 12);
        const auto recorded = [this]
        {
            const QFileInfoList growing = QDir(Path("")).entryInfoList({".recording-*"}, QDir::Files | QDir::Hidden);
            return growing.isEmpty() ? 0 : growing.front().size();
        };
        const qint64 before = recorded();
        const auto sendUntilRecorded = [&]
        {
            port.writeDatagram(packet, QHostAddress(QHostAddress::LocalHost), listen);
            return recorded() > before;
        };
        ASSERT_TRUE(QTest::qWaitFor(sendUntilRecorded, 60'000)) << number;
        ::kill(static_cast<pid_t>(process.processId()), number);
        ASSERT_TRUE(process.waitForFinished(60'000));
        EXPECT_EQ(process.exitStatus(), QProcess::NormalExit) << number;
        EXPECT_EQ(process.exitCode(), 0) << number;
        EXPECT_EQ(RunStudio({"channels", out}).Output.count('\n'), 2) << number;
    }
}
#endif

TEST_F(StudioProgram, RealRecordingsAreListed)
{
    const char* pData = std::getenv("GRAPHPLOTS_TEST_DATA");
    const QString folder = QString::fromLocal8Bit(pData ? pData : "");
    static const struct
    {
        const char* pFile;
        int Channels;
    } rows[] = {{"sprintbasket.c3d", 26}, {"Gait.c3d", 33 + 28}, {"Dec_real.c3d", 36 + 16}, {"sgi_real.c3d", 36 + 16}};
    if (folder.isEmpty() || !QFile::exists(folder + "/Gait.c3d"))
        GTEST_SKIP() << "no folder with real recordings";
    for (const auto& rRow : rows)
    {
        const StudioRun run = RunStudio({"channels", "--json", folder + "/" + rRow.pFile});
        EXPECT_EQ(run.Status, 0) << rRow.pFile << ": " << run.Error.toStdString();
        EXPECT_EQ(QJsonDocument::fromJson(run.Output).array().size(), rRow.Channels) << rRow.pFile;
    }
}

} // namespace
