#include "Studio/Commands/CommandSession.h"

#include "Studio/Commands/CommandLine.h"
#include "Studio/Commands/Commands.h"
#include "Studio/Common/Paths.h"
#include "Studio/Session/VStudioSession.h"

#include <QtCore/QCoreApplication>

namespace Studio
{

std::filesystem::path ModulePathOf(const CommandLine& i_rCommandLine)
{
    if (!i_rCommandLine.ModulePath.empty())
        return PathFromText(i_rCommandLine.ModulePath);
    return DefaultModulePath(PathFromText(QCoreApplication::applicationDirPath().toStdString()));
}

int EndSession(VStudioSession& o_rSession, std::string& o_rError)
{
    o_rSession.Close();
    const auto faults = o_rSession.Faults();
    if (faults.empty())
        return StatusOk;
    o_rError = "the module broke the rules of its host:";
    for (const std::string& rFault : faults)
        o_rError += (&rFault == &faults.front() ? " " : "; ") + rFault;
    return StatusFailed;
}

} // namespace Studio
