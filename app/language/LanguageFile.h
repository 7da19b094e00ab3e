#pragma once

#include <string>

#include <wx/string.h>

namespace uilanguage
{

// The text of a language file: a byte-order mark says the encoding when there
// is one; otherwise UTF-8 when the bytes are valid UTF-8, else ISO 8859-1, in
// which every byte is a character, so that no file reads as nothing.
wxString DecodeLanguageFile(const std::string& bytes);

// The per-user file's code: its first line without surrounding white space.
wxString UserFileCode(const wxString& text);

// The server file's code: the value after the first "=" of the last line that
// begins with "serverlang" (case counts), without surrounding white space.
// False when no line begins so; such a file says nothing about the language.
bool ServerFileCode(const wxString& text, wxString& code);

} // namespace uilanguage
