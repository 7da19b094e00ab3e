#include <wx/init.h>

#include "tools/journal/JournalCommand.h"

int main(int argc, char** argv)
{
    // Arguments are read as UTF-8 by the command itself, not by wx.
    wxInitializer initializer;
    if (!initializer.IsOk())
        return 1;
    return RunJournalCommand(argc, argv, stdin, stdout, stderr);
}
