"""Converts CIM datetimes and calculates the end of a term."""

import calendar
import datetime
import re

CIM_DATETIME = re.compile(r"(\d{14})\.(\d{6})([+-])(\d{3})")
UNITS = ("months", "days", "weeks", "years")


def from_cim(text):
    """Returns the time of a CIM datetime; None if all its digits are zeros, which means that no date is set.
    @throws ValueError if the string is not a date"""
    match = CIM_DATETIME.fullmatch(text)
    if not match:
        raise ValueError(f"{text} is not a CIM datetime")
    digits, microseconds, sign, minutes = match.groups()
    if not int(digits):
        return None
    offset = datetime.timedelta(minutes=int(sign + minutes))
    local = datetime.datetime.strptime(digits + microseconds, "%Y%m%d%H%M%S%f")
    return local.replace(tzinfo=datetime.timezone(offset))


def to_cim(text):
    """Converts a date or time in ISO 8601 form, or a CIM datetime, to a CIM datetime. The default offset is UTC.
    @throws ValueError if the string has neither form"""
    time = from_cim(text) if CIM_DATETIME.fullmatch(text) else datetime.datetime.fromisoformat(text)
    if time is None:
        return text
    minutes = round((time.utcoffset() or datetime.timedelta()).total_seconds() / 60)
    return time.strftime("%Y%m%d%H%M%S.%f").zfill(21) + f"{minutes:+04d}"


def plus_months(start, count):
    """Returns the same day in a later month, or the last day of that month if it has no such day.
    @throws OverflowError after the year 9999"""
    year, month = divmod(start.year * 12 + start.month - 1 + count, 12)
    if year > datetime.MAXYEAR:
        raise OverflowError
    return start.replace(year=year, month=month + 1, day=min(start.day, calendar.monthrange(year, month + 1)[1]))


def end_of(start, count, unit="months"):
    """Returns the end of a term. None without a start or a length, or if the end is after the year 9999."""
    if start is None or not count:
        return None
    try:
        if unit in ("months", "years"):
            return plus_months(start, count * (12 if unit == "years" else 1))
        return start + datetime.timedelta(**{unit: count})
    except OverflowError:
        return None


def period(kind, record, unit):
    """Returns the start and the end of a record; None for each that the record does not determine."""
    text = record.get(kind.start)
    start = datetime.datetime.fromisoformat(text) if text else None
    return start, end_of(start, record.get(kind.term), unit)
