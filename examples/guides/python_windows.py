"""TALUtil from Python on Windows, with pywin32 (pip install pywin32), bound late."""

import pythoncom
from win32com.client import VARIANT
from win32com.client.dynamic import DumbDispatch

u = DumbDispatch("TALUtil.ORVUtils")
print(u.VerifyTextData(20, 1, "  Smith & Sons, Pty  "))

# A VARIANT by reference passes a variable that the call changes.
names = VARIANT(pythoncom.VT_BYREF | pythoncom.VT_VARIANT, None)
count = u.ReadCommaDelimStrToList("red,green,blue,", names)
print(count, names.value)
week = VARIANT(pythoncom.VT_BYREF | pythoncom.VT_I2, 60)
u.WeekYearToDate(week, 2009, 1)
print("week", week.value)

try:
    u.GetWeekNumber("tomorrow")
except pythoncom.com_error as error:
    _, source, description, _, _, code = error.excepinfo
    print(f"error {code & 0xFFFF}: {description} ({source})")
u.Terminate()
