// The executable's dynamic symbol table names the four event type variables,
// so that outside tools can look them up in the running program.
#include <cstdlib>
#include <string>

#include <gtest/gtest.h>

TEST(ExportedEvents, TheProgramExportsTheFourEventTypesUnderTheirNames)
{
    for (const char* name : {"COMBOCLICK", "COMBOCLICK_LOG", "UPDATEJOBLOG", "UPDATEJOBSTATUS"})
    {
        // binutils' nm prints "<address> <type> <name>": B or D for a defined data object.
        const std::string command = "nm -D --defined-only '" WYX_PROGRAM
                                    "' | grep -q ' [BD] wxEVT_MY_CUSTOM_COMMAND_" +
                                    std::string(name) + "$'";
        EXPECT_EQ(std::system(command.c_str()), 0) << command;
    }
}
