#include <string_view>

#include "alignment.h"
#include "angles.h"
#include "csv_reader.h"

namespace {

constexpr double LARGEST_COORDINATE = 1e8;
constexpr double LONGEST_ELEMENT = 10000.0;

class AlignmentReader {
public:
    explicit AlignmentReader(const std::string& path) : m_csv(path) {}

    Alignment read() {
        if (!m_csv.next()) {
            m_csv.fail_at({m_csv.place(0).line, 1}, "expected start, but the file ends here");
        }
        if (m_csv.text(0, "start") != "start") {
            m_csv.fail(0, "start on the first line");
        }
        read_start();
        while (m_csv.next()) {
            if (m_alignment.end) {
                m_csv.fail(0, "nothing after the end");
            }
            const std::string_view kind = m_csv.text(0, KINDS);
            if (kind == "end") {
                read_end();
            } else {
                read_element(kind);
            }
        }
        if (m_alignment.elements.empty()) {
            m_csv.fail_at({m_csv.place(0).line, 1}, "expected an element, but the file ends here");
        }
        require_arc_ahead(m_alignment.elements.back(), nullptr);
        return std::move(m_alignment);
    }

private:
    double coordinate(std::size_t index, const char* expected) const {
        return m_csv.number(index, expected, -LARGEST_COORDINATE, LARGEST_COORDINATE);
    }

    double bearing(std::size_t index) const {
        const char* const expected = "a bearing from 0 to below 360 degrees, as 12.5 or 12-30-00";
        const std::optional<double> angle = parse_angle(m_csv.text(index, expected));
        if (!angle) {
            m_csv.fail(index, expected);
        }
        return *angle;
    }

    void read_start() {
        m_alignment.chainage = m_csv.number(1, "a chainage in metres", -1e7, 1e7);
        m_alignment.start.at.north = coordinate(2, "a north coordinate in metres");
        m_alignment.start.at.east = coordinate(3, "an east coordinate in metres");
        m_alignment.start.at.elevation = m_csv.number(4, "an elevation in metres", -1e5, 1e5);
        m_alignment.start.bearing = bearing(5);
        m_alignment.grade = m_csv.number(6, "a grade as rise over run, -1 to 1", -1.0, 1.0);
        m_csv.expect_end(7);
    }

    void read_end() {
        DesignEnd end = {};
        end.north = coordinate(1, "a north coordinate in metres");
        end.east = coordinate(2, "an east coordinate in metres");
        end.bearing = bearing(3);
        m_csv.expect_end(4);
        m_alignment.end = end;
    }

    void read_element(std::string_view kind) {
        Element element = {ElementKind::STRAIGHT, 0.0, GEO_INFINITY, 1.0};
        if (kind == "spiral_in") {
            element.kind = ElementKind::SPIRAL_IN;
        } else if (kind == "arc") {
            element.kind = ElementKind::ARC;
        } else if (kind == "spiral_out") {
            element.kind = ElementKind::SPIRAL_OUT;
        } else if (kind != "straight") {
            m_csv.fail(0, KINDS);
        }
        element.length = m_csv.number(1, "a length from 0.01 to 10000 metres", 0.01, LONGEST_ELEMENT);
        if (element.kind == ElementKind::STRAIGHT) {
            m_csv.expect_end(2);
        } else {
            read_bend(element);
        }
        if (!m_alignment.elements.empty()) {
            require_arc_ahead(m_alignment.elements.back(), &element);
        }
        if (element.kind == ElementKind::SPIRAL_OUT &&
            (m_alignment.elements.empty() || m_alignment.elements.back().kind != ElementKind::ARC ||
             !same_bend(m_alignment.elements.back(), element))) {
            m_csv.fail(0, "an arc of this radius and hand ahead of the spiral");
        }
        m_alignment.elements.push_back(element);
    }

    void read_bend(Element& element) const {
        element.radius = m_csv.number(2, "a radius from 1 to 1000000 metres", 1.0, 1e6);
        // Beyond a right angle a spiral is no transition, and beyond a turn an arc meets itself.
        const bool spiral = element.kind != ElementKind::ARC;
        if (element.length > (spiral ? PI : 2.0 * PI) * element.radius) {
            m_csv.fail(1, spiral ? "a spiral that turns by 90 degrees at most"
                                 : "an arc that turns by 360 degrees at most");
        }
        const char* const hands = "left or right";
        const std::string_view hand = m_csv.text(3, hands);
        if (hand != "left" && hand != "right") {
            m_csv.fail(3, hands);
        }
        element.hand = hand == "right" ? 1.0 : -1.0;
        m_csv.expect_end(4);
    }

    static bool same_bend(const Element& a, const Element& b) {
        return a.radius == b.radius && a.hand == b.hand;
    }

    void require_arc_ahead(const Element& element, const Element* next) const {
        if (element.kind == ElementKind::SPIRAL_IN &&
            (next == nullptr || next->kind != ElementKind::ARC || !same_bend(element, *next))) {
            m_csv.fail_at({m_csv.place(0).line, 1},
                          "expected an arc of the radius and hand of the spiral before");
        }
    }

    static constexpr const char* KINDS = "straight, spiral_in, arc, spiral_out or end";
    CsvReader m_csv;
    Alignment m_alignment = {};
};

}  // namespace

Alignment read_alignment(const std::string& path) {
    return AlignmentReader(path).read();
}
