// ESRI ASCII grids, streamed.
#ifndef WORKAREA_ESRI_GRID_READER_H
#define WORKAREA_ESRI_GRID_READER_H

#include <string>
#include <vector>

#include "terrain_source.h"
#include "text_scanner.h"

/// Reads an ESRI ASCII grid in geographic degrees row by row.
///
/// Header: ncols, nrows, cellsize, one of xllcorner and xllcenter, one of yllcorner and yllcenter, and
/// optionally NODATA_value (-9999 when absent, `nan` accepted), in any order and any case. Then one line for
/// each row, northernmost first. Every departure is an InputError that names file, line and column.
class EsriGridReader : public TerrainSource {
public:
    /// Opens the file and reads its header.
    explicit EsriGridReader(const std::string& path);

    const GridFrame& frame() const override { return m_frame; }
    /// After the last row this also checks that nothing follows it.
    bool next_row(std::vector<double>& elevations) override;

private:
    void read_header();
    double parse_elevation() const;

    TextScanner m_scanner;
    TextScanner::Token m_token = TextScanner::Token::FILE_END;  // one token ahead
    GridFrame m_frame;
    double m_no_data = -9999.0;
    int m_rows_read = 0;
};

#endif
