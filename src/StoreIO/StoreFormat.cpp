#include "StoreIO/StoreFormat.h"

namespace StoreIO
{

std::string VersionText(TQL::StoreVersion i_Version)
{
    return std::to_string(i_Version.Major) + '.' + std::to_string(i_Version.Minor);
}

std::string XPathText(std::string_view i_Path)
{
    std::string text = "/Configuration";
    while (!i_Path.empty())
    {
        const std::size_t end = i_Path.find('/');
        text.append("/Node[@name='").append(i_Path.substr(0, end)).append("']");
        i_Path.remove_prefix(end == std::string_view::npos ? i_Path.size() : end + 1);
    }
    return text;
}

} // namespace StoreIO
