/* A program that takes its libraries from wherever they are found: it imports one and loads another by its bare name. */
#include <windows.h>

int main(void) {
    DWORD unused;
    if (LoadLibraryA("MSFTEDIT.DLL") == NULL) {
        GetFileVersionInfoSizeA("nothing", &unused);
    }
    return 0;
}
