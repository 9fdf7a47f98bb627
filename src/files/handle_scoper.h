// Owners of the platform's handles.
#ifndef BASALT_SRC_FILES_HANDLE_SCOPER_H
#define BASALT_SRC_FILES_HANDLE_SCOPER_H

#include "src/platform/file_search.h"

// Owns a handle, null for none, and closes it with Closer.
template <class Closer>
class HANDLEScoperBase {
public:
    explicit HANDLEScoperBase(HANDLE handle) : m_handle(handle) {}
    virtual ~HANDLEScoperBase() {
        if (m_handle != nullptr) {
            Closer::Close(m_handle);
            m_handle = nullptr;
        }
    }
    HANDLEScoperBase(const HANDLEScoperBase&) = delete;
    HANDLEScoperBase& operator=(const HANDLEScoperBase&) = delete;

    bool is_open() const { return m_handle != nullptr; }
    HANDLE get() const { return m_handle; }

private:
    HANDLE m_handle;
};

struct FindFileHandleCloser {
    static void Close(HANDLE search) { FindClose(search); }
};

#endif
