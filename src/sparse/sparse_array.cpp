#include <new>

#include "src/sparse/sparse_array_storage.h"

namespace vex_util {

Sparse2DArray::Sparse2DArray(std::size_t elementSize, std::size_t blockSide, std::size_t elementsPerChunk)
    : m_storage(new Storage(elementSize, blockSide, elementsPerChunk)) {}

Sparse2DArray::Sparse2DArray(const Sparse2DArray& source) : m_storage(new Storage(*source.m_storage)) {}

Sparse2DArray& Sparse2DArray::operator=(Sparse2DArray& source) {
    if (this == &source) {
        return *this;
    }
    const AutoCriticalSectionPair locked(m_storage->lock, source.m_storage->lock);
    const auto assign = [&] {
        const SparseContents& from = source.m_storage->contents;
        SparseContents copy(from.ElementSize(), from.Grid().Side(), from.ElementsPerChunk());
        copy.CopyNonEmptyBlocks(from);
        m_storage->contents.Swap(copy);
    };
    try {
        assign();
    } catch (const std::bad_alloc&) {
        // There may be memory for one copy, if not for both.
        RemoveAll();
        assign();
    }
    m_storage->RenewContents(!m_storage->contents.Blocks().empty());
    return *this;
}

Sparse2DArray::~Sparse2DArray() {
    RemoveAll();
    delete m_storage;
}

bool Sparse2DArray::Insert(int x, int y, const void* element) {
    const AutoCriticalSection locked(m_storage->lock);
    if (m_storage->contents.Insert(x, y, element)) {
        m_storage->selectionDirty.store(true, std::memory_order_relaxed);
    }
    return true;
}

void* Sparse2DArray::Find(int x, int y) {
    const AutoCriticalSection locked(m_storage->lock);
    return m_storage->contents.Find(x, y);
}

bool Sparse2DArray::Remove(int x, int y) {
    const AutoCriticalSection locked(m_storage->lock);
    return m_storage->contents.Remove(x, y);
}

void Sparse2DArray::RemoveAll() {
    const AutoCriticalSection locked(m_storage->lock);
    m_storage->contents.Clear();
    m_storage->RenewContents(false);
}

}  // namespace vex_util
