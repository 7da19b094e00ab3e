// The executable's dynamic symbol table names the four event type variables,
// so that outside tools can look them up in the running program.
#include <elf.h>

#include <cstring>
#include <fstream>
#include <iterator>
#include <set>
#include <string>
#include <vector>

#include <gtest/gtest.h>

namespace
{

// Names of the defined objects in the .dynsym section of a 64-bit ELF file.
std::set<std::string> DefinedDynamicObjects(const std::string& path)
{
    std::ifstream file(path, std::ios::binary);
    const std::vector<char> image((std::istreambuf_iterator<char>(file)), std::istreambuf_iterator<char>());
    std::set<std::string> names;
    if (image.size() < sizeof(Elf64_Ehdr) || std::memcmp(image.data(), ELFMAG, SELFMAG) != 0 ||
        image[EI_CLASS] != ELFCLASS64)
        return names;
    Elf64_Ehdr header;
    std::memcpy(&header, image.data(), sizeof header);
    auto sectionAt = [&](std::size_t index)
    {
        Elf64_Shdr section{};
        const std::size_t offset = header.e_shoff + index * sizeof(Elf64_Shdr);
        if (offset + sizeof section <= image.size())
            std::memcpy(&section, image.data() + offset, sizeof section);
        return section;
    };
    for (std::size_t i = 0; i < header.e_shnum; ++i)
    {
        const Elf64_Shdr symbols = sectionAt(i);
        if (symbols.sh_type != SHT_DYNSYM || symbols.sh_entsize != sizeof(Elf64_Sym))
            continue;
        const Elf64_Shdr strings = sectionAt(symbols.sh_link);
        for (std::size_t s = 0; s < symbols.sh_size / sizeof(Elf64_Sym); ++s)
        {
            Elf64_Sym symbol;
            const std::size_t offset = symbols.sh_offset + s * sizeof symbol;
            if (offset + sizeof symbol > image.size())
                break;
            std::memcpy(&symbol, image.data() + offset, sizeof symbol);
            if (symbol.st_shndx == SHN_UNDEF || ELF64_ST_TYPE(symbol.st_info) != STT_OBJECT ||
                symbol.st_name >= strings.sh_size || strings.sh_offset + strings.sh_size > image.size())
                continue;
            const char* name = image.data() + strings.sh_offset + symbol.st_name;
            names.insert(std::string(name, strnlen(name, strings.sh_size - symbol.st_name)));
        }
    }
    return names;
}

TEST(ExportedEvents, TheProgramExportsTheFourEventTypesUnderTheirNames)
{
    const std::set<std::string> exported = DefinedDynamicObjects(WYX_PROGRAM);
    ASSERT_FALSE(exported.empty()) << "no dynamic symbols read from " << WYX_PROGRAM;
    for (const char* name :
         {"wxEVT_MY_CUSTOM_COMMAND_COMBOCLICK", "wxEVT_MY_CUSTOM_COMMAND_COMBOCLICK_LOG",
          "wxEVT_MY_CUSTOM_COMMAND_UPDATEJOBLOG", "wxEVT_MY_CUSTOM_COMMAND_UPDATEJOBSTATUS"})
        EXPECT_EQ(exported.count(name), 1u) << name;
}

} // namespace
