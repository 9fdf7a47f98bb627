// Handles of drawing objects and contexts, checked before they are used.
//
// A handle is a slot's number below its generation, which changes with every object the slot holds: the
// handle of a deleted object differs from that of its successor. A lookup takes no lock, which a call per
// pixel needs. Numbers below 0x10000 are left to stock objects.
#ifndef BASALT_SRC_PLATFORM_DRAWING_HANDLES_H
#define BASALT_SRC_PLATFORM_DRAWING_HANDLES_H

#include <cstdint>
#include <memory>

namespace basalt::platform {

enum class GraphicsKind : std::uint8_t { CONTEXT, BITMAP, BRUSH, REGION };

struct GraphicsObject {
    explicit GraphicsObject(GraphicsKind its_kind) : kind(its_kind) {}
    GraphicsObject(const GraphicsObject&) = delete;
    GraphicsObject& operator=(const GraphicsObject&) = delete;
    virtual ~GraphicsObject() = default;

    const GraphicsKind kind;
};

// Keeps an object under a new handle; null, with the last error set, when the object is null (out of memory)
// or there are 65,536 already. Threads: thread-safe.
void* keep_graphics_object(std::unique_ptr<GraphicsObject> object);

// The object of a handle; null for any other. Threads: thread-safe.
GraphicsObject* find_graphics_object(const void* handle);

// Takes the object of a handle out; null for any other. Threads: thread-safe.
std::unique_ptr<GraphicsObject> release_graphics_object(const void* handle);

// The object of a handle of one kind; for another handle null and ERROR_INVALID_HANDLE.
GraphicsObject* object_of_kind(const void* handle, GraphicsKind kind);
template <typename Object>
Object* object_of(const void* handle) {
    return static_cast<Object*>(object_of_kind(handle, Object::KIND));
}

}  // namespace basalt::platform

#endif
