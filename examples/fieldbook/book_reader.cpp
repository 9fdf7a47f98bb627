#include "book_reader.h"

#include <algorithm>

#include "angles.h"
#include "number_parsing.h"

namespace {

constexpr double LARGEST_COORDINATE = 1e8;
constexpr double LARGEST_ELEVATION = 1e5;
constexpr double LARGEST_HEIGHT = 100.0;
constexpr double LONGEST_SIGHT = 1e5;

std::string in_quotes(const std::string& name) {
    return "'" + name + "'";
}

class BookReader {
public:
    explicit BookReader(const std::string& path) : m_csv(path) {}

    Book read() {
        while (m_csv.next()) {
            const char* const expected = "point, station, back, fore or side";
            const std::string_view kind = m_csv.text(0, expected);
            if (kind == "point") {
                read_point();
            } else if (kind == "station") {
                read_station();
            } else if (kind == "back") {
                read_sight(SightKind::BACK);
            } else if (kind == "fore") {
                read_sight(SightKind::FORE);
            } else if (kind == "side") {
                read_sight(SightKind::SIDE);
            } else {
                m_csv.fail(0, expected);
            }
        }
        if (m_book.setups.empty()) {
            m_csv.fail_at({m_csv.place(0).line, 1}, "expected a station, but the file ends here");
        }
        require_back_sight();
        return std::move(m_book);
    }

private:
    std::string name(std::size_t index, const char* expected) const {
        const std::string_view text = m_csv.text(index, expected);
        constexpr std::size_t LONGEST_NAME = 16;
        if (text.size() > LONGEST_NAME ||
            std::any_of(text.begin(), text.end(), [](char c) { return c < ' ' || c > '~'; })) {
            m_csv.fail(index, "a name of at most 16 plain characters");
        }
        return std::string(text);
    }

    void read_point() {
        NamedPoint point = {name(1, "the name of a control point"), {}};
        if (m_book.find_control(point.name) != nullptr) {
            m_csv.fail(1, "a control point not given before");
        }
        if (!m_book.setups.empty()) {
            m_csv.fail(0, "control points ahead of the first station");
        }
        point.at.north =
            m_csv.number(2, "a north coordinate in metres", -LARGEST_COORDINATE, LARGEST_COORDINATE);
        point.at.east =
            m_csv.number(3, "an east coordinate in metres", -LARGEST_COORDINATE, LARGEST_COORDINATE);
        point.at.elevation = m_csv.number(4, "an elevation in metres", -LARGEST_ELEVATION, LARGEST_ELEVATION);
        m_csv.expect_end(5);
        m_book.control.push_back(std::move(point));
    }

    void read_station() {
        Setup setup = {name(1, "the name of a station"),
                       m_csv.number(2, "an instrument height in metres", -LARGEST_HEIGHT, LARGEST_HEIGHT),
                       {}};
        m_csv.expect_end(3);
        if (m_book.setups.empty()) {
            if (m_book.find_control(setup.name) == nullptr) {
                m_csv.fail(1, "a control point as first station");
            }
        } else {
            require_back_sight();
            const Setup& previous = m_book.setups.back();
            const Sight* fore = previous.find(SightKind::FORE);
            if (m_book.setups.size() > 1 && m_book.find_control(previous.name) != nullptr) {
                m_csv.fail(0, "the traverse to end at control point " + in_quotes(previous.name));
            }
            if (fore == nullptr) {
                m_csv.fail(0, "a fore sight at " + in_quotes(previous.name) + " first");
            }
            if (setup.name != fore->name) {
                m_csv.fail(1, "station " + in_quotes(fore->name) + ", the fore sight before");
            }
        }
        m_setup_place = m_csv.place(0);
        m_book.setups.push_back(std::move(setup));
    }

    void require_back_sight() const {
        if (m_book.setups.back().find(SightKind::BACK) == nullptr) {
            m_csv.fail_at(m_setup_place,
                          "expected a back sight at station " + in_quotes(m_book.setups.back().name));
        }
    }

    /// The traverse takes its first and its last bearing from control points, and there is none between equal
    /// coordinates.
    void require_bearing(const std::string& station, const std::string& target) const {
        const NamedPoint* from = m_book.find_control(station);
        const NamedPoint* to = m_book.find_control(target);
        if (from != nullptr && to != nullptr && from->at.north == to->at.north &&
            from->at.east == to->at.east) {
            m_csv.fail(1, "a control point at another place than " + in_quotes(station));
        }
    }

