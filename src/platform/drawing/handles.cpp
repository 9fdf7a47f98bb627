#include "src/platform/drawing/handles.h"

#include <atomic>
#include <mutex>

#include "src/platform/system/failure.h"
#include "src/platform/system/lock.h"

namespace basalt::platform {

namespace {

constexpr std::uint32_t SLOT_BITS = 16;
constexpr std::uint32_t SLOTS = 1U << SLOT_BITS;

struct Slot {
    std::atomic<GraphicsObject*> object;
    std::atomic<std::uint32_t> generation;
    std::uint32_t next_free;  // number of the next free slot plus 1; 0 at the end of the list
};

// A megabyte of zeros; only the pages used take memory.
constinit Slot slots[SLOTS] = {};
constinit Lock slots_lock;
constinit std::uint32_t first_free = 0;  // as next_free
constinit std::uint32_t slots_used = 0;  // slots from here on have never held an object

void* handle_of(std::uint32_t slot, std::uint32_t generation) {
    // The generation plus 1 keeps handles above those of stock objects.
    const std::uintptr_t upper = std::uintptr_t{generation} + 1;
    return reinterpret_cast<void*>(upper << SLOT_BITS | slot);  // NOLINT(performance-no-int-to-ptr)
}

Slot& slot_of(const void* handle) {
    return slots[reinterpret_cast<std::uintptr_t>(handle) & (SLOTS - 1)];
}

}  // namespace

void* keep_graphics_object(std::unique_ptr<GraphicsObject> object) {
    if (object == nullptr) {
        return fail_with(ERROR_NOT_ENOUGH_MEMORY, nullptr);
    }
    const std::lock_guard hold(slots_lock);
    std::uint32_t number = slots_used;
    if (first_free != 0) {
        number = first_free - 1;
        first_free = slots[number].next_free;
    } else if (slots_used < SLOTS) {
        ++slots_used;
    } else {
        return fail_with(ERROR_NO_SYSTEM_RESOURCES, nullptr);
    }
    Slot& slot = slots[number];
    slot.object.store(object.release(), std::memory_order_release);
    return handle_of(number, slot.generation.load(std::memory_order_relaxed));
}

GraphicsObject* find_graphics_object(const void* handle) {
    const Slot& slot = slot_of(handle);
    GraphicsObject* const object = slot.object.load(std::memory_order_acquire);
    const auto number = static_cast<std::uint32_t>(&slot - slots);
    const bool is_current = handle_of(number, slot.generation.load(std::memory_order_acquire)) == handle;
    return is_current ? object : nullptr;
}

std::unique_ptr<GraphicsObject> release_graphics_object(const void* handle) {
    const std::lock_guard hold(slots_lock);
    GraphicsObject* const object = find_graphics_object(handle);
    if (object != nullptr) {
        Slot& slot = slot_of(handle);
        slot.object.store(nullptr, std::memory_order_release);
        slot.generation.fetch_add(1, std::memory_order_release);
        slot.next_free = first_free;
        first_free = static_cast<std::uint32_t>(&slot - slots) + 1;
    }
    return std::unique_ptr<GraphicsObject>(object);
}

GraphicsObject* object_of_kind(const void* handle, GraphicsKind kind) {
    GraphicsObject* const object = find_graphics_object(handle);
    if (object == nullptr || object->kind != kind) {
        return fail_with(ERROR_INVALID_HANDLE, nullptr);
    }
    return object;
}

}  // namespace basalt::platform
