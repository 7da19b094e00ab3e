#pragma once

#include <cstdio>

// wyx-journal JOURNAL OPERATION [ARGUMENT]: one journal operation through the
// same reader-writer the program uses, or one per line of "in" when ARGUMENT
// is "-". Returns the process exit status: the operation's result, or 2 after
// a usage error.
int RunJournalCommand(int argc, const char* const* argv, std::FILE* in, std::FILE* out, std::FILE* err);
