#pragma once

#include <map>
#include <memory>
#include <string>
#include <utility>
#include <vector>

class QOpenGLContext;

namespace CoreGraphics
{

class VShader;
class VShaderProgram;

/// Finds, compiles and caches shaders by name. The host builds one object for all graph windows and hands it to the
/// module. Shaders and programs are kept per group of sharing OpenGL contexts, so windows that do not share have their
/// own; what belongs to a group that has gone is dropped at the next Initialise. Render thread, with a context current;
/// only the search folders are set before, on the UI thread. Failures are messages in the log.
class Resources
{
public:
    explicit Resources(bool i_bUseSearchFolders);
    ~Resources();
    Resources(const Resources&) = delete;
    Resources& operator=(const Resources&) = delete;

    /// A folder with the sub-folders VertexShaders and FragmentShaders, searched at the Initialise of each group; a
    /// later folder wins. Ignored when search folders are not used.
    void AddSearchFolder(const std::string& i_rFolder);
    bool UsesSearchFolders() const { return m_bUseSearchFolders; }

    /// Compiles all shaders for the current context's group, once. One vertex shader found in a search folder switches
    /// the whole built-in set off.
    void Initialise();

    /// Forgets all shaders and programs, whose sources a module may have brought; those in use stay with their users.
    /// Their OpenGL objects go when a context of their group is next made current. While nothing is drawn; no context
    /// is needed.
    void Release();

    /// The program of two shaders for the current context's group, linked at the first call. Empty when one of the
    /// shaders is missing or Initialise has not run. A program whose link failed comes back unusable: see
    /// VShaderProgram::IsLinked.
    std::shared_ptr<VShaderProgram> GetProgram(const std::string& i_rVertexName, const std::string& i_rFragmentName);

private:
    using Shaders = std::map<std::string, std::shared_ptr<VShader>>;
    using ProgramKey = std::pair<std::string, std::string>;
    struct ShareGroup;

    ShareGroup* FindCurrentGroup();
    void CheckVersion(const QOpenGLContext& i_rContext) const;
    void ScanRoot(const std::string& i_rRoot, ShareGroup& o_rGroup) const;

    std::vector<std::unique_ptr<ShareGroup>> m_Groups;
    std::vector<std::string> m_SearchFolders;
    bool m_bUseSearchFolders;
};

} // namespace CoreGraphics
