#include <gtest/gtest.h>

#include <ctime>
#include <langinfo.h>
#include <locale.h>

#include <wx/strconv.h>

#include "data/DosTime.h"
#include "platform/os/LocaleInfo.h"

namespace
{

struct ConversionCase
{
    const char* format;
    wyxos::PatternKind kind;
    const char* expected; // nullptr: cannot be read
};

class StrftimeConversion : public testing::TestWithParam<ConversionCase>
{
};

TEST_P(StrftimeConversion, GivesTheWindowsLettersOrRefuses)
{
    const ConversionCase& c = GetParam();
    wxString pattern = "untouched";
    const bool converted =
        wyxos::ConvertStrftimePattern(wxString::FromUTF8(c.format), c.kind, "%I:%M:%S %p", pattern);
    if (c.expected == nullptr)
    {
        EXPECT_FALSE(converted) << c.format << " gave " << pattern;
        EXPECT_EQ(pattern, "untouched");
    }
    else
    {
        ASSERT_TRUE(converted) << c.format;
        EXPECT_EQ(pattern, wxString::FromUTF8(c.expected)) << c.format;
    }
}

constexpr auto Date = wyxos::PatternKind::Date;
constexpr auto Time = wyxos::PatternKind::Time;

INSTANTIATE_TEST_SUITE_P(
    Patterns, StrftimeConversion,
    testing::Values(ConversionCase{"%m/%d/%y", Date, "MM/dd/yy"},
                    ConversionCase{"%d.%m.%Y", Date, "dd.MM.yyyy"},
                    ConversionCase{"%e.%m.%Y", Date, "d.MM.yyyy"},
                    ConversionCase{"%-d.%-m.%Y", Date, "d.M.yyyy"},
                    ConversionCase{"%a %d %b %Y", Date, "ddd dd MMM yyyy"},
                    ConversionCase{"%A, %B %d", Date, "dddd, MMMM dd"},
                    ConversionCase{"%D", Date, "MM/dd/yy"}, ConversionCase{"%F", Date, "yyyy-MM-dd"},
                    ConversionCase{"%Y\xE5\xB9\xB4%m\xE6\x9C\x88%d\xE6\x97\xA5", Date,
                                   "yyyy\xE5\xB9\xB4MM\xE6\x9C\x88"
                                   "dd\xE6\x97\xA5"},
                    ConversionCase{"%H:%M:%S", Time, "HH:mm:ss"}, ConversionCase{"%T", Time, "HH:mm:ss"},
                    ConversionCase{"%R", Time, "HH:mm"}, ConversionCase{"%r", Time, "hh:mm:ss tt"},
                    ConversionCase{"%k:%M", Time, "H:mm"}, ConversionCase{"%l:%M %p", Time, "h:mm tt"},
                    ConversionCase{"%H.%M.%S", Time, "HH.mm.ss"}, ConversionCase{"%H%%%M", Time, "HH%mm"},
                    // A literal letter the walker would read as a field.
                    ConversionCase{"%Hh%M", Time, nullptr}, ConversionCase{"%d de %B", Date, nullptr},
                    ConversionCase{"%Y y", Date, nullptr}, ConversionCase{"%H:%M Uhr", Time, nullptr},
                    ConversionCase{"%Y-%m-%d KW", Date, "yyyy-MM-dd KW"},
                    // Neighbouring conversions that would merge into one longer run.
                    ConversionCase{"%d%e", Date, nullptr}, ConversionCase{"%m%b", Date, nullptr},
                    ConversionCase{"%H%k", Time, nullptr}, ConversionCase{"%M%S", Time, "mmss"},
                    // No equivalent, or a field of the other kind.
                    ConversionCase{"%Ey", Date, nullptr}, ConversionCase{"%Oy", Date, nullptr},
                    ConversionCase{"%j", Date, nullptr}, ConversionCase{"%C%y", Date, nullptr},
                    ConversionCase{"%x", Date, nullptr}, ConversionCase{"%H:%M", Date, nullptr},
                    ConversionCase{"%d %H", Time, nullptr}, ConversionCase{"%P", Time, nullptr},
                    ConversionCase{"%Z", Time, nullptr}, ConversionCase{"%_H", Time, nullptr},
                    ConversionCase{"%-y", Date, nullptr}, ConversionCase{"%H%", Time, nullptr}));

TEST(StrftimeConversion, AmPmCompositeNeedsTheLocalesFormat)
{
    wxString pattern;
    EXPECT_FALSE(wyxos::ConvertStrftimePattern("%r", Time, "", pattern));
    EXPECT_TRUE(wyxos::ConvertStrftimePattern("%r", Time, "%p %I:%M", pattern));
    EXPECT_EQ(pattern, "tt hh:mm");
    // A format that names itself is not expanded for ever.
    EXPECT_FALSE(wyxos::ConvertStrftimePattern("%r", Time, "%r", pattern));
}

// strftime's %x and %X of a locale, the reference our walker must meet.
struct CLibraryLocale
{
    explicit CLibraryLocale(const char* name) : handle(newlocale(LC_ALL_MASK, name, nullptr)) {}
    ~CLibraryLocale()
    {
        if (handle != nullptr)
            freelocale(handle);
    }
    wxString Format(const char* format, const CalendarFields& fields) const
    {
        std::tm tm{};
        tm.tm_year = static_cast<int>(fields.year) - 1900;
        tm.tm_mon = static_cast<int>(fields.month) - 1;
        tm.tm_mday = static_cast<int>(fields.day);
        tm.tm_wday = static_cast<int>(fields.weekDay);
        tm.tm_hour = static_cast<int>(fields.hour);
        tm.tm_min = static_cast<int>(fields.minute);
        tm.tm_sec = static_cast<int>(fields.second);
        char buffer[256];
        const size_t length = strftime_l(buffer, sizeof buffer, format, &tm, handle);
        return wxString(buffer, wxCSConv(nl_langinfo_l(CODESET, handle)), length);
    }
    // True when the locale's own formats use a padding our letters cannot show.
    bool UsesSpacePadding() const
    {
        for (nl_item item : {D_FMT, T_FMT, T_FMT_AMPM})
        {
            const std::string format = nl_langinfo_l(item, handle);
            for (const char* padded : {"%e", "%k", "%l"})
                if (format.find(padded) != std::string::npos)
                    return true;
        }
        return false;
    }
    locale_t handle;
};

std::vector<CalendarFields> SampleMoments()
{
    std::vector<CalendarFields> moments;
    // One moment in each month and on each week day, at hours around the 12-hour edges.
    const unsigned hours[] = {0, 1, 9, 11, 12, 13, 23};
    for (unsigned i = 0; i < 12; ++i)
    {
        const wxDateTime day(static_cast<wxDateTime::wxDateTime_t>(1 + i * 2),
                             static_cast<wxDateTime::Month>(i), 2000 + static_cast<int>(i * 9));
        CalendarFields fields;
        fields.year = static_cast<unsigned>(day.GetYear());
        fields.month = i + 1;
        fields.day = day.GetDay();
        fields.weekDay = static_cast<unsigned>(day.GetWeekDay());
        fields.hour = hours[i % 7];
        fields.minute = i * 5 + 1;
        fields.second = 58 - i * 4;
        moments.push_back(fields);
    }
    return moments;
}

class LocaleReference : public testing::TestWithParam<const char*>
{
};

TEST_P(LocaleReference, DateAndTimeEqualTheCLibrarysFormats)
{
    const char* name = GetParam();
    const CLibraryLocale reference(name);
    ASSERT_NE(reference.handle, nullptr) << name << " is not installed";
    wyxos::LocaleTimeInfo info;
    ASSERT_TRUE(wyxos::ReadLocaleTimeInfo(name, info));
    ASSERT_TRUE(info.hasDatePattern) << name;
    ASSERT_TRUE(info.hasTimePattern) << name;
    for (const CalendarFields& fields : SampleMoments())
    {
        EXPECT_EQ(FormatLocaleDate(fields, info), reference.Format("%x", fields))
            << name << " pattern " << info.datePattern;
        EXPECT_EQ(FormatLocaleTime(fields, info), reference.Format("%X", fields))
            << name << " pattern " << info.timePattern << " hour " << fields.hour;
    }
}

INSTANTIATE_TEST_SUITE_P(InstalledLocales, LocaleReference,
                         testing::Values("C", "en_US.UTF-8", "de_DE.UTF-8", "fr_FR.UTF-8", "ja_JP.UTF-8",
                                         "en_GB.UTF-8", "zh_CN.UTF-8", "ko_KR.UTF-8", "ru_RU.UTF-8",
                                         "cs_CZ.UTF-8", "tr_TR.UTF-8", "fi_FI.UTF-8", "pt_BR.UTF-8",
                                         "zh_TW.UTF-8", "ja_JP.EUC-JP", "de_DE.ISO-8859-1"));

// Every locale whose formats convert at all agrees with the C library, apart
// from the space padding that has no letter.
TEST(LocaleReference, NoConvertedLocaleDisagrees)
{
    const char* names[] = {"es_ES.UTF-8", "it_IT.UTF-8", "nl_NL.UTF-8", "pl_PL.UTF-8", "hu_HU.UTF-8",
                           "fr_CA.UTF-8", "sv_SE.UTF-8", "da_DK.UTF-8", "nb_NO.UTF-8", "el_GR.UTF-8",
                           "he_IL.UTF-8", "ar_EG.UTF-8", "th_TH.UTF-8", "vi_VN.UTF-8", "hi_IN.UTF-8",
                           "uk_UA.UTF-8", "bg_BG.UTF-8", "pt_PT.UTF-8", "en_AU.UTF-8", "en_CA.UTF-8",
                           "fr_CH.UTF-8", "de_CH.UTF-8", "sk_SK.UTF-8", "ro_RO.UTF-8", "lt_LT.UTF-8"};
    int compared = 0;
    for (const char* name : names)
    {
        const CLibraryLocale reference(name);
        wyxos::LocaleTimeInfo info;
        if (reference.handle == nullptr || !wyxos::ReadLocaleTimeInfo(name, info) ||
            reference.UsesSpacePadding())
            continue;
        for (const CalendarFields& fields : SampleMoments())
        {
            if (info.hasDatePattern)
                EXPECT_EQ(FormatLocaleDate(fields, info), reference.Format("%x", fields)) << name;
            if (info.hasTimePattern)
                EXPECT_EQ(FormatLocaleTime(fields, info), reference.Format("%X", fields)) << name;
        }
        compared += info.hasDatePattern && info.hasTimePattern;
    }
    EXPECT_GT(compared, 10);
}

TEST(LocaleInfo, ReadsNamesInTheLocalesOwnEncoding)
{
    wyxos::LocaleTimeInfo utf8;
    wyxos::LocaleTimeInfo latin1;
    ASSERT_TRUE(wyxos::ReadLocaleTimeInfo("de_DE.UTF-8", utf8));
    ASSERT_TRUE(wyxos::ReadLocaleTimeInfo("de_DE.ISO-8859-1", latin1));
    EXPECT_EQ(utf8.names.months[2], wxString::FromUTF8("M\xC3\xA4rz"));
    EXPECT_EQ(latin1.names.months[2], utf8.names.months[2]);
    EXPECT_EQ(utf8.names.days[0], "Sonntag");
    EXPECT_EQ(utf8.names.abbreviatedDays[1], "Mo");
}

TEST(LocaleInfo, AnUnknownLocaleIsReportedAndLeavesTheInfoAlone)
{
    wyxos::LocaleTimeInfo info;
    info.datePattern = "kept";
    EXPECT_FALSE(wyxos::ReadLocaleTimeInfo("xx_NOWHERE.UTF-8", info));
    EXPECT_EQ(info.datePattern, "kept");
}

} // namespace
