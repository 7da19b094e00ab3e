#pragma once

#include <cstdio>

// wyx-journal JOURNAL OPERATION [ARGUMENT]: one journal operation through the
// same reader-writer the program uses, or one per line of "in" when ARGUMENT
// is "-". Returns the process exit status: the operation's result, 2 after a
// usage error, or 4 when the output could not be written.
int RunJournalCommand(int argc, const char* const* argv, std::FILE* in, std::FILE* out, std::FILE* err);
