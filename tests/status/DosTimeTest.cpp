#include <gtest/gtest.h>

#include "data/DosTime.h"

namespace
{

wyxos::LocaleNames EnglishNames()
{
    wyxos::LocaleNames names;
    names.months = {"January", "February", "March",     "April",   "May",      "June",
                    "July",    "August",   "September", "October", "November", "December"};
    names.abbreviatedMonths = {"Jan", "Feb", "Mar", "Apr", "May", "Jun",
                               "Jul", "Aug", "Sep", "Oct", "Nov", "Dec"};
    names.days = {"Sunday", "Monday", "Tuesday", "Wednesday", "Thursday", "Friday", "Saturday"};
    names.abbreviatedDays = {"Sun", "Mon", "Tue", "Wed", "Thu", "Fri", "Sat"};
    names.am = "AM";
    names.pm = "PM";
    return names;
}

// 15 March 2021 was a Monday.
CalendarFields Moment(unsigned hour, unsigned minute = 5, unsigned second = 30)
{
    CalendarFields fields;
    fields.year = 2021;
    fields.month = 3;
    fields.day = 15;
    fields.weekDay = 1;
    fields.hour = hour;
    fields.minute = minute;
    fields.second = second;
    return fields;
}

unsigned EncodeDos(unsigned year, unsigned month, unsigned day, unsigned hour, unsigned minute,
                   unsigned second)
{
    return ((year - 1980) << 25) | (month << 21) | (day << 16) | (hour << 11) | (minute << 5) | (second / 2);
}

wxString DosText(unsigned value)
{
    return wxString::Format("%u", value);
}

struct WalkCase
{
    const char* pattern;
    unsigned hour;
    const char* expected;
};

class DatePatternWalk : public testing::TestWithParam<WalkCase>
{
};

TEST_P(DatePatternWalk, ProducesTheDocumentedItems)
{
    const WalkCase& c = GetParam();
    EXPECT_EQ(WalkDatePattern(wxString::FromUTF8(c.pattern), Moment(c.hour), EnglishNames()),
              wxString::FromUTF8(c.expected))
        << c.pattern;
}

INSTANTIATE_TEST_SUITE_P(
    Runs, DatePatternWalk,
    testing::Values(WalkCase{"dd/MM/yy", 14, "15/03/21"}, WalkCase{"M/d/yy", 14, "3/15/21"},
                    WalkCase{"d.M.yyyy", 14, "15.3.2021"}, WalkCase{"y", 14, "1"}, WalkCase{"yy", 14, "21"},
                    WalkCase{"yyy", 14, ""}, WalkCase{"yyyy", 14, "2021"}, WalkCase{"yyyyy", 14, ""},
                    WalkCase{"MMM", 14, "Mar"}, WalkCase{"MMMM", 14, "March"}, WalkCase{"MMMMM", 14, ""},
                    WalkCase{"ddd", 14, "Mon"}, WalkCase{"dddd", 14, "Monday"}, WalkCase{"ddddd", 14, ""},
                    WalkCase{"dddd, MMMM d, yyyy", 14, "Monday, March 15, 2021"},
                    // Quotes are copied and the letters inside still count.
                    WalkCase{"d 'de' MMMM", 14, "15 '15e' March"},
                    WalkCase{"yyyy\xE5\xB9\xB4MM\xE6\x9C\x88", 14,
                             "2021\xE5\xB9\xB4"
                             "03\xE6\x9C\x88"},
                    WalkCase{"", 14, ""}));

class TimePatternWalk : public testing::TestWithParam<WalkCase>
{
};

TEST_P(TimePatternWalk, ProducesTheDocumentedItems)
{
    const WalkCase& c = GetParam();
    EXPECT_EQ(WalkTimePattern(wxString::FromUTF8(c.pattern), Moment(c.hour), EnglishNames()),
              wxString::FromUTF8(c.expected))
        << c.pattern << " at hour " << c.hour;
}

INSTANTIATE_TEST_SUITE_P(
    Runs, TimePatternWalk,
    testing::Values(WalkCase{"HH:mm:ss", 14, "14:05:30"}, WalkCase{"h:mm:ss tt", 14, "2:05:30 PM"},
                    WalkCase{"h:mm tt", 0, "12:05 AM"}, WalkCase{"hh:mm tt", 0, "12:05 AM"},
                    WalkCase{"h:mm t", 0, "12:05 A"}, WalkCase{"h:mm t", 12, "12:05 P"},
                    WalkCase{"H:m:s", 9, "9:5:30"}, WalkCase{"HH", 9, "09"}, WalkCase{"hh", 21, "09"},
                    WalkCase{"HHH", 9, ""}, WalkCase{"hhh", 9, ""}, WalkCase{"mmm", 9, ""},
                    WalkCase{"sss", 9, ""}, WalkCase{"ttt", 9, ""}, WalkCase{"HH 'h'", 9, "09 '9'"},
                    WalkCase{"H.mm", 23, "23.05"}));

TEST(PatternWalk, NamesThatCouldNotBeFetchedProduceNothing)
{
    wyxos::LocaleNames names;
    EXPECT_EQ(WalkDatePattern("MMMM d", Moment(14), names), " 15");
    EXPECT_EQ(WalkTimePattern("h:mm t", Moment(14), names), "2:05 ");
    EXPECT_EQ(WalkTimePattern("h:mm tt", Moment(14), names), "2:05 ");
}

wyxos::LocaleTimeInfo PatternInfo(const char* date, const char* time)
{
    wyxos::LocaleTimeInfo info;
    info.hasDatePattern = true;
    info.datePattern = date;
    info.hasTimePattern = true;
    info.timePattern = time;
    info.names = EnglishNames();
    return info;
}

TEST(FormatDosTime, SplitsTheValueIntoLocalDateAndTime)
{
    const wxString text = DosText(EncodeDos(2021, 3, 15, 14, 5, 30));
    EXPECT_EQ(FormatDosTime(text, PatternInfo("dd/MM/yy", "HH:mm:ss")), "15/03/21, 14:05:30");
    EXPECT_EQ(FormatDosTime(text, PatternInfo("M/d/yy", "h:mm:ss tt")), "3/15/21, 2:05:30 PM");
    EXPECT_EQ(FormatDosTime(text, PatternInfo("dddd", "h tt")), "Monday, 2 PM");
    // Only the leading digits count.
    EXPECT_EQ(FormatDosTime(text + "\tjunk 7", PatternInfo("dd/MM/yy", "HH:mm:ss")), "15/03/21, 14:05:30");
}

TEST(FormatDosTime, ComputesTheWeekDayOfEveryDate)
{
    const wyxos::LocaleTimeInfo info = PatternInfo("ddd yyyy-MM-dd", "HH");
    for (wxDateTime day(1, wxDateTime::Jan, 1980); day.GetYear() < 2108; day += wxDateSpan::Days(97))
    {
        const wxString text = DosText(EncodeDos(day.GetYear(), day.GetMonth() + 1, day.GetDay(), 12, 0, 0));
        EXPECT_EQ(FormatDosTime(text, info), day.Format("%a %Y-%m-%d, 12")) << text;
    }
}

TEST(FormatDosTime, ValuesThatNameNoMomentGiveNoText)
{
    const wyxos::LocaleTimeInfo info = PatternInfo("dd/MM/yy", "HH:mm:ss");
    for (const wxString& text :
         {wxString(""), wxString("abc"), wxString("0"), wxString("-1"), wxString("99999999999999999999"),
          DosText(EncodeDos(2021, 0, 15, 1, 1, 2)), DosText(EncodeDos(2021, 13, 15, 1, 1, 2)),
          DosText(EncodeDos(2021, 2, 29, 1, 1, 2)), DosText(EncodeDos(2021, 4, 31, 1, 1, 2)),
          DosText(EncodeDos(2021, 4, 0, 1, 1, 2)), DosText(EncodeDos(2021, 4, 1, 24, 1, 2)),
          DosText(EncodeDos(2021, 4, 1, 1, 60, 2)), DosText(EncodeDos(2021, 4, 1, 1, 1, 60))})
        EXPECT_EQ(FormatDosTime(text, info), "") << text;
    EXPECT_EQ(FormatDosTime(DosText(EncodeDos(2020, 2, 29, 23, 59, 58)), info), "29/02/20, 23:59:58");
    EXPECT_EQ(FormatDosTime(DosText(EncodeDos(2107, 12, 31, 0, 0, 0)), info), "31/12/07, 00:00:00");
}

TEST(FormatLocaleDateAndTime, FallBackToTheLibraryWhenThePatternFails)
{
    const CalendarFields fields = Moment(14);
    const wxDateTime moment(15, wxDateTime::Mar, 2021, 14, 5, 30);
    wyxos::LocaleTimeInfo unreadable;
    EXPECT_EQ(FormatLocaleDate(fields, unreadable), moment.Format("%x"));
    EXPECT_EQ(FormatLocaleTime(fields, unreadable), moment.Format("%X"));

    const wyxos::LocaleTimeInfo empty = PatternInfo("yyy", "ttt");
    EXPECT_EQ(FormatLocaleDate(fields, empty), moment.Format("%x"));
    EXPECT_EQ(FormatLocaleTime(fields, empty), moment.Format("%X"));
}

TEST(FormatLocaleDateAndTime, UserLocaleVersionsAgreeWithTheExplicitOnes)
{
    const wxDateTime moment(15, wxDateTime::Mar, 2021, 14, 5, 30);
    EXPECT_EQ(FormatLocaleDate(moment), FormatLocaleDate(Moment(14), UserLocaleTimeInfo()));
    EXPECT_EQ(FormatLocaleTime(moment), FormatLocaleTime(Moment(14), UserLocaleTimeInfo()));
    EXPECT_EQ(FormatLocaleDate(wxDateTime()), "");
    EXPECT_EQ(FormatDosTime(DosText(EncodeDos(2021, 3, 15, 14, 5, 30))),
              FormatLocaleDate(moment) + ", " + FormatLocaleTime(moment));
}

} // namespace
