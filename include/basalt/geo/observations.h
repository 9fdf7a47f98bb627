/// @file
/// Observations, their reduction to grid points, and following a bearing. Common rules (units, bad
/// input, threads): basalt/geo.h.
#ifndef BASALT_GEO_OBSERVATIONS_H
#define BASALT_GEO_OBSERVATIONS_H

#include "basalt/export.h"
#include "basalt/geo/records.h"

/// @name Observations
/// The scale factor multiplies the horizontal distance in both directions: from the ground to the grid in
/// geo_reduce_obs(), and from the grid to the observation in geo_calc_obs(). To undo a reduction, pass its
/// reciprocal to geo_calc_obs().
/// @{

/// Converts an observation of the second face to the first: a zenith angle v beyond pi becomes 2 pi - v, and
/// the horizontal angle turns by pi.
/// @param obs changed in place; radians and metres. A zenith angle up to and including pi leaves it as it is.
/// @return the same record
///
/// Bad input: with a zenith angle of #GEO_NULL nothing changes, and a horizontal angle of #GEO_NULL stays. A
/// NaN zenith angle still turns the horizontal angle. One beyond 2 pi becomes negative.
BASALT_API geo_hvd& geo_normalise_obs(geo_hvd& obs);

/// Grid point that an observation measures.
/// @param obs bearing and zenith angle in radians, slope distance in metres
/// @param station point of the instrument; may be `out`
/// @param heightOffset metres, added to the elevation: height of instrument less height of target
/// @param[out] out the point; all #GEO_NULL when a field of `obs` is
/// @param scaleFactor grid distance over horizontal distance, 1 for none
///
/// Bad input: the station is not tested for #GEO_NULL.
BASALT_API void geo_reduce_obs(const geo_hvd& obs, const geo_nee& station, double heightOffset, geo_nee& out,
                               double scaleFactor);

/// Observation that would be taken from one grid point to another.
/// @param from the station
/// @param fromHeight height of the instrument above it, metres
/// @param to the point observed
/// @param toHeight height of the target above it, metres
/// @param[out] out bearing in [0, 2 pi), zenith angle in [0, pi], slope distance in metres
/// @param scaleFactor multiplies the grid distance. Negative, it mirrors the zenith angle into [pi, 2 pi).
///
/// Points above one another give bearing 0, and coincident ones a level observation of length 0.
///
/// Bad input: `out` is left as it was when a field of either point, or `fromHeight`, is #GEO_NULL;
/// `toHeight` is not tested.
BASALT_API void geo_calc_obs(const geo_nee& from, double fromHeight, const geo_nee& to, double toHeight,
                             geo_hvd& out, double scaleFactor);

/// @}
/// @name Following a bearing
/// From a grid point over a horizontal distance; `out` may be `start`. A negative distance goes backwards.
/// @{

/// Point reached along a bearing on a slope given as an angle.
/// @param start where to begin
/// @param bearing radians, any size
/// @param distance horizontal, metres
/// @param slopeAngle radians from the horizontal, positive uphill. Exactly pi/2 and -pi/2 (the nearest
/// doubles) leave the elevation as it is; angles close to them give heights that are huge, not refused.
/// @param[out] out the point reached
BASALT_API void geo_grid_follow(const geo_nee& start, double bearing, double distance, double slopeAngle,
                                geo_nee& out);

/// Point reached along a bearing on a slope given as a ratio.
/// @param start where to begin
/// @param bearing radians, any size
/// @param distance horizontal, metres
/// @param grade rise over run, positive uphill; 0 leaves the elevation as it is, even over an infinite
/// distance
/// @param[out] out the point reached
BASALT_API void geo_grid_follow2(const geo_nee& start, double bearing, double distance, double grade,
                                 geo_nee& out);

/// Point reached along a bearing with a given change in height.
/// @param start where to begin
/// @param bearing radians, any size
/// @param distance horizontal, metres
/// @param heightChange metres, positive upwards
/// @param[out] out the point reached
BASALT_API void geo_grid_follow3(const geo_nee& start, double bearing, double distance, double heightChange,
                                 geo_nee& out);

/// @}

#endif
