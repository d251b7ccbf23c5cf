#pragma once

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <map>
#include <random>
#include <sstream>
#include <string>

namespace TestUtilsFileSystem
{

/// A folder of its own for one test, removed with all that is in it.
class TestFolder
{
public:
    explicit TestFolder(const std::filesystem::path& i_rParent = std::filesystem::temp_directory_path())
        : m_Path(i_rParent / ("UtilsFileSystem-" + std::to_string(std::random_device{}())))
    {
        std::filesystem::create_directory(m_Path);
    }
    ~TestFolder()
    {
        std::error_code ignored;
        std::filesystem::remove_all(m_Path, ignored);
    }
    TestFolder(const TestFolder&) = delete;
    TestFolder& operator=(const TestFolder&) = delete;

    /// UTF-8, as the file services want it.
    std::string operator/(const std::string& i_rName) const
    {
        const std::u8string text = (m_Path / std::u8string(i_rName.begin(), i_rName.end())).u8string();
        return {text.begin(), text.end()};
    }

    void Put(const std::string& i_rName, const std::string& i_rText) const
    {
        const std::string path = *this / i_rName;
        std::ofstream(std::filesystem::path(std::u8string(path.begin(), path.end())), std::ios::binary) << i_rText;
    }

    /// Empties the folder and makes the files of a text such as "a=1 b=2".
    void Set(const std::string& i_rFiles) const
    {
        for (const auto& rEntry : std::filesystem::directory_iterator(m_Path))
            std::filesystem::remove_all(rEntry.path());
        std::istringstream words(i_rFiles);
        for (std::string word; words >> word;)
            Put(word.substr(0, word.find('=')), word.substr(word.find('=') + 1));
    }

    /// The files with what they hold, in the form that Set takes; a folder is "name/".
    std::string Show() const
    {
        std::map<std::string, std::string> files;
        for (const auto& rEntry : std::filesystem::directory_iterator(m_Path))
        {
            std::ifstream file;
            if (!rEntry.is_directory())
                file.open(rEntry.path(), std::ios::binary);
            const std::string text{std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>()};
            files[rEntry.path().filename().string()] = rEntry.is_directory() ? "/" : '=' + text;
        }
        std::string shown;
        for (const auto& [name, text] : files)
            shown += (shown.empty() ? "" : " ") + name + text;
        return shown;
    }

private:
    std::filesystem::path m_Path;
};

} // namespace TestUtilsFileSystem
