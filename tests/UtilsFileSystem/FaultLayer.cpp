#include "UtilsFileSystem/FaultLayer.h"

#include <cstdio>

#include <sys/mman.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

namespace FaultLayer
{
namespace
{

const Plan* s_pPlan = nullptr;
int s_Count = 0;

/// The error that the call is to give, 0 for none.
int Enter(const std::string& i_rName)
{
    if (!s_pPlan || (!s_pPlan->Only.empty() && s_pPlan->Only != i_rName))
        return 0;
    if (s_pPlan->Before)
        s_pPlan->Before();
    if (++s_Count == s_pPlan->StopAt)
        ::_exit(StoppedCode);
    if (s_Count == s_pPlan->FailAt)
        return s_pPlan->FailWith;
    if (s_pPlan->Refused.contains(i_rName))
        return i_rName == "renameat2" ? EINVAL : EPERM;
    return 0;
}

} // namespace

void With(const Plan& i_rPlan, const std::function<void()>& i_rWork)
{
    s_pPlan = &i_rPlan;
    s_Count = 0;
    i_rWork();
    s_pPlan = nullptr;
}

int GetCount()
{
    return s_Count;
}

int InChild(const std::function<int()>& i_rWork)
{
    const pid_t child = ::fork();
    if (child == 0)
        ::_exit(i_rWork());
    int status = 0;
    ::waitpid(child, &status, 0);
    return WIFEXITED(status) ? WEXITSTATUS(status) : -WTERMSIG(status);
}

} // namespace FaultLayer

#define FAULT_LAYER_WRAP(type, name, failure, parameters, arguments)                                                   \
    extern "C" type __real_##name parameters;                                                                          \
    extern "C" type __wrap_##name parameters;                                                                          \
    extern "C" type __wrap_##name parameters                                                                           \
    {                                                                                                                  \
        if (const int error = FaultLayer::Enter(#name))                                                                \
        {                                                                                                              \
            errno = error;                                                                                             \
            return failure;                                                                                            \
        }                                                                                                              \
        return __real_##name arguments;                                                                                \
    }

FAULT_LAYER_WRAP(int, unlink, -1, (const char* i_pPath), (i_pPath))
FAULT_LAYER_WRAP(int, link, -1, (const char* i_pFrom, const char* i_pTo), (i_pFrom, i_pTo))
FAULT_LAYER_WRAP(int, rename, -1, (const char* i_pFrom, const char* i_pTo), (i_pFrom, i_pTo))
FAULT_LAYER_WRAP(int, renameat2, -1, (int i_At, const char* i_pFrom, int i_To, const char* i_pTo, unsigned i_Flags),
                 (i_At, i_pFrom, i_To, i_pTo, i_Flags))
FAULT_LAYER_WRAP(int, chmod, -1, (const char* i_pPath, mode_t i_Mode), (i_pPath, i_Mode))
FAULT_LAYER_WRAP(int, lstat, -1, (const char* i_pPath, struct stat* o_pStatus), (i_pPath, o_pStatus))
FAULT_LAYER_WRAP(int, open, -1, (const char* i_pPath, int i_Flags, mode_t i_Mode), (i_pPath, i_Flags, i_Mode))
FAULT_LAYER_WRAP(int, fsync, -1, (int i_File), (i_File))
FAULT_LAYER_WRAP(void*, mmap, MAP_FAILED,
                 (void* i_pAt, std::size_t i_Length, int i_Rights, int i_Flags, int i_File, off_t i_Offset),
                 (i_pAt, i_Length, i_Rights, i_Flags, i_File, i_Offset))
FAULT_LAYER_WRAP(std::FILE*, fopen, nullptr, (const char* i_pPath, const char* i_pMode), (i_pPath, i_pMode))
FAULT_LAYER_WRAP(std::size_t, fwrite, 0,
                 (const void* i_pBytes, std::size_t i_Size, std::size_t i_Count, std::FILE* i_pFile),
                 (i_pBytes, i_Size, i_Count, i_pFile))

extern "C" int __real_fclose(std::FILE* i_pFile);
extern "C" int __wrap_fclose(std::FILE* i_pFile);
extern "C" int __wrap_fclose(std::FILE* i_pFile)
{
    const int error = FaultLayer::Enter("fclose");
    const int closed = __real_fclose(i_pFile); // the file is closed even when the bytes did not fit
    if (error != 0)
        errno = error;
    return error != 0 ? EOF : closed;
}
