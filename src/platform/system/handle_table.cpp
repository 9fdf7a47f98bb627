#include "src/platform/system/handle_table.h"

#include <atomic>
#include <utility>

#include "src/platform/system/no_destructor.h"

namespace basalt::platform {
namespace {

constexpr std::uint32_t STEP = 4;  // Win32: the two low bits of a handle are the caller's

constinit std::atomic<std::uint32_t> s_last_key = 0;

HandleRegistry& objects() noexcept {
    static NoDestructor<HandleRegistry> s_objects;
    return *s_objects;
}

// The key of a handle; 0, which no handle has, for a value out of range.
std::uint32_t key_of(HANDLE handle) noexcept {
    const auto value = reinterpret_cast<std::uintptr_t>(handle);
    return value <= UINT32_MAX ? static_cast<std::uint32_t>(value) : 0;
}

}  // namespace

NewHandle::NewHandle(std::shared_ptr<HandleObject> object)
    : m_entry(HandleRegistry::make_entry(std::move(object))) {}

HANDLE NewHandle::give() noexcept {
    std::uint32_t key = 0;
    do {  // ends: memory runs out long before 2^30 handles do
        key = s_last_key.fetch_add(STEP, std::memory_order_relaxed) + STEP;
    } while (key == 0 || !objects().add(key, m_entry));
    return reinterpret_cast<HANDLE>(std::uintptr_t{key});
}

std::shared_ptr<HandleObject> find_object(HANDLE handle) noexcept {
    return objects().find(key_of(handle));
}

void drop_handle(HANDLE handle) noexcept {
    // The object may be destroyed here, with the registry unlocked.
    const HandleRegistry::Entry dropped = objects().take(key_of(handle));
}

void for_each_object(void (*visit)(HandleObject&)) noexcept {
    objects().for_each([visit](const std::shared_ptr<HandleObject>& object) { visit(*object); });
}

}  // namespace basalt::platform
