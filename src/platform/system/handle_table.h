// The objects behind handles.
//
// Threads: thread-safe. A closed object lives on while another thread still uses it.
#ifndef BASALT_SRC_PLATFORM_SYSTEM_HANDLE_TABLE_H
#define BASALT_SRC_PLATFORM_SYSTEM_HANDLE_TABLE_H

#include <cstdint>
#include <memory>

#include "basalt/platform/types.h"
#include "src/platform/system/registry.h"

namespace basalt::platform {

// What a handle refers to; each derived class names its kind in a member KIND.
class HandleObject {
public:
    enum class Kind : std::uint8_t { FILE, MAPPING, SEARCH };

    explicit HandleObject(Kind kind) noexcept : m_kind(kind) {}
    virtual ~HandleObject() = default;
    HandleObject(const HandleObject&) = delete;
    HandleObject& operator=(const HandleObject&) = delete;

    Kind kind() const noexcept { return m_kind; }

    // Called when the handle is closed; other threads may still use the object.
    virtual void close() noexcept {}

private:
    const Kind m_kind;
};

using HandleRegistry = Registry<std::uint32_t, std::shared_ptr<HandleObject>>;

// A handle in two steps: the constructor may throw; give(), called after everything else that can fail,
// cannot.
class NewHandle {
public:
    explicit NewHandle(std::shared_ptr<HandleObject> object);
    HANDLE give() noexcept;

private:
    HandleRegistry::Entry m_entry;
};

// The object of a handle, null when there is none. The last error stays as it is.
std::shared_ptr<HandleObject> find_object(HANDLE handle) noexcept;

// The same, of one kind only.
template <class T>
std::shared_ptr<T> find_object_of(HANDLE handle) noexcept {
    const std::shared_ptr<HandleObject> object = find_object(handle);
    return object != nullptr && object->kind() == T::KIND ? std::static_pointer_cast<T>(object) : nullptr;
}

// Makes a handle invalid.
void drop_handle(HANDLE handle) noexcept;

// Calls `visit` for every object; it may not use the table.
void for_each_object(void (*visit)(HandleObject&)) noexcept;

}  // namespace basalt::platform

#endif