    /// Whether the traverse permits this sight at the current setup.
    void check_target(SightKind kind, const std::string& target) const {
        const Setup& setup = m_book.setups.back();
        if (target == setup.name) {
            m_csv.fail(1, "a target other than the station itself");
        }
        if (kind != SightKind::SIDE) {
            require_bearing(setup.name, target);
        }
        if (kind == SightKind::BACK) {
            const std::size_t count = m_book.setups.size();
            if (count == 1 && m_book.find_control(target) == nullptr) {
                m_csv.fail(1, "a control point as first back sight");
            }
            if (count > 1 && target != m_book.setups[count - 2].name) {
                m_csv.fail(1, "a back sight to " + in_quotes(m_book.setups[count - 2].name));
            }
        }
        const Sight* other = setup.find(kind);
        if (kind != SightKind::SIDE && other != nullptr && other->name != target) {
            m_csv.fail(1, "no second " + std::string(kind == SightKind::BACK ? "back" : "fore") +
                              " sight beside " + in_quotes(other->name));
        }
    }

    double angle_at(std::size_t index) const {
        const char* const expected = "an angle from 0 to below 360 degrees, as 12.5 or 12-30-00";
        const std::optional<double> angle = parse_angle(m_csv.text(index, expected));
        if (!angle) {
            m_csv.fail(index, expected);
        }
        return *angle;
    }

    /// The face of the current line, which its zenith angle has to agree with.
    bool is_second_face(double zenith) const {
        const char* const faces = "face 1 or 2";
        const std::string_view face = m_csv.text(6, faces);
        if (face != "1" && face != "2") {
            m_csv.fail(6, faces);
        }
        const bool second = face == "2";
        const double low = second ? 181.0 : 1.0;
        if (zenith < _degtorad(low) || zenith > _degtorad(low + 178.0)) {
            m_csv.fail(4, second ? "a zenith angle from 181 to 359 degrees on face 2"
                                 : "a zenith angle from 1 to 179 degrees on face 1");
        }
        return second;
    }

    void read_sight(SightKind kind) {
        if (m_book.setups.empty()) {
            m_csv.fail(0, "a station ahead of the first sight");
        }
        const std::string target = name(1, "the name of a target");
        const double height = m_csv.number(2, "a target height in metres", -LARGEST_HEIGHT, LARGEST_HEIGHT);
        geo_hvd obs = {};
        obs.horizontal = angle_at(3);
        obs.vertical = angle_at(4);
        obs.distance = m_csv.number(5, "a slope distance from 0.01 to 100000 metres", 0.01, LONGEST_SIGHT);
        const bool second_face = is_second_face(obs.vertical);
        m_csv.expect_end(7);
        check_target(kind, target);

        std::vector<Sight>& sights = m_book.setups.back().sights;
        auto sight =
            std::find_if(sights.begin(), sights.end(), [&](const Sight& s) { return s.name == target; });
        if (sight == sights.end()) {
            sight = sights.insert(sights.end(), {kind, target, height, std::nullopt, std::nullopt});
        }
        if (sight->kind != kind) {
            m_csv.fail(0, "the same kind of sight as before to " + in_quotes(target));
        }
        if (sight->height != height) {
            m_csv.fail(2, "the same target height as on the other face");
        }
        std::optional<geo_hvd>& slot = second_face ? sight->face2 : sight->face1;
        if (slot) {
            m_csv.fail(6, "one reading a face to " + in_quotes(target));
        }
        slot = obs;
    }

    CsvReader m_csv;
    Book m_book;
    FilePlace m_setup_place = {};
};

}  // namespace

const Sight* Setup::find(SightKind kind) const {
    const auto at =
        std::find_if(sights.begin(), sights.end(), [&](const Sight& s) { return s.kind == kind; });
    return at == sights.end() ? nullptr : &*at;
}

const NamedPoint* Book::find_control(std::string_view name) const {
    const auto at =
        std::find_if(control.begin(), control.end(), [&](const NamedPoint& p) { return p.name == name; });
    return at == control.end() ? nullptr : &*at;
}

Book read_book(const std::string& path) {
    return BookReader(path).read();
}
