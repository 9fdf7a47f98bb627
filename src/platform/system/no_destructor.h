// Static objects that are constructed at their first use and never destroyed.
#ifndef BASALT_SRC_PLATFORM_SYSTEM_NO_DESTRUCTOR_H
#define BASALT_SRC_PLATFORM_SYSTEM_NO_DESTRUCTOR_H

#include <cstddef>
#include <new>

namespace basalt::platform {

// For static tables: a host's own static objects may use them in their destructors. The object must own
// nothing while it is empty, so that nothing leaks.
template <class T>
class NoDestructor {
public:
    NoDestructor() noexcept { new (static_cast<void*>(m_storage)) T; }
    T& operator*() noexcept { return *std::launder(reinterpret_cast<T*>(m_storage)); }
    T* operator->() noexcept { return &**this; }

private:
    alignas(T) std::byte m_storage[sizeof(T)];
};

}  // namespace basalt::platform

#endif
