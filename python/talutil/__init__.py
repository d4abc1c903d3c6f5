"""TALUtil: cleaning text for the database, lists, day-first dates, settings, files and reports.

>>> import talutil
>>> toolkit = talutil.ORVUtils()
>>> toolkit.GetData("A,B,C,", 1, 2)
'B'
>>> toolkit.WeekYearToDate(60, 2009, 1)
WeekYearToDateResult(result=datetime.datetime(2009, 12, 24, 0, 0), iWeek=52)
"""

from .library import Library, Object, RunTimeError
from .members import ORVUtils
from .values import EMPTY, FOREIGN_ARRAY, MISSING, ErrorValue

__all__ = ["EMPTY", "FOREIGN_ARRAY", "MISSING", "ErrorValue", "Library", "ORVUtils", "Object", "RunTimeError"]
