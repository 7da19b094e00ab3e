// The executable's dynamic symbol table names the four event type variables,
// so that outside tools can look them up in the running program.
#include <stdio.h>

#include <algorithm>
#include <string>

#include <gtest/gtest.h>

TEST(ExportedEvents, TheProgramExportsTheFourEventTypesUnderTheirNames)
{
    // binutils' nm: "<address> <type> <name>", B or D for a defined data object.
    std::string table;
    FILE* nm = ::popen(("nm -D --defined-only '" + std::string(WYX_PROGRAM) + "'").c_str(), "r");
    ASSERT_NE(nm, nullptr);
    char block[4096];
    for (std::size_t got; (got = ::fread(block, 1, sizeof block, nm)) > 0;)
        table.append(block, got);
    ASSERT_EQ(::pclose(nm), 0) << "nm could not read " << WYX_PROGRAM;
    for (const char* name : {"COMBOCLICK", "COMBOCLICK_LOG", "UPDATEJOBLOG", "UPDATEJOBSTATUS"})
        EXPECT_NE(std::min(table.find(std::string(" B wxEVT_MY_CUSTOM_COMMAND_") + name + "\n"),
                           table.find(std::string(" D wxEVT_MY_CUSTOM_COMMAND_") + name + "\n")),
                  std::string::npos)
            << name;
}
