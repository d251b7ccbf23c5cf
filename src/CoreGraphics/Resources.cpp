#include "CoreGraphics/Resources.h"

#include "CoreGraphics/GraphicsLog.h"
#include "CoreGraphics/VShader.h"
#include "CoreGraphics/VShaderProgram.h"

#include <QtCore/QDirIterator>
#include <QtCore/QFileInfo>
#include <QtCore/QPointer>
#include <QtGui/QOpenGLContext>
#include <QtGui/QSurfaceFormat>

#include <algorithm>

namespace CoreGraphics
{
namespace
{

constexpr const char* c_ShaderSuffix = "glsl";
constexpr const char* c_BuiltInRoot = ":";
constexpr int c_VersionMessageLine = 60; // goes with this message wherever the code moves

void ScanFolder(const std::string& i_rFolder, EShaderKind i_Kind,
                std::map<std::string, std::shared_ptr<VShader>>& o_rShaders)
{
    QDirIterator files(QString::fromStdString(i_rFolder));
    while (files.hasNext())
    {
        const QFileInfo file(files.next());
        if (file.suffix() == QLatin1String(c_ShaderSuffix))
            o_rShaders[file.baseName().toStdString()] =
                std::make_shared<VShader>(i_Kind, file.filePath().toStdString());
    }
}

} // namespace

struct Resources::ShareGroup
{
    QPointer<QOpenGLContextGroup> m_pGroup;
    Shaders m_VertexShaders;
    Shaders m_FragmentShaders;
    std::map<ProgramKey, std::shared_ptr<VShaderProgram>> m_Programs;
};

Resources::Resources(bool i_bUseSearchFolders) : m_bUseSearchFolders(i_bUseSearchFolders) {}

Resources::~Resources() = default;

void Resources::AddSearchFolder(const std::string& i_rFolder)
{
    if (m_bUseSearchFolders)
        m_SearchFolders.push_back(i_rFolder);
}

Resources::ShareGroup* Resources::FindCurrentGroup()
{
    const QOpenGLContext* pContext = QOpenGLContext::currentContext();
    if (pContext == nullptr)
        return nullptr;
    const auto found = std::ranges::find_if(m_Groups, [pContext](const auto& i_rpGroup)
                                            { return i_rpGroup->m_pGroup == pContext->shareGroup(); });
    return found == m_Groups.end() ? nullptr : found->get();
}

void Resources::Initialise()
{
    const QOpenGLContext* pContext = QOpenGLContext::currentContext();
    if (pContext == nullptr || FindCurrentGroup() != nullptr)
        return;
    std::erase_if(m_Groups, [](const auto& i_rpGroup) { return i_rpGroup->m_pGroup.isNull(); });
    CheckVersion(*pContext);

    auto pGroup = std::make_unique<ShareGroup>();
    pGroup->m_pGroup = pContext->shareGroup();
    for (const std::string& rFolder : m_SearchFolders)
        ScanRoot(rFolder, *pGroup);
    if (pGroup->m_VertexShaders.empty())
        ScanRoot(c_BuiltInRoot, *pGroup);
    m_Groups.push_back(std::move(pGroup));
}

void Resources::Release()
{
    m_Groups.clear();
}

void Resources::CheckVersion(const QOpenGLContext& i_rContext) const
{
    const QSurfaceFormat format = i_rContext.format();
    const bool bEmbedded = format.renderableType() == QSurfaceFormat::OpenGLES;
    const std::pair required = bEmbedded ? std::pair(3, 0) : std::pair(4, 3);
    if (format.version() < required)
        TQL::Log::Format(
            GraphicsLog(), TQL::ELogSeverity::Warning,
            {"%1% context version %2%.%3% is unsupported", {"CoreGraphics/Resources", c_VersionMessageLine}},
            bEmbedded ? "OpenGL ES" : "OpenGL", format.majorVersion(), format.minorVersion());
}

void Resources::ScanRoot(const std::string& i_rRoot, ShareGroup& o_rGroup) const
{
    ScanFolder(i_rRoot + "/VertexShaders", EShaderKind::Vertex, o_rGroup.m_VertexShaders);
    ScanFolder(i_rRoot + "/FragmentShaders", EShaderKind::Fragment, o_rGroup.m_FragmentShaders);
}

std::shared_ptr<VShaderProgram> Resources::GetProgram(const std::string& i_rVertexName,
                                                      const std::string& i_rFragmentName)
{
    ShareGroup* pGroup = FindCurrentGroup();
    if (pGroup == nullptr)
        return nullptr;
    const ProgramKey key(i_rVertexName, i_rFragmentName);
    if (const auto cached = pGroup->m_Programs.find(key); cached != pGroup->m_Programs.end())
        return cached->second;
    const auto vertex = pGroup->m_VertexShaders.find(i_rVertexName);
    const auto fragment = pGroup->m_FragmentShaders.find(i_rFragmentName);
    if (vertex == pGroup->m_VertexShaders.end() || fragment == pGroup->m_FragmentShaders.end())
        return nullptr;
    auto pProgram = std::make_shared<VShaderProgram>(vertex->second, fragment->second);
    pGroup->m_Programs.emplace(key, pProgram);
    return pProgram;
}

} // namespace CoreGraphics
