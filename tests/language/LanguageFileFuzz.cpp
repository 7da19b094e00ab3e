// Any bytes in a language file: decoded and searched for a code, never a crash.
#include <cstddef>
#include <cstdint>
#include <string>

#include "app/language/LanguageFile.h"
#include "app/language/SupportedLanguages.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    const wxString text =
        uilanguage::DecodeLanguageFile(std::string(reinterpret_cast<const char*>(data), size));
    uilanguage::FindByUserCode(uilanguage::UserFileCode(text));
    wxString code;
    if (uilanguage::ServerFileCode(text, code))
        uilanguage::FindByServerCode(code);
    return 0;
}
