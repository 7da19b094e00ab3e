// DOS date-times in the user's locale: the pattern walker, the strftime
// conversion, and every installed locale checked against the C library.
#include <gtest/gtest.h>

#include <ctime>
#include <langinfo.h>
#include <locale.h>

#include <wx/arrstr.h>
#include <wx/datetime.h>
#include <wx/strconv.h>

#include "data/DosTime.h"
#include "platform/os/LocaleInfo.h"

namespace
{

const wyxos::LocaleNames kEnglish{
    {"January", "February", "March", "April", "May", "June", "July", "August", "September", "October",
     "November", "December"},
    {"Jan", "Feb", "Mar", "Apr", "May", "Jun", "Jul", "Aug", "Sep", "Oct", "Nov", "Dec"},
    {"Sunday", "Monday", "Tuesday", "Wednesday", "Thursday", "Friday", "Saturday"},
    {"Sun", "Mon", "Tue", "Wed", "Thu", "Fri", "Sat"},
    "AM",
    "PM"};

// 15 March 2021 was a Monday.
const auto Moment = [](unsigned hour) { return CalendarFields{2021, 3, 15, 1, hour, 5, 30}; };

wxString Dos(unsigned year, unsigned month, unsigned day, unsigned hour, unsigned minute, unsigned second)
{
    return wxString::Format("%u", ((year - 1980) << 25) | (month << 21) | (day << 16) | (hour << 11) |
                                      (minute << 5) | (second / 2));
}

const auto PatternInfo = [](const char* date, const char* time) {
    return wyxos::LocaleTimeInfo{true, date, true, time, kEnglish};
};

// Kind (D or T), the hour, the pattern and after '=' what it gives at 15 March
// 2021, hh:05:30. Runs longer than a field's longest form give nothing; quotes
// are copied and the letters inside still count.
TEST(PatternWalk, ProducesTheDocumentedItems)
{
    for (const wxString& walk : wxSplit(
             wxString::FromUTF8(
                 "D14M/d/yy=3/15/21|D14y yy yyy yyyy yyyyy=1 21  2021 |D14d 'de' MMMM=15 '15e' March|D14=|"
                 "D14MMM MMMM MMMMM ddd dddd ddddd=Mar March  Mon Monday |T21hh=09|T23H.mm=23.05|"
                 "T14HH:mm:ss h:mm:ss tt=14:05:30 2:05:30 PM|T00h:mm tt hh t=12:05 AM 12 A|T12h:mm t=12:05 P|"
                 "T09H:m:s HH HHH hhh mmm sss ttt 'h'=9:5:30 09      '9'|"
                 "D14yyyy\xE5\xB9\xB4MM\xE6\x9C\x88=2021\xE5\xB9\xB4"
                 "03\xE6\x9C\x88"),
             '|'))
    {
        const CalendarFields moment = Moment(std::stoul(walk.Mid(1, 2).ToStdString()));
        const auto walker = walk[0] == 'D' ? WalkDatePattern : WalkTimePattern;
        EXPECT_EQ(walker(walk.Mid(3).BeforeFirst('='), moment, kEnglish), walk.AfterFirst('=')) << walk;
    }
    // A locale without am/pm names: the designator is left out, not read past its end.
    EXPECT_EQ(WalkTimePattern("h:mm t", Moment(14), wyxos::LocaleNames()), "2:05 ");
}

TEST(FormatDosTime, SplitsTheValueIntoLocalDateAndTimeOfRealMomentsOnlyFallingBackToTheLibrary)
{
    const wxString text = Dos(2021, 3, 15, 14, 5, 30);
    const wyxos::LocaleTimeInfo info = PatternInfo("dd/MM/yy", "HH:mm:ss");
    EXPECT_EQ(FormatDosTime(text, info), "15/03/21, 14:05:30");
    EXPECT_EQ(FormatDosTime(text + "\tjunk 7", info), "15/03/21, 14:05:30"); // only the leading digits count
    EXPECT_EQ(FormatDosTime(Dos(2020, 2, 29, 23, 59, 58), info), "29/02/20, 23:59:58");
    EXPECT_EQ(FormatDosTime(Dos(2107, 12, 31, 0, 0, 0), info), "31/12/07, 00:00:00");
    for (const wxString& none :
         {wxString(""), wxString("abc"), wxString("0"), wxString("-1"), wxString("99999999999999999999"),
          Dos(2021, 0, 15, 1, 1, 2), Dos(2021, 13, 15, 1, 1, 2), Dos(2021, 2, 29, 1, 1, 2),
          Dos(2021, 4, 31, 1, 1, 2), Dos(2021, 4, 0, 1, 1, 2), Dos(2021, 4, 1, 24, 1, 2),
          Dos(2021, 4, 1, 1, 60, 2), Dos(2021, 4, 1, 1, 1, 60)})
        EXPECT_EQ(FormatDosTime(none, info), "") << none;

    const wyxos::LocaleTimeInfo weekDays = PatternInfo("ddd yyyy-MM-dd", "HH");
    for (wxDateTime day(1, wxDateTime::Jan, 1980); day.GetYear() < 2108; day += wxDateSpan::Days(97))
        EXPECT_EQ(FormatDosTime(Dos(day.GetYear(), day.GetMonth() + 1, day.GetDay(), 12, 0, 0), weekDays),
                  day.Format("%a %Y-%m-%d, 12"));

    // The library's %x and %X where a pattern fails; the user's locale by default.
    const wxDateTime moment(15, wxDateTime::Mar, 2021, 14, 5, 30);
    for (const wyxos::LocaleTimeInfo& failing : {wyxos::LocaleTimeInfo(), PatternInfo("yyy", "ttt")})
        EXPECT_EQ(FormatLocaleDate(Moment(14), failing) + FormatLocaleTime(Moment(14), failing),
                  moment.Format("%x%X"));
    EXPECT_EQ(FormatDosTime(text), FormatLocaleDate(moment) + ", " + FormatLocaleTime(moment));
}

// Kind (D or T), the C library's format, and after '=' our pattern, or nothing
// when it cannot be read: a literal letter the walker would take for a field,
// neighbouring fields that would merge into one run, no equivalent, a field of
// the other kind.
TEST(StrftimeConversion, GivesTheWindowsLettersOrRefuses)
{
    for (const wxString& c :
         wxSplit("D%e.%m.%Y=d.MM.yyyy|D%-d.%-m.%Y=d.M.yyyy|D%a %d %b %Y=ddd dd MMM yyyy|"
                 "D%A, %B %d=dddd, MMMM dd|D%D %F=MM/dd/yy yyyy-MM-dd|T%R %k %l %p=HH:mm H h tt|"
                 "T%H%%%M=HH%mm|T%H%t%M%n=HH\tmm\n|D%Y-%m-%d KW=yyyy-MM-dd KW|T%M%S=mmss|T%r=tt hh:mm|"
                 "T%Hh%M=|D%Y y=|D%d%e=|T%H%k=|D%Ey=|D%j=|D%x=|D%H:%M=|T%d %H=|T%P=|D%-y=|T%H%=",
                 '|'))
    {
        const wxString expected = c.AfterFirst('=');
        const wyxos::PatternKind kind = c[0] == 'D' ? wyxos::PatternKind::Date : wyxos::PatternKind::Time;
        wxString pattern = "untouched";
        EXPECT_EQ(wyxos::ConvertStrftimePattern(c.Mid(1).BeforeFirst('='), kind, "%p %I:%M", pattern),
                  !expected.empty())
            << c;
        EXPECT_EQ(pattern, expected.empty() ? "untouched" : expected) << c;
    }
    // The am/pm composite needs the locale's format, and one naming itself is not expanded for ever.
    wxString pattern;
    EXPECT_FALSE(wyxos::ConvertStrftimePattern("%r", wyxos::PatternKind::Time, "", pattern));
    EXPECT_FALSE(wyxos::ConvertStrftimePattern("%r", wyxos::PatternKind::Time, "%r", pattern));
}

// strftime's %x or %X in a locale: the reference our walker must meet.
wxString CLibraryFormat(locale_t locale, const char* format, const CalendarFields& f)
{
    std::tm tm{}; // the C library works out the week day
    const wxString text =
        wxString::Format("%u-%u-%u %u:%u:%u", f.year, f.month, f.day, f.hour, f.minute, f.second);
    EXPECT_NE(strptime(text.c_str(), "%Y-%m-%d %H:%M:%S", &tm), nullptr);
    char buffer[256];
    const size_t length = strftime_l(buffer, sizeof buffer, format, &tm, locale);
    return wxString(buffer, wxCSConv(nl_langinfo_l(CODESET, locale)), length);
}

// Installed locales of several scripts, encodings and 12/24-hour clocks.
TEST(LocaleReference, DateAndTimeEqualTheCLibrarysFormats)
{
    for (const wxString& name :
         wxSplit("C en_US.UTF-8 de_DE.UTF-8 fr_FR.UTF-8 ja_JP.UTF-8 en_GB.UTF-8 zh_CN.UTF-8 "
                 "ko_KR.UTF-8 ru_RU.UTF-8 cs_CZ.UTF-8 tr_TR.UTF-8 fi_FI.UTF-8 pt_BR.UTF-8 "
                 "zh_TW.UTF-8 ja_JP.EUC-JP de_DE.ISO-8859-1",
                 ' '))
    {
        SCOPED_TRACE(name);
        const locale_t reference = newlocale(LC_ALL_MASK, name.c_str(), nullptr);
        wyxos::LocaleTimeInfo info;
        ASSERT_TRUE(reference != nullptr && wyxos::ReadLocaleTimeInfo(name, info) && info.hasDatePattern &&
                    info.hasTimePattern)
            << "not installed or not converted";
        // One moment in each month and on each week day, at hours around the 12-hour edges.
        for (unsigned i = 0; i < 12; ++i)
        {
            const unsigned hours[] = {0, 1, 9, 11, 12, 13, 23};
            const wxDateTime day(1 + i * 2, static_cast<wxDateTime::Month>(i), 2000 + i * 9);
            const unsigned year = day.GetYear(), weekDay = day.GetWeekDay();
            const CalendarFields fields{year,         i + 1,     day.GetDay(), weekDay,
                                        hours[i % 7], i * 5 + 1, 58 - i * 4};
            EXPECT_EQ(FormatLocaleDate(fields, info), CLibraryFormat(reference, "%x", fields))
                << info.datePattern;
            EXPECT_EQ(FormatLocaleTime(fields, info), CLibraryFormat(reference, "%X", fields))
                << info.timePattern << " at hour " << fields.hour;
        }
        freelocale(reference);
    }
    // Names come in the locale's own encoding; a locale the system lacks (a user's LANG may name one) is
    // refused rather than read through a null handle.
    wyxos::LocaleTimeInfo utf8, latin1;
    EXPECT_FALSE(wyxos::ReadLocaleTimeInfo("xx_NOWHERE.UTF-8", utf8));
    ASSERT_TRUE(wyxos::ReadLocaleTimeInfo("de_DE.UTF-8", utf8) &&
                wyxos::ReadLocaleTimeInfo("de_DE.ISO-8859-1", latin1));
    EXPECT_EQ(latin1.names.months[2] + utf8.names.months[2] + utf8.names.days[0] +
                  utf8.names.abbreviatedDays[1],
              wxString::FromUTF8("M\xC3\xA4rzM\xC3\xA4rzSonntagMo"));
}

} // namespace
