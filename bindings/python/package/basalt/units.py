"""Angles in degrees, minutes and seconds; lengths in US survey feet, inches and fractions: universal functions."""
from ._basalt import (degrees_to_radians, dms_to_radians, factorial, feet_inches_to_metres, metres_to_feet_inches,
                      radians_to_dms)

__all__ = ["degrees_to_radians", "dms_to_radians", "factorial", "feet_inches_to_metres", "metres_to_feet_inches",
           "radians_to_dms"]
