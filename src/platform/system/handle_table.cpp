#include "src/platform/system/handle_table.h"

#include <mutex>
#include <utility>

#include "src/platform/system/lock.h"
#include "src/platform/system/no_destructor.h"
#include "src/platform/system/out_of_memory.h"

namespace basalt::platform {
namespace {

constexpr std::uint32_t STEP = 4;  // published: the two low bits of a handle are the user's

struct HandleTable {
    Lock lock;
    HandleMap objects;
    std::uint32_t last_key = 0;
};

HandleTable& table() noexcept {
    static NoDestructor<HandleTable> s_table;
    return *s_table;
}

// The key a handle stands for; 0, which none has, where it cannot stand for any.
std::uint32_t key_of(HANDLE handle) noexcept {
    const auto value = reinterpret_cast<std::uintptr_t>(handle);
    return value <= UINT32_MAX ? static_cast<std::uint32_t>(value) : 0;
}

}  // namespace

NewHandle::NewHandle(std::shared_ptr<HandleObject> object) {
    HandleMap single;
    single.emplace(0, std::move(object));
    m_node = single.extract(single.begin());
}

HANDLE NewHandle::give() noexcept {
    HandleTable& handles = table();
    const std::lock_guard<Lock> guard(handles.lock);
    do {  // ends: memory runs out long before 2^30 handles do
        handles.last_key += STEP;
    } while (handles.last_key == 0 || handles.objects.contains(handles.last_key));
    m_node.key() = handles.last_key;
    handles.objects.insert(std::move(m_node));
    return reinterpret_cast<HANDLE>(std::uintptr_t{handles.last_key});
}

std::shared_ptr<HandleObject> find_object(HANDLE handle) noexcept {
    HandleTable& handles = table();
    const std::lock_guard<Lock> guard(handles.lock);
    const auto found = handles.objects.find(key_of(handle));
    return found != handles.objects.end() ? found->second : nullptr;
}

void drop_handle(HANDLE handle) noexcept {
    HandleTable& handles = table();
    HandleMap::node_type dropped;  // its object may end with it, outside the lock
    const std::lock_guard<Lock> guard(handles.lock);
    dropped = handles.objects.extract(key_of(handle));
}

void for_each_object(void (*visit)(HandleObject&)) noexcept {
    HandleTable& handles = table();
    const std::lock_guard<Lock> guard(handles.lock);
    for (auto& [key, object] : handles.objects) {
        visit(*object);
    }
}

}  // namespace basalt::platform

BOOL CloseHandle(HANDLE handle) {
    using basalt::platform::HandleObject;
    const std::shared_ptr<HandleObject> object = basalt::platform::find_object(handle);
    if (object == nullptr || object->kind() == HandleObject::Kind::SEARCH) {
        return basalt::platform::fail_with(ERROR_INVALID_HANDLE, 0);
    }
    basalt::platform::drop_handle(handle);
    object->close();
    return 1;
}
