"""basalt over NumPy arrays: survey geometry, geodesy, time scales and units as universal functions, a sparse grid of
records, paths and hexadecimal text. Results are those of the C++ library to the bit.
"""
from . import files, geo, hexadecimal, time_scales, units
from ._basalt import VERSION as __version__
from .sparse import Sparse2DArray

__all__ = ["Sparse2DArray", "files", "geo", "hexadecimal", "time_scales", "units", "__version__"]
