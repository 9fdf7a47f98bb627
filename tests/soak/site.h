// A machine at work on a site: what a host does with the library all day.
#ifndef BASALT_TESTS_SOAK_SITE_H
#define BASALT_TESTS_SOAK_SITE_H

#include <filesystem>
#include <stdexcept>
#include <string>

#include "basalt/basalt.h"

namespace basalt::soak {

// A strip of cells is driven to and fro. Each step writes the cells under the blade, moves the view, selects
// and visits it, and takes away what lies far behind. A site holds the same cells whenever it is begun anew,
// so that whatever grows is not its own doing.
class Site {
public:
    explicit Site(const std::string& folder) : m_folder(folder), m_log((folder + "/soak.log").c_str()) {}

    bool is_done() const { return m_step == PASSES * LENGTH; }

    // What happens between two positions of the machine.
    void step() {
        const int pass = m_step / LENGTH;
        const int along = m_step % LENGTH;
        const int x = pass % 2 == 0 ? along : LENGTH - 1 - along;
        for (int y = pass * BLADE; y < (pass + 1) * BLADE; ++y) {
            const Record record = {{x * 0.5, y * 0.5, 100.0 + geo_spiral_deflection(x, 5e4)}, m_step, 1};
            m_cells.Insert(x, y, &record);
        }
        visit(x, pass * BLADE);
        if (pass >= KEPT_PASSES) {
            for (int y = (pass - KEPT_PASSES) * BLADE; y < (pass - KEPT_PASSES + 1) * BLADE; ++y) {
                require(m_cells.Remove(x, y), "a cell of an earlier pass is there");
            }
        }
        ++m_step;
    }

    // What happens ten times a second, whatever the machine does.
    void tick() {
        CString line;
        line.Format(L"step %i: %i cells in view\n", m_step, m_in_view);
        m_log.Write(line);
        vex_util::CMemoryMap map(64 * 1024);
        require(static_cast<void*>(map) != nullptr, "a mapped block");
        static_cast<char*>(static_cast<void*>(map))[m_step % (64 * 1024)] = 1;
        void* const block = m_blocks.Alloc(4096);
        require(block != nullptr, "a block on a file");
        m_blocks.Free(block);
        vex_lib::vlWinHeapAllocator heap(0);
        require(heap.ReAlloc(heap.Alloc(100), 100'000) != nullptr, "a block of a private heap");
        require(vex_util::CFilePath::FileExists(CString((m_folder + "/soak.log").c_str())), "the log");
    }

    // The picture of a site that is done; then the next one begins, and its log.
    void finish() {
        CBitmap picture;
        picture.CreateBitmap(64, 64, 1, 32, nullptr);
        CDC dc;
        dc.CreateCompatibleDC(nullptr);
        require(vex_util::mfc::RotateBitmap(&dc, &picture, 30.0F), "a picture turned");
        const std::string name = m_folder + "/site.bmp";
        vex_util::mfc::DumpBitmap(picture, CString(name.c_str()));
        require(std::filesystem::remove(name), "a picture written");
        m_cells.RemoveAll();
        m_log.Open((m_folder + "/soak.log").c_str());
        m_step = 0;
    }

private:
    struct Record {
        geo_nee point;
        int step;
        int count;
    };
    static constexpr int LENGTH = 250;     // cells of a pass
    static constexpr int PASSES = 16;      // of a site
    static constexpr int BLADE = 12;       // cells across
    static constexpr int KEPT_PASSES = 8;  // behind these a cell is taken away
    static constexpr int VIEW = 100;       // cells to each side

    static void require(bool holds, const char* what) {
        if (!holds) {
            throw std::runtime_error(std::string("not so: ") + what);
        }
    }

    static bool count(int x, int y, const void* element, const void* context) {
        const auto* const record = static_cast<const Record*>(element);
        require(record->point.north == x * 0.5 && record->point.east == y * 0.5, "a cell holds its record");
        ++*static_cast<int*>(const_cast<void*>(context));
        return true;
    }

    void visit(int x, int y) {
        const int min[2] = {x - VIEW, y - VIEW};
        const int max[2] = {x + VIEW, y + VIEW};
        require(m_cells.Select(min, max), "the machine is in its own view");
        m_in_view = 0;
        m_cells.IterateSelected(count, &m_in_view);
        require(m_in_view >= BLADE, "the cells just written are in view");
    }

    std::string m_folder;
    vex_util::Sparse2DArray m_cells{sizeof(Record), 16, 64};
    vex_lib::vlVmAllocator m_blocks{64 * 1024, 4096};
    vex_util::FileLogger m_log;
    int m_step = 0;
    int m_in_view = 0;
};

}  // namespace basalt::soak

#endif
