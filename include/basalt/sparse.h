/// @file
/// Sparse two-dimensional array of fixed-size elements with rectangular selection.
#ifndef BASALT_SPARSE_H
#define BASALT_SPARSE_H

#include <cstddef>

#include "basalt/export.h"

namespace vex_util {

class BASALT_API Sparse2DArray {
public:
    Sparse2DArray(std::size_t elementSize, std::size_t blockSide, std::size_t elementsPerChunk);
    Sparse2DArray(const Sparse2DArray& source);
    Sparse2DArray& operator=(Sparse2DArray& source);
    ~Sparse2DArray();

    bool Insert(int x, int y, const void* element);
    void* Find(int x, int y);
    bool Remove(int x, int y);
    void RemoveAll();

    bool Select(const int* const min, const int* const max);
    void IterateSelected(bool (*visit)(int, int, const void*, const void*), const void* context);
    void IterateAll(bool (*visit)(int, int, const void*, const void*), const void* context);
    bool IsSelectionDirty() const;
    void SetSelectionDirty(bool dirty);

private:
    struct Storage;

    void* AllocElement();
    void FreeElement(void* slot);

    Storage* m_storage;
};

}  // namespace vex_util

#endif
