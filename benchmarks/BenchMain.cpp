#include "Bench.h"

#include <QtCore/QFile>
#include <QtCore/QJsonArray>
#include <QtCore/QJsonDocument>
#include <QtCore/QJsonObject>
#include <QtWidgets/QApplication>

#include <cstdio>
#include <string_view>

namespace Bench
{

void RunExpression(Table& o_rTable);
void RunNotification(Table& o_rTable);
void RunOsc(Table& o_rTable);
void RunOpenRecording(Table& o_rTable);
void RunRecordings(Table& o_rTable);
void RunRedraw(Table& o_rTable);
void RunRefill(Table& o_rTable);
void RunSelection(Table& o_rTable);
void RunStore(Table& o_rTable);
void RunStoreFile(Table& o_rTable);
void RunSubplot(Table& o_rTable);
void RunSummary(Table& o_rTable);
void RunUpdateTick(Table& o_rTable);

namespace
{

struct Entry
{
    const char* pName;
    void (*pRun)(Table&);
};

constexpr Entry s_Entries[] = {{"notification", RunNotification},
                               {"summary", RunSummary},
                               {"refill", RunRefill},
                               {"selection", RunSelection},
                               {"subplots", RunSubplot},
                               {"expression", RunExpression},
                               {"store", RunStore},
                               {"files", RunStoreFile},
                               {"recordings", RunRecordings},
                               {"c3d", RunOpenRecording},
                               {"update", RunUpdateTick},
                               {"redraw", RunRedraw},
                               {"osc", RunOsc}};

const char* GoalText(const Figure& i_rFigure)
{
    if (i_rFigure.Goal == EGoal::Report)
        return "reported";
    return i_rFigure.IsMet() ? "met" : "NOT MET";
}

void Print(const Table& i_rTable)
{
    for (const Figure& rFigure : i_rTable)
    {
        std::printf("%s\n    %.4g %s, yardstick %.4g %s (%s), ratio %.3g", rFigure.Name.c_str(), rFigure.Value,
                    rFigure.Unit.c_str(), rFigure.YardstickValue, rFigure.Unit.c_str(), rFigure.Yardstick.c_str(),
                    rFigure.Ratio);
        if (rFigure.Goal != EGoal::Report)
            std::printf(", target %s %.3g", rFigure.Goal == EGoal::AtLeast ? "at least" : "at most", rFigure.Target);
        std::printf(": %s\n", GoalText(rFigure));
    }
}

bool WriteJson(const Table& i_rTable, const QString& i_rPath)
{
    QJsonArray rows;
    for (const Figure& rFigure : i_rTable)
    {
        const bool bGoal = rFigure.Goal != EGoal::Report;
        rows.append(QJsonObject{{"figure", QString::fromStdString(rFigure.Name)},
                                {"value", rFigure.Value},
                                {"unit", QString::fromStdString(rFigure.Unit)},
                                {"yardstick", QString::fromStdString(rFigure.Yardstick)},
                                {"ratio", rFigure.Ratio},
                                {"target", bGoal ? QJsonValue(rFigure.Target) : QJsonValue()},
                                {"met", bGoal ? QJsonValue(rFigure.IsMet()) : QJsonValue()}});
    }
    QFile file(i_rPath);
    const QByteArray bytes = QJsonDocument(rows).toJson();
    return file.open(QIODevice::WriteOnly) && file.write(bytes) == bytes.size() && file.flush();
}

} // namespace
} // namespace Bench

/// graphplots-bench [--json FILE] [--only TEXT]. The exit status tells whether the table could be made, not whether
/// every target was met: figures depend on the machine.
int main(int i_ArgumentCount, char** i_ppArguments)
{
    const QApplication application(i_ArgumentCount, i_ppArguments);
    const QStringList arguments = QCoreApplication::arguments();
    const auto valueOf = [&](const QString& i_rOption)
    {
        const qsizetype at = arguments.indexOf(i_rOption);
        return at < 0 ? QString() : arguments.value(at + 1);
    };
    const QString only = valueOf(QStringLiteral("--only"));
    Bench::Table table;
    for (const Bench::Entry& rEntry : Bench::s_Entries)
    {
        if (!QString::fromLatin1(rEntry.pName).contains(only))
            continue;
        Bench::Table part;
        rEntry.pRun(part);
        Bench::Print(part);
        std::fflush(stdout);
        table.insert(table.end(), part.begin(), part.end());
    }
    const QString json = valueOf(QStringLiteral("--json"));
    if (!json.isEmpty() && !Bench::WriteJson(table, json))
    {
        std::fprintf(stderr, "The table could not be written to %s: is the folder there and the disk not full?\n",
                     qPrintable(json));
        return 2;
    }
    return 0;
}
