#include "Services/VModuleLibrary.h"

#include <algorithm>
#include <system_error>

#include <dlfcn.h>

namespace Services
{
namespace
{

std::string OneLine(std::string i_Text)
{
    std::ranges::replace(i_Text, '\n', ' ');
    return i_Text;
}

std::string LoaderError()
{
    const char* pText = dlerror();
    return OneLine(pText ? pText : "unknown error of the loader");
}

template <typename TFunction>
bool Resolve(void* i_pHandle, const char* i_pName, TFunction& o_rFunction)
{
    o_rFunction = reinterpret_cast<TFunction>(dlsym(i_pHandle, i_pName));
    return o_rFunction != nullptr;
}

} // namespace

VModuleLibrary::~VModuleLibrary()
{
    Close();
}

TQL::IResult VModuleLibrary::Open(const std::filesystem::path& i_rPath, bool i_bKeepMapped, std::string& o_rMessage)
{
    Close();
    std::error_code error;
    // An absolute path: the loader looks a bare name up in the system's folders.
    const std::filesystem::path path = std::filesystem::absolute(i_rPath, error);
    if (error || !std::filesystem::exists(path, error))
    {
        o_rMessage = "The module \"" + i_rPath.string() + "\" does not exist";
        return TQL::Result::NotFound;
    }
    m_pHandle = dlopen(path.c_str(), RTLD_NOW | RTLD_LOCAL | (i_bKeepMapped ? RTLD_NODELETE : 0));
    if (!m_pHandle)
    {
        o_rMessage = "The module \"" + i_rPath.string() + "\" cannot be loaded: " + LoaderError();
        return TQL::Result::InvalidFormat;
    }
    const char* pMissing = nullptr;
    if (!Resolve(m_pHandle, "CreatePlugin", Create))
        pMissing = "CreatePlugin";
    else if (!Resolve(m_pHandle, "DestroyPlugin", Destroy))
        pMissing = "DestroyPlugin";
    else if (!Resolve(m_pHandle, "PluginBuildRevision", BuildRevision))
        pMissing = "PluginBuildRevision";
    if (!pMissing)
        return TQL::Result::Ok;
    o_rMessage = "The module \"" + i_rPath.string() + "\" does not export " + pMissing;
    Close();
    return TQL::Result::NotSupported;
}

void VModuleLibrary::Close()
{
    if (m_pHandle)
        dlclose(m_pHandle);
    Abandon();
}

void VModuleLibrary::Abandon()
{
    m_pHandle = nullptr;
    Create = nullptr;
    Destroy = nullptr;
    BuildRevision = nullptr;
}

} // namespace Services
