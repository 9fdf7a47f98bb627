#include "src/platform/file_mapping.h"

#include <memory>
#include <utility>

#include "basalt/platform/error.h"
#include "src/platform/disk/open_file.h"
#include "src/platform/pages.h"
#include "src/platform/system/failure.h"
#include "src/platform/system/handle_table.h"
#include "src/platform/system/no_destructor.h"
#include "src/platform/system/registry.h"

namespace basalt::platform {
namespace {

struct FileMapping final : HandleObject {
    static constexpr Kind KIND = Kind::MAPPING;
    FileMapping(std::shared_ptr<OpenFile> mapped, std::size_t bytes) noexcept
        : HandleObject(KIND), file(std::move(mapped)), size(bytes) {}

    const std::shared_ptr<OpenFile> file;  // null for anonymous pages
    const std::size_t size;
};

struct View {
    std::shared_ptr<OpenFile> file;
    std::size_t size = 0;
};

using ViewRegistry = Registry<const void*, View>;

ViewRegistry& views() noexcept {
    static NoDestructor<ViewRegistry> s_views;
    return *s_views;
}

DWORD map(FileMapping& mapping, std::byte*& address) noexcept {
    if (mapping.file != nullptr) {
        return mapping.file->map(mapping.size, address);
    }
    address = map_pages(whole_pages(mapping.size), page_size());
    return address != nullptr ? ERROR_SUCCESS : ERROR_NOT_ENOUGH_MEMORY;
}

}  // namespace
}  // namespace basalt::platform

using namespace basalt::platform;

HANDLE CreateFileMappingW(HANDLE file, SECURITY_ATTRIBUTES* /*security*/, DWORD /*protection*/,
                          DWORD /*size_high*/, DWORD size, const wchar_t* /*name*/) {
    const bool is_anonymous = file == INVALID_HANDLE_VALUE;
    if (size == 0) {
        return fail_with(is_anonymous ? ERROR_INVALID_PARAMETER : ERROR_FILE_INVALID, HANDLE{nullptr});
    }
    return or_out_of_memory(HANDLE{nullptr}, [&] {
        std::shared_ptr<OpenFile> open;
        if (!is_anonymous) {
            open = find_object_of<OpenFile>(file);
            if (open == nullptr) {
                return fail_with(ERROR_INVALID_HANDLE, HANDLE{nullptr});
            }
        }
        NewHandle handle(std::make_shared<FileMapping>(open, size));
        const DWORD error = is_anonymous ? ERROR_SUCCESS : open->reserve(size);
        return error == ERROR_SUCCESS ? handle.give() : fail_with(error, HANDLE{nullptr});
    });
}

void* MapViewOfFile(HANDLE mapping, DWORD /*access*/, DWORD /*offset_high*/, DWORD /*offset_low*/,
                    std::size_t /*size*/) {
    using Address = void*;
    const auto object = find_object_of<FileMapping>(mapping);
    if (object == nullptr) {
        return fail_with(ERROR_INVALID_HANDLE, Address{});
    }
    return or_out_of_memory(Address{}, [&] {
        auto view = ViewRegistry::make_entry({object->file, object->size});
        std::byte* address = nullptr;
        const DWORD error = map(*object, address);
        if (error != ERROR_SUCCESS) {
            return fail_with(error, Address{});
        }
        views().add(address, view);
        return Address{address};
    });
}

BOOL UnmapViewOfFile(const void* address) {
    // Taken out first: once it is unmapped, another thread may be given its address.
    auto view = views().take(address);
    if (view.empty()) {
        return fail_with(ERROR_INVALID_ADDRESS, 0);
    }
    auto* const pages = static_cast<std::byte*>(const_cast<void*>(address));
    const auto& [file, size] = view.mapped();
    const bool is_unmapped =
        file != nullptr ? file->unmap(pages, size) : unmap_pages(pages, whole_pages(size));
    if (!is_unmapped) {
        views().add(address, view);
        return fail_with(ERROR_NOT_ENOUGH_MEMORY, 0);
    }
    return 1;
}
