#include "platform/hosted/program.h"

#include <linux/limits.h>
#include <unistd.h>

#include <algorithm>
#include <cstring>
#include <string>

#include "platform/hosted/ignoring_case.h"
#include "platform/hosted/processes.h"

namespace hosted {
namespace {

// Set before any constructor runs, so resources of other sources can enter themselves.
constinit const CompiledResource* first = nullptr;

}  // namespace

CompiledResource::CompiledResource(std::uint16_t number, const char* type, const char* begin, const char* end)
    : number_(number), type_(type), begin_(begin), end_(end), next_(first) {
    first = this;
}

const CompiledResource* CompiledResource::Find(std::uintptr_t number, const char* type) {
    const CompiledResource* resource = first;
    while (resource != nullptr && (resource->number_ != number || !EqualsIgnoringCase(resource->type_, type))) {
        resource = resource->next_;
    }
    return resource;
}

}  // namespace hosted

namespace {

using hosted::CompiledResource;

bool IsNumber(LPCSTR name) {
    return reinterpret_cast<std::uintptr_t>(name) <= 0xFFFF;
}

const CompiledResource* ResourceOf(const void* handle) {
    return static_cast<const CompiledResource*>(handle);
}

}  // namespace

DWORD GetModuleFileNameA(HMODULE /*module*/, LPSTR buffer, DWORD size) {
    const std::string path = hosted::ProgramOfProcess(getpid());
    const std::size_t length = path.copy(buffer, size);
    if (length < size) {
        buffer[length] = '\0';
        SetLastError(static_cast<DWORD>(ERROR_SUCCESS));
    } else {
        if (size > 0) {
            buffer[size - 1] = '\0';
        }
        SetLastError(static_cast<DWORD>(ERROR_INSUFFICIENT_BUFFER));
    }
    return static_cast<DWORD>(length);
}

HRSRC FindResourceA(HMODULE /*module*/, LPCSTR name, LPCSTR type) {
    const CompiledResource* found = IsNumber(name) && !IsNumber(type)
                                        ? CompiledResource::Find(reinterpret_cast<std::uintptr_t>(name), type)
                                        : nullptr;
    if (found == nullptr) {
        SetLastError(static_cast<DWORD>(ERROR_RESOURCE_NAME_NOT_FOUND));
    }
    // The caller's handles are older than const.
    return reinterpret_cast<HRSRC>(const_cast<CompiledResource*>(found));
}

HGLOBAL LoadResource(HMODULE /*module*/, HRSRC resource) {
    return resource;
}

DWORD SizeofResource(HMODULE /*module*/, HRSRC resource) {
    return resource != nullptr ? static_cast<DWORD>(ResourceOf(resource)->Size()) : 0;
}

LPVOID LockResource(HGLOBAL loaded) {
    return loaded != nullptr ? const_cast<char*>(ResourceOf(loaded)->Bytes()) : nullptr;
}

BOOL FreeResource(HGLOBAL /*loaded*/) {
    return FALSE;
}
