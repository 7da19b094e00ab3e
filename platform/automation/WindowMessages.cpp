#include "platform/automation/WindowMessages.h"

#include "platform/automation/AutomationText.h"
#include "platform/automation/NativeQueries.h"

#include <mutex>
#include <string>
#include <vector>

namespace automation
{

namespace
{

constexpr unsigned kFirstRegistered = 0xC000;
constexpr unsigned kLastRegistered = 0xFFFF;

struct MessageTable
{
    std::mutex lock;
    std::vector<std::u16string> names; // index + kFirstRegistered is the number
};

MessageTable& Table()
{
    static MessageTable table;
    return table;
}

} // namespace

unsigned RegisterWindowMessage(std::u16string_view name)
{
    if (name.empty())
        return 0;
    MessageTable& table = Table();
    std::lock_guard<std::mutex> hold(table.lock);
    for (std::size_t i = 0; i < table.names.size(); ++i)
    {
        if (EqualIgnoringCase(table.names[i], name))
            return kFirstRegistered + static_cast<unsigned>(i);
    }
    if (table.names.size() > kLastRegistered - kFirstRegistered)
        return 0;
    table.names.emplace_back(name);
    return kFirstRegistered + static_cast<unsigned>(table.names.size() - 1);
}

unsigned KindQueryMessage()
{
    static const unsigned number = RegisterWindowMessage(native::kKindMessageName);
    return number;
}

} // namespace automation
