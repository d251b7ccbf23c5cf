#include "Store/PropertyText.h"

namespace Store
{
namespace
{

void AppendEscaped(std::string& io_rText, std::string_view i_Part, bool i_bKey)
{
    for (const char c : i_Part)
    {
        if (c == '\\' || c == '\n' || (i_bKey && c == '='))
            io_rText += '\\';
        io_rText += c == '\n' ? 'n' : c;
    }
}

} // namespace

std::string WriteProperties(const TQL::PropertyMap& i_rProperties)
{
    std::string text;
    for (const auto& [key, value] : i_rProperties)
    {
        AppendEscaped(text, key, true);
        text += '=';
        AppendEscaped(text, value, false);
        text += '\n';
    }
    return text;
}

} // namespace Store
