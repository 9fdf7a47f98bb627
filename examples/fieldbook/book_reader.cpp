#include "book_reader.h"

#include <algorithm>
#include <array>

#include "angles.h"
#include "number_parsing.h"

namespace {

constexpr double LARGEST_HEIGHT = 100.0;
constexpr double LONGEST_SIGHT = 1e5;
constexpr std::array<std::string_view, 3> SIGHTS = {"back", "fore", "side"};  // in the order of SightKind

class BookReader {
public:
    explicit BookReader(const std::string& path) : m_csv(path) {}

    Book read() {
        while (m_csv.next()) {
            const char* const expected = "point, station, back, fore or side";
            const std::string_view kind = m_csv.text(0, expected);
            const auto sight = std::find(SIGHTS.begin(), SIGHTS.end(), kind);
            if (kind == "point") {
                read_point();
            } else if (kind == "station") {
                read_station();
            } else {
                m_csv.require(sight != SIGHTS.end(), 0, expected);
                read_sight(static_cast<SightKind>(sight - SIGHTS.begin()));
            }
        }
        if (m_book.setups.empty()) {
            m_csv.fail_at({m_csv.line(), 1}, "expected a station, but the file ends here");
        }
        require_back_sight();
        return std::move(m_book);
    }

private:
    std::string name(std::size_t index, const char* expected) const {
        const std::string_view text = m_csv.text(index, expected);
        constexpr std::size_t LONGEST_NAME = 16;
        m_csv.require(text.size() <= LONGEST_NAME &&
                          std::all_of(text.begin(), text.end(), [](char c) { return c >= ' ' && c <= '~'; }),
                      index, "a name of at most 16 plain characters");
        return std::string(text);
    }

    void read_point() {
        NamedPoint point = {name(1, "the name of a control point"), {}};
        m_csv.require(m_book.find_control(point.name) == nullptr, 1, "a control point not given before");
        m_csv.require(m_book.setups.empty(), 0, "control points ahead of the first station");
        point.at = read_coordinates(m_csv, 2);
        m_csv.expect_end(5);
        m_book.control.push_back(std::move(point));
    }

    void read_station() {
        Setup setup = {name(1, "the name of a station"),
                       m_csv.number(2, "an instrument height in metres", -LARGEST_HEIGHT, LARGEST_HEIGHT),
                       {}};
        m_csv.expect_end(3);
        if (m_book.setups.empty()) {
            m_csv.require(m_book.find_control(setup.name) != nullptr, 1, "a control point as first station");
        } else {
            require_back_sight();
            const Setup& previous = m_book.setups.back();
            const Sight* fore = previous.find(SightKind::FORE);
            m_csv.require(m_book.setups.size() == 1 || m_book.find_control(previous.name) == nullptr, 0,
                          "the traverse to end at control point " + quoted(previous.name));
            m_csv.require(fore != nullptr, 0, "a fore sight at " + quoted(previous.name) + " first");
            m_csv.require(setup.name == fore->name, 1,
                          "station " + quoted(fore->name) + ", the fore sight before");
        }
        m_setup_place = m_csv.place(0);
        m_book.setups.push_back(std::move(setup));
    }

    void require_back_sight() const {
        if (m_book.setups.back().find(SightKind::BACK) == nullptr) {
            m_csv.fail_at(m_setup_place,
                          "expected a back sight at station " + quoted(m_book.setups.back().name));
        }
    }

    /// Whether the traverse permits this sight at the current setup.
    void check_target(SightKind kind, const std::string& target) const {
        const Setup& setup = m_book.setups.back();
        m_csv.require(target != setup.name, 1, "a target other than the station itself");
        if (kind == SightKind::SIDE) {
            return;
        }
        // The first and the last bearing come from control points; there is none between equal coordinates.
        const NamedPoint* from = m_book.find_control(setup.name);
        const NamedPoint* to = m_book.find_control(target);
        m_csv.require(from == nullptr || to == nullptr || from->at.north != to->at.north ||
                          from->at.east != to->at.east,
                      1, "a control point at another place than " + quoted(setup.name));
        if (kind == SightKind::BACK) {
            const std::size_t count = m_book.setups.size();
            m_csv.require(count > 1 || to != nullptr, 1, "a control point as first back sight");
            const std::string& before = m_book.setups[std::max<std::size_t>(count, 2) - 2].name;
            m_csv.require(count == 1 || target == before, 1, "a back sight to " + quoted(before));
        }
        if (const Sight* other = setup.find(kind)) {
            m_csv.require(other->name == target, 1,
                          "no second " + std::string(SIGHTS[static_cast<std::size_t>(kind)]) +
                              " sight beside " + quoted(other->name));
        }
    }

    /// The face of the current line, which its zenith angle has to agree with.
    bool is_second_face(double zenith) const {
        const std::string_view face = m_csv.text(6, "face 1 or 2");
        m_csv.require(face == "1" || face == "2", 6, "face 1 or 2");
        const bool second = face == "2";
        const double low = second ? 181.0 : 1.0;
        m_csv.require(zenith >= _degtorad(low) && zenith <= _degtorad(low + 178.0), 4,
                      second ? "a zenith angle from 181 to 359 degrees on face 2"
                             : "a zenith angle from 1 to 179 degrees on face 1");
        return second;
    }

    void read_sight(SightKind kind) {
        m_csv.require(!m_book.setups.empty(), 0, "a station ahead of the first sight");
        const std::string target = name(1, "the name of a target");
        const double height = m_csv.number(2, "a target height in metres", -LARGEST_HEIGHT, LARGEST_HEIGHT);
        geo_hvd obs = {};
        obs.horizontal = read_angle(m_csv, 3, "an angle");
        obs.vertical = read_angle(m_csv, 4, "an angle");
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
        m_csv.require(sight->kind == kind, 0, "the same kind of sight as before to " + quoted(target));
        m_csv.require(sight->height == height, 2, "the same target height as on the other face");
        std::optional<geo_hvd>& slot = second_face ? sight->face2 : sight->face1;
        m_csv.require(!slot, 6, "one reading a face to " + quoted(target));
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
