#pragma once

#include <cstdio>

// wyx-journal JOURNAL OPERATION [ARGUMENT]: one journal operation through the
// same reader-writer the program uses. Returns the process exit status: the
// operation's result, or 2 after a usage error.
int RunJournalCommand(int argc, const char* const* argv, std::FILE* out, std::FILE* err);
