"""Angles in degrees, minutes and seconds, also as text; lengths in US survey feet, inches and fractions."""
from ._basalt import (degrees_to_radians, dms_to_radians, factorial, feet_inches_to_metres, format_angle,
                      metres_to_feet_inches, parse_angle, radians_to_dms)

__all__ = ["degrees_to_radians", "dms_to_radians", "factorial", "feet_inches_to_metres", "format_angle",
           "metres_to_feet_inches", "parse_angle", "radians_to_dms"]
