#include <wx/init.h>

#include "platform/os/FileContents.h"
#include "platform/os/SystemPaths.h"
#include "tools/journal/JournalCommand.h"

int main(int argc, char** argv)
{
    wyxos::ResolveSystemRoot();
    // A journal that would outgrow the file size limit is then left as it was
    // and reported (3), where the signal would end us beside our temporary file.
    wyxos::FailWritesBeyondFileSizeLimit();
    // Arguments are read as UTF-8 by the command itself, not by wx.
    wxInitializer initializer;
    if (!initializer.IsOk())
        return 1;
    return RunJournalCommand(argc, argv, stdin, stdout, stderr);
}
