#!/usr/bin/env python3
"""Uses the Python package. Each check that fails is a line; the last line is "N passed, N failed"."""

import datetime
import decimal
import math
import sys

import talutil
from talutil.values import decode, encode

passed = failed = 0


def check(name, expected, actual):
    global passed, failed
    if type(expected) is type(actual) and (expected == actual or expected != expected):
        passed += 1
    else:
        failed += 1
        print(f"FAILED: {name}\n  expected: {expected!r}\n  actual:   {actual!r}")


def error_of(work):
    try:
        work()
    except talutil.RunTimeError as error:
        return error.number, error.description, error.written_back
    except Exception as error:
        return type(error)
    return None


u = talutil.ORVUtils()
date = datetime.datetime(2009, 3, 31, 10, 20, 30)
check("a text", "O´Brien an", u.VerifyTextData(10, 0, "  O'Brien & Sons  "))
check("NUL and a lone surrogate", "\ud800b\0a", u.ReverseString("a\0b\ud800"))
check("written back", (datetime.datetime(2009, 12, 24), 52), tuple(u.WeekYearToDate(60, 2009, 1)))
check("by name", " ", u.RemoveStringsFromNumber(2, "A B", "").sCharacter)
check("a list", ["a", "b"], u.ReadCommaDelimStrToList("a,b,", []).sFList)
check("a date", datetime.datetime(2009, 12, 30), u.UTCToLocalTime(u.LocalTimeToUTC(datetime.datetime(2009, 12, 30))))
check("an error", (13, "Type mismatch", {"iWeek": 52}),
      error_of(lambda: u.GetWeekInDateRange("1/1/2009", "x", 60, 2009)))
check("a record", 31, u.DateToSystemTime(date, {}).system_time["wDay"])
u.iBranchID = 7
check("a property", 7, u.iBranchID)
check("a Single", True, math.isclose(setattr(u, "GSTValue", 0.1) or u.GSTValue, 0.1))
check("shared by toolkits of a library", 7, talutil.ORVUtils(u.library).iBranchID)
check("not by others", 0, talutil.ORVUtils().iBranchID)
check("a code page", "Ольга", talutil.ORVUtils(code_page=1251).VerifyTextData(0, 0, "Ольга?"))
grid = u.library.create("Grid")
grid.put("Rows", 2)
grid.put("Cols", 2)
grid.put("TextMatrix", 0, 1, "x")
check("an indexed property", "x", grid.get("TextMatrix", 0, 1))
check("an object as an argument", None, u.SaveGridWidths(grid, "S", 0))
number = grid.object_number
del grid
check("a released object", 424, error_of(lambda: u.library.request({"on": number, "call": "Rows"}))[0])
check("no such class", 429, error_of(lambda: u.library.create("Gird"))[0])
check("no value", TypeError, error_of(lambda: u.StripNulls(object())))
check("help", True, "comma" in talutil.ORVUtils.GetData.__doc__)
u.library.close()
check("closed", ValueError, error_of(lambda: u.iBranchID))

for value in (None, True, "a", -2**31, 2.5, float("inf"), float("nan"), date, date.replace(microsecond=500000),
              datetime.datetime(1850, 6, 7, 18, 0, 0, 250000), datetime.datetime(100, 1, 1), decimal.Decimal("-1.25"), ["a"], {"wYear": 2009},
              talutil.ErrorValue(5), talutil.EMPTY, talutil.MISSING, talutil.FOREIGN_ARRAY):
    back = decode(encode(value), None)
    if isinstance(value, datetime.datetime) and value.microsecond:
        back, value = back.replace(microsecond=0), value.replace(microsecond=0)
    check(f"{value!r} and back", value, back)

print(f"{passed} passed, {failed} failed")
sys.exit(failed != 0)
