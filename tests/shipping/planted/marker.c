/* A library that somebody plants: it says that it ran, and in which program, by a file LIBRARY@PROGRAM in the
   folder that the variable HV_RAN names. */
#include <windows.h>

static const char* FileName(HMODULE module, char* path, DWORD size) {
    const char* name = path;
    DWORD length = GetModuleFileNameA(module, path, size);
    for (DWORD i = 0; i < length; ++i) {
        if (path[i] == '\\') {
            name = path + i + 1;
        }
    }
    return name;
}

BOOL WINAPI DllMain(HINSTANCE self, DWORD reason, LPVOID reserved) {
    char library[MAX_PATH], program[MAX_PATH], file[3 * MAX_PATH];
    (void)reserved;
    if (reason == DLL_PROCESS_ATTACH) {
        GetEnvironmentVariableA("HV_RAN", file, MAX_PATH);
        lstrcatA(file, "\\");
        lstrcatA(file, FileName(self, library, MAX_PATH));
        lstrcatA(file, "@");
        lstrcatA(file, FileName(NULL, program, MAX_PATH));
        CloseHandle(CreateFileA(file, GENERIC_WRITE, 0, NULL, CREATE_ALWAYS, 0, NULL));
    }
    return TRUE;
}
