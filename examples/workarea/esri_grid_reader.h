// ESRI ASCII grids, streamed.
#ifndef WORKAREA_ESRI_GRID_READER_H
#define WORKAREA_ESRI_GRID_READER_H

#include <array>
#include <cstddef>
#include <cstdio>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "terrain_source.h"

/// Reads an ESRI ASCII grid in geographic degrees row by row.
///
/// Header: ncols, nrows, cellsize, one of xllcorner and xllcenter, one of yllcorner and yllcenter, and
/// optionally NODATA_value (-9999 when absent, `nan` accepted), in any order and any case. Then one line for
/// each row, northernmost first. LF and CRLF files read alike, and a UTF-8 byte order mark is passed over.
/// Every departure is an InputError that names file, line and column.
class EsriGridReader : public TerrainSource {
public:
    /// Opens the file and reads its header.
    explicit EsriGridReader(std::string path);

    const GridFrame& frame() const override { return m_frame; }
    /// After the last row this also checks that nothing follows it.
    bool next_row(std::vector<double>& elevations) override;

private:
    enum class Token { WORD, LINE_END, FILE_END };
    struct CloseFile {
        void operator()(std::FILE* file) const { std::fclose(file); }
    };

    using Header = std::array<std::optional<double>, 8>;  ///< values by key

    int get();
    void advance();
    void read_header();
    void place_grid(const Header& header);
    double header_value(std::size_t key) const;
    double elevation() const;
    void require(bool is_so, const std::string& message) const;
    void require_in_line(bool is_so, const std::string& message) const;

    std::string m_path;
    std::unique_ptr<std::FILE, CloseFile> m_file;
    Token m_token = Token::FILE_END;  // one ahead, as the next three
    std::string m_word;               // empty unless it is a word
    std::size_t m_line = 1;
    std::size_t m_column = 0;  // in bytes, from 1
    std::size_t m_read = 0;    // bytes of the line
    GridFrame m_frame;
    double m_no_data = -9999.0;
    int m_rows_read = 0;
};

#endif
