"""Calendar dates, Modified Julian Date, GPS time, milliseconds since 1970: NumPy universal functions.

Whole numbers out of the library's range raise ValueError. No leap seconds are added or taken away.
"""
from ._basalt import (calendar_to_java_time, current_java_time, date_to_mjd, gps_to_mjd, java_time_to_calendar,
                      mjd_to_date, mjd_to_gps)

__all__ = ["calendar_to_java_time", "current_java_time", "date_to_mjd", "gps_to_mjd", "java_time_to_calendar",
           "mjd_to_date", "mjd_to_gps"]
