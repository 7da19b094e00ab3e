// What the reader makes of the bytes of a journal, and what a rewrite leaves.
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "JournalTestSupport.h"
#include "data/JournalText.h"

namespace journaltest
{
namespace
{

using Lines = std::vector<std::string>;

enum class Form
{
    Utf8,
    Utf16Le,
    Utf16Be,
    Utf32Le,
    Utf32Be
};

void AppendUnit(std::string& out, char32_t unit, int width, bool bigEndian)
{
    for (int i = 0; i < width; ++i)
    {
        const int shift = 8 * (bigEndian ? width - 1 - i : i);
        out.push_back(static_cast<char>((unit >> shift) & 0xFF));
    }
}

// The text with its byte-order mark in the given form.
std::string Encoded(const std::u32string& text, Form form)
{
    std::string out;
    switch (form)
    {
    case Form::Utf8:
        out = "\xEF\xBB\xBF" + Utf8(wxString(std::wstring(text.begin(), text.end())));
        break;
    case Form::Utf16Le:
    case Form::Utf16Be:
    {
        const bool big = form == Form::Utf16Be;
        AppendUnit(out, 0xFEFF, 2, big);
        for (char32_t c : text)
        {
            if (c >= 0x10000)
            {
                AppendUnit(out, 0xD800 + ((c - 0x10000) >> 10), 2, big);
                AppendUnit(out, 0xDC00 + ((c - 0x10000) & 0x3FF), 2, big);
            }
            else
            {
                AppendUnit(out, c, 2, big);
            }
        }
        break;
    }
    case Form::Utf32Le:
    case Form::Utf32Be:
        AppendUnit(out, 0xFEFF, 4, form == Form::Utf32Be);
        for (char32_t c : text)
            AppendUnit(out, c, 4, form == Form::Utf32Be);
        break;
    }
    return out;
}

const std::u32string kText = U"1\tC:\\Hot\\caf\u00e9\u20ac.pdf\tSRV\t\U0001F5A8\tADDED\r\n2\tb\tADDED\n";
const std::string kTextUtf8 =
    "1\tC:\\Hot\\caf\xC3\xA9\xE2\x82\xAC.pdf\tSRV\t\xF0\x9F\x96\xA8\tADDED\r\n2\tb\tADDED\n";

class JournalWithMark : public JournalTest, public ::testing::WithParamInterface<Form>
{
};

TEST_P(JournalWithMark, IsDecodedAndRewrittenAsUtf8WithoutMark)
{
    WriteBytes(StatusJournal(), Encoded(kText, GetParam()));
    EXPECT_EQ(
        ReadLines(StatusJournal()),
        (Lines{"1\tC:\\Hot\\caf\xC3\xA9\xE2\x82\xAC.pdf\tSRV\t\xF0\x9F\x96\xA8\tADDED", "2\tb\tADDED"}));

    ASSERT_EQ(RunTool({"status", "add", "3\tc"}).status, 0);
    EXPECT_EQ(ReadBytes(StatusJournal()), kTextUtf8 + "3\tc\tADDED\r\n");
}

INSTANTIATE_TEST_SUITE_P(Marks, JournalWithMark,
                         ::testing::Values(Form::Utf8, Form::Utf16Le, Form::Utf16Be, Form::Utf32Le,
                                           Form::Utf32Be));

// --- files without a mark, and broken ones ---------------------------------------------

struct BytesCase
{
    const char* name;
    std::string bytes;
    Lines lines;     // as ReadJobs gives them, in UTF-8
    bool rewritable; // whether a writing operation may replace the file
};

class JournalBytes : public JournalTest, public ::testing::WithParamInterface<BytesCase>
{
};

TEST_P(JournalBytes, AreReadWithoutHarm)
{
    const BytesCase& c = GetParam();
    WriteBytes(StatusJournal(), c.bytes);
    EXPECT_EQ(ReadLines(StatusJournal()), c.lines);

    const int result = Journal(StatusJournal()).DeleteJob("no such key");
    if (c.rewritable)
    {
        // Rewritten as UTF-8 without a mark; the characters are kept.
        EXPECT_EQ(result, wyx::JobOk);
        EXPECT_EQ(ReadLines(StatusJournal()), c.lines);
        const wyx::DecodedJournal again =
            wyx::DecodeJournal(ReadBytes(StatusJournal()).data(), ReadBytes(StatusJournal()).size());
        EXPECT_TRUE(again.exact);
    }
    else
    {
        // Writing back would lose what could not be decoded.
        EXPECT_EQ(result, wyx::JobFileMissing);
        EXPECT_EQ(ReadBytes(StatusJournal()), c.bytes);
    }
}

TEST_P(JournalBytes, CanAlwaysBeCleared)
{
    WriteBytes(StatusJournal(), GetParam().bytes);
    EXPECT_EQ(Journal(StatusJournal()).ClearJobs(), wyx::JobOk);
    EXPECT_EQ(ReadBytes(StatusJournal()), "");
}

std::string Bytes(std::initializer_list<unsigned char> values)
{
    return std::string(values.begin(), values.end());
}

INSTANTIATE_TEST_SUITE_P(
    Inputs, JournalBytes,
    ::testing::Values(
        BytesCase{"Utf8WithoutMark", "1\tcaf\xC3\xA9\r\n", {"1\tcaf\xC3\xA9"}, true},
        BytesCase{"Latin1Fallback", "1\tcaf\xE9\tM\xFCnchen\r\n", {"1\tcaf\xC3\xA9\tM\xC3\xBCnchen"}, true},
        // An invalid sequence sends its own line to the single-byte fallback, no other.
        BytesCase{"InvalidUtf8", "1\t\xC3\xA9\r\n2\t\xFF\r\n", {"1\t\xC3\xA9", "2\t\xC3\xBF"}, true},
        BytesCase{"TruncatedUtf8Sequence", "1\tab\xE2\x82", {"1\tab\xC3\xA2\xC2\x82"}, true},
        // An overlong "/", an encoded surrogate and a value beyond U+10FFFF are no
        // UTF-8: their lines fall back to single bytes, which a rewrite keeps.
        BytesCase{"OverlongUtf8", "1\t\xC0\xAF\r\n", {"1\t\xC3\x80\xC2\xAF"}, true},
        BytesCase{"Utf8Surrogate", "\xED\xA0\x80", {"\xC3\xAD\xC2\xA0\xC2\x80"}, true},
        BytesCase{"Utf8BeyondUnicode", "\xF4\x90\x80\x80", {"\xC3\xB4\xC2\x90\xC2\x80\xC2\x80"}, true},
        // Long runs of ASCII are taken eight bytes at a time; what follows them must still decode.
        BytesCase{"Utf8AfterLongAscii",
                  "0123456789abcdef\xF0\x9F\x96\xA8\tKl\xC3\xB6ln 012345678\xE2\x82\xAC\r\nx",
                  {"0123456789abcdef\xF0\x9F\x96\xA8\tKl\xC3\xB6ln 012345678\xE2\x82\xAC", "x"},
                  true},
        BytesCase{"LoneByteThatStartsAMark", "\xFF", {"\xC3\xBF"}, true},
        BytesCase{"TwoBytesOfAUtf8Mark", "\xEF\xBB", {"\xC3\xAF\xC2\xBB"}, true},
        BytesCase{"MarkOnly", "\xEF\xBB\xBF", {}, true},
        // A mark written twice must not survive as a mark of the rewrite.
        BytesCase{"Utf16MarkTwice", Bytes({0xFF, 0xFE, 0xFF, 0xFE, '1', 0, '\t', 0, 'a', 0}), {"1\ta"}, true},
        BytesCase{"Utf8MarkTwice",
                  "\xEF\xBB\xBF\xEF\xBB\xBF"
                  "1\ta",
                  {"1\ta"},
                  true},
        BytesCase{"Empty", "", {}, true},
        BytesCase{"NulCharacter", std::string("1\ta\0b\r\n", 7), {std::string("1\ta\0b", 5)}, true},
        BytesCase{"Utf16WithOddTrailingByte",
                  Bytes({0xFF, 0xFE, '1', 0, '\t', 0, 'a', 0, '\n', 0, 'b'}),
                  {"1\ta", "\xEF\xBF\xBD"},
                  false},
        BytesCase{"Utf16WithLoneSurrogate",
                  Bytes({0xFE, 0xFF, 0, '1', 0xD8, 0x01, 0, 'x', 0, '\n'}),
                  {"1\xEF\xBF\xBDx"},
                  false},
        BytesCase{"Utf32BeyondUnicode",
                  Bytes({0xFF, 0xFE, 0, 0, 'a', 0, 0, 0, 0, 0, 0x11, 0, '\n', 0, 0, 0}),
                  {"a\xEF\xBF\xBD"},
                  false},
        BytesCase{
            "Utf32WithPartialUnit", Bytes({0, 0, 0xFE, 0xFF, 0, 0, 0, 'a', 0, 0}), {"a\xEF\xBF\xBD"}, false},
        // Kept as they came, these bytes would begin the rewrite with a UTF-16 mark.
        BytesCase{
            "Utf8MarkThenBytesOfAUtf16Mark", "\xEF\xBB\xBF\xFF\xFE\t1\r\n", {"\xC3\xBF\xC3\xBE\t1"}, true},
        BytesCase{"Utf8MarkThenInvalid",
                  "\xEF\xBB\xBF"
                  "1\t\xFF\r\n",
                  {"1\t\xC3\xBF"},
                  true}),
    [](const ::testing::TestParamInfo<BytesCase>& info) { return std::string(info.param.name); });

// --- line splitting ------------------------------------------------------------------------

struct SplitCase
{
    const char* text;
    Lines lines;
    std::vector<wyx::LineEnd> ends;
};

class JournalLineEnds : public ::testing::TestWithParam<SplitCase>
{
};

TEST_P(JournalLineEnds, SplitAtCrLfLfOrCrAndComeBackUnchanged)
{
    const std::string text = GetParam().text;
    const wyx::DecodedJournal journal = wyx::DecodeJournal(text.data(), text.size());
    Lines lines;
    std::vector<wyx::LineEnd> ends;
    for (const wyx::JournalLine& line : journal.lines)
    {
        lines.push_back(Utf8(line.text));
        ends.push_back(line.end);
    }
    EXPECT_EQ(lines, GetParam().lines);
    EXPECT_EQ(ends, GetParam().ends);
    EXPECT_EQ(wyx::EncodeJournal(journal.lines), text);
}

using E = wyx::LineEnd;
INSTANTIATE_TEST_SUITE_P(
    Texts, JournalLineEnds,
    ::testing::Values(
        SplitCase{"", {}, {}}, SplitCase{"a", {"a"}, {E::None}}, SplitCase{"a\r\n", {"a"}, {E::CrLf}},
        SplitCase{"\n", {""}, {E::Lf}}, SplitCase{"a\n\rb", {"a", "", "b"}, {E::Lf, E::Cr, E::None}},
        SplitCase{"a\r\r\n", {"a", ""}, {E::Cr, E::CrLf}},
        SplitCase{"a\rb\nc\r\nd", {"a", "b", "c", "d"}, {E::Cr, E::Lf, E::CrLf, E::None}},
        SplitCase{"\r\n\r\n", {"", ""}, {E::CrLf, E::CrLf}},
        SplitCase{"a\rb\rc\r\nd\re", {"a", "b", "c", "d", "e"}, {E::Cr, E::Cr, E::CrLf, E::Cr, E::None}}));

} // namespace
} // namespace journaltest
