"""Values between Python and the forms in which calls are written (docs/batch.md)."""

from __future__ import annotations

import datetime
import decimal
import math
from typing import Any, Callable, NamedTuple

_DAY_0 = datetime.datetime(1899, 12, 30)


class _Singleton:
    def __init__(self, name: str) -> None:
        self._name = name

    def __repr__(self) -> str:
        return self._name


#: A variant without a value. ``None`` is Null, a value that is unknown.
EMPTY = _Singleton("EMPTY")

#: An optional argument that is left out.
MISSING = _Singleton("MISSING")

#: An array of other elements than texts, whose contents are not available.
FOREIGN_ARRAY = _Singleton("FOREIGN_ARRAY")


class ErrorValue(NamedTuple):
    """A variant that holds an error code."""

    code: int


def _encode_number(value: float) -> Any:
    if isinstance(value, int):
        return value if -(2**31) <= value < 2**31 else float(value)
    if math.isfinite(value):
        return value
    return {"double": "nan" if math.isnan(value) else "inf" if value > 0 else "-inf"}


def _encode_datetime(value: datetime.datetime) -> Any:
    if value.tzinfo is not None:
        raise TypeError(f"{value!r} has a time zone; pass a local time without one")
    if value.microsecond == 0:
        return {"date": value.strftime("%Y-%m-%dT%H:%M:%S").zfill(19)}
    days = value - _DAY_0
    whole, time = days.days, days - datetime.timedelta(days.days)
    fraction = time / datetime.timedelta(1)
    # Before day 0 the fraction counts from midnight all the same.
    return {"days": whole + fraction if whole >= 0 else whole - fraction}


def encode(value: Any) -> Any:
    """A value as JSON can hold it."""
    if value is None or isinstance(value, (bool, str)):
        return value
    if isinstance(value, ErrorValue):
        return {"error": value.code}
    if isinstance(value, (int, float)):
        return _encode_number(value)
    if isinstance(value, datetime.datetime):
        return _encode_datetime(value)
    if isinstance(value, datetime.date):
        return _encode_datetime(datetime.datetime.combine(value, datetime.time()))
    if isinstance(value, datetime.time):
        return _encode_datetime(datetime.datetime.combine(_DAY_0, value))
    if isinstance(value, decimal.Decimal):
        return {"currency": format(value, "f")}
    if isinstance(value, dict):
        return {"system_time": value}
    if isinstance(value, (list, tuple)):
        return [encode(item) for item in value]
    for known, form in ((EMPTY, "empty"), (MISSING, "missing"), (FOREIGN_ARRAY, "array")):
        if value is known:
            return {form: True}
    number = getattr(value, "object_number", None)
    if number is not None:
        return {"object": number}
    raise TypeError(f"{value!r} is no value for a call; pass a text, number, date, list, None or object")


def _decode_days(days: Any) -> Any:
    whole = math.trunc(float(days)) if math.isfinite(float(days)) else None
    if whole is None:
        return float(days)
    try:
        return _DAY_0 + datetime.timedelta(whole) + datetime.timedelta(abs(days - whole))
    except OverflowError:
        return float(days)


_FORMS: dict[str, Callable[[Any], Any]] = {
    "empty": lambda _: EMPTY,
    "missing": lambda _: MISSING,
    "array": lambda _: FOREIGN_ARRAY,
    "boolean": bool,
    "byte": int,
    "integer": int,
    "long": int,
    "single": float,
    "double": float,
    "currency": decimal.Decimal,
    "date": datetime.datetime.fromisoformat,
    "days": _decode_days,
    "error": ErrorValue,
    "system_time": dict,
    "list": lambda items: items or [],
}


def decode(value: Any, make_object: Callable[[int], Any]) -> Any:
    """The Python value for an answer."""
    if not isinstance(value, dict):
        return value
    form, content = next(iter(value.items()))
    if form == "object":
        return None if content is None else make_object(content)
    return _FORMS[form](content)
