"""CIM datetimes, and the end of a term that begins at one."""

import calendar
import datetime
import re

CIM_DATETIME = re.compile(r"(\d{14})\.(\d{6})([+-])(\d{3})")
UNITS = ("months", "days", "weeks", "years")


def from_cim(text):
    """The time of a CIM datetime; None for one of zeros, which means that there is no date.
    @throws ValueError for a string that is no date"""
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
    """Converts a date or time in ISO 8601 form to a CIM datetime, in UTC if it has no offset. Accepts CIM datetimes, too.
    @throws ValueError for a string that is neither"""
    time = from_cim(text) if CIM_DATETIME.fullmatch(text) else datetime.datetime.fromisoformat(text)
    if time is None:
        return text
    minutes = round((time.utcoffset() or datetime.timedelta()).total_seconds() / 60)
    return time.strftime("%Y%m%d%H%M%S.%f").zfill(21) + f"{minutes:+04d}"


def plus_months(start, count):
    """The same day of the month, or its last day if it has no such day."""
    year, month = divmod(start.year * 12 + start.month - 1 + count, 12)
    if year > datetime.MAXYEAR:
        raise OverflowError
    return start.replace(year=year, month=month + 1, day=min(start.day, calendar.monthrange(year, month + 1)[1]))


def end_of(start, count, unit="months"):
    """The end of a term. None without a start or a length, or if no calendar has a date for it."""
    if start is None or not count:
        return None
    try:
        if unit in ("months", "years"):
            return plus_months(start, count * (12 if unit == "years" else 1))
        return start + datetime.timedelta(**{unit: count})
    except OverflowError:
        return None


def period(kind, record, unit):
    """Start and end of a record; each is None if it is not given."""
    text = record.get(kind.start)
    start = datetime.datetime.fromisoformat(text) if text else None
    return start, end_of(start, record.get(kind.term), unit)
