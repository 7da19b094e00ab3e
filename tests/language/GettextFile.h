#pragma once

#include <fstream>
#include <set>
#include <string>

// The English keys (msgids) of a gettext template or catalog, without the
// header's empty key and without obsolete entries.
inline std::set<std::string> ReadMsgids(const std::string& path)
{
    std::set<std::string> ids;
    std::ifstream file(path);
    std::string line;
    std::string current;
    bool inMsgid = false;
    const auto unquote = [](const std::string& quoted)
    {
        std::string text;
        for (std::size_t i = 1; i + 1 < quoted.size(); ++i)
        {
            char c = quoted[i];
            if (c == '\\' && i + 2 < quoted.size())
            {
                c = quoted[++i];
                c = c == 'n' ? '\n' : c == 't' ? '\t' : c;
            }
            text += c;
        }
        return text;
    };
    const auto finish = [&]
    {
        if (inMsgid && !current.empty())
            ids.insert(current);
        inMsgid = false;
        current.clear();
    };
    while (std::getline(file, line))
    {
        if (line.rfind("msgid \"", 0) == 0)
        {
            finish();
            inMsgid = true;
            current = unquote(line.substr(6));
        }
        else if (inMsgid && line.rfind('"', 0) == 0)
            current += unquote(line);
        else
            finish();
    }
    finish();
    return ids;
}
