#include "Store/EntryPatterns.h"

namespace Store
{

std::vector<std::string_view> SplitPath(const EntryPath& i_rPath)
{
    std::vector<std::string_view> components;
    const std::string_view text = i_rPath.Text();
    for (std::size_t begin = 0, end = 0; end != std::string_view::npos; begin = end + 1)
    {
        end = text.find('/', begin);
        components.push_back(text.substr(begin, end - begin));
    }
    return components;
}

bool MatchesPattern(const VStoreEntry& i_rEntry, const EntryPath& i_rPattern)
{
    if (!i_rPattern.IsWildcard())
        return i_rEntry.Path == i_rPattern;
    const std::string_view fixed = std::string_view(i_rPattern.Text()).substr(0, i_rPattern.WildcardPosition());
    if (!i_rEntry.Path.Text().starts_with(fixed))
        return false;
    const std::vector<std::string_view> components = SplitPath(i_rPattern);
    const VStoreEntry* pEntry = &i_rEntry;
    for (auto component = components.rbegin(); component != components.rend(); ++component, pEntry = pEntry->pParent)
        if (!pEntry->pParent || (*component != "*" && *component != pEntry->Path.Leaf()))
            return false;
    return !pEntry->pParent;
}

} // namespace Store
