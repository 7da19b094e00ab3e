#include <wx/init.h>

#include "tools/journal/JournalCommand.h"

int main(int argc, char** argv)
{
    wxInitializer initializer(argc, argv);
    if (!initializer.IsOk())
        return 1;
    return RunJournalCommand(argc, argv, stdout, stderr);
}
