#include <algorithm>
#include <array>
#include <string_view>

#include "alignment.h"
#include "angles.h"
#include "csv_reader.h"

namespace {

constexpr double LONGEST_ELEMENT = 10000.0;
constexpr std::array<std::string_view, 4> NAMES = {"straight", "spiral_in", "arc", "spiral_out"};
constexpr const char* KINDS = "straight, spiral_in, arc, spiral_out or end";

class AlignmentReader {
public:
    explicit AlignmentReader(const std::string& path) : m_csv(path) {}

    Alignment read() {
        if (!m_csv.next()) {
            m_csv.fail_at({m_csv.line(), 1}, "expected start, but the file ends here");
        }
        m_csv.require(m_csv.text(0, "start") == "start", 0, "start on the first line");
        read_start();
        while (m_csv.next()) {
            m_csv.require(!m_alignment.end, 0, "nothing after the end");
            const std::string_view kind = m_csv.text(0, KINDS);
            if (kind == "end") {
                m_alignment.end = {coordinate(1, "a north coordinate in metres"),
                                   coordinate(2, "an east coordinate in metres"),
                                   read_angle(m_csv, 3, "a bearing")};
                m_csv.expect_end(4);
            } else {
                read_element(kind);
            }
        }
        if (m_alignment.elements.empty()) {
            m_csv.fail_at({m_csv.line(), 1}, "expected an element, but the file ends here");
        }
        require_arc_behind(m_alignment.elements.back(), nullptr);
        return std::move(m_alignment);
    }

private:
    double coordinate(std::size_t index, const char* expected) const {
        return m_csv.number(index, expected, -LARGEST_COORDINATE, LARGEST_COORDINATE);
    }

    void read_start() {
        m_alignment.chainage = m_csv.number(1, "a chainage in metres", -1e7, 1e7);
        m_alignment.start.at = read_coordinates(m_csv, 2);
        m_alignment.start.bearing = read_angle(m_csv, 5, "a bearing");
        m_alignment.grade = m_csv.number(6, "a grade as rise over run, -1 to 1", -1.0, 1.0);
        m_csv.expect_end(7);
    }

    void read_element(std::string_view kind) {
        const auto name = std::find(NAMES.begin(), NAMES.end(), kind);
        m_csv.require(name != NAMES.end(), 0, KINDS);
        Element element = {static_cast<ElementKind>(name - NAMES.begin()), 0.0, GEO_INFINITY, 1.0};
        element.length = m_csv.number(1, "a length from 0.01 to 10000 metres", 0.01, LONGEST_ELEMENT);
        if (element.kind == ElementKind::STRAIGHT) {
            m_csv.expect_end(2);
        } else {
            read_bend(element);
        }
        const Element* before = m_alignment.elements.empty() ? nullptr : &m_alignment.elements.back();
        if (before != nullptr) {
            require_arc_behind(*before, &element);
        }
        m_csv.require(element.kind != ElementKind::SPIRAL_OUT || is_arc_of(before, element), 0,
                      "an arc of this radius and hand ahead of the spiral");
        m_alignment.elements.push_back(element);
    }

    void read_bend(Element& element) const {
        element.radius = m_csv.number(2, "a radius from 1 to 1000000 metres", 1.0, 1e6);
        // Beyond a right angle a spiral is no transition, and beyond a turn an arc meets itself.
        const bool spiral = element.kind != ElementKind::ARC;
        m_csv.require(element.length <= (spiral ? PI : 2.0 * PI) * element.radius, 1,
                      spiral ? "a spiral that turns by 90 degrees at most"
                             : "an arc that turns by 360 degrees at most");
        const std::string_view hand = m_csv.text(3, "left or right");
        m_csv.require(hand == "left" || hand == "right", 3, "left or right");
        element.hand = hand == "right" ? 1.0 : -1.0;
        m_csv.expect_end(4);
    }

    static bool is_arc_of(const Element* arc, const Element& spiral) {
        return arc != nullptr && arc->kind == ElementKind::ARC && arc->radius == spiral.radius &&
               arc->hand == spiral.hand;
    }

    void require_arc_behind(const Element& element, const Element* next) const {
        if (element.kind == ElementKind::SPIRAL_IN && !is_arc_of(next, element)) {
            m_csv.fail_at({m_csv.line(), 1}, "expected an arc of the radius and hand of the spiral before");
        }
    }

    CsvReader m_csv;
    Alignment m_alignment = {};
};

}  // namespace

Alignment read_alignment(const std::string& path) {
    return AlignmentReader(path).read();
}
