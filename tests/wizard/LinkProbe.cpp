// What a link is opened with, in a test that wants to know how: it writes down how it is to show its window, and the
// address.

#include <windows.h>

#include <cstdio>

int main(int count, char** arguments) {
    STARTUPINFOA start{};
    GetStartupInfoA(&start);
    const int show = (start.dwFlags & STARTF_USESHOWWINDOW) != 0 ? start.wShowWindow : -1;
    FILE* const file = std::fopen("C:\\opened.txt", "wb");
    if (file == nullptr) {
        return 1;
    }
    std::fprintf(file, "%d %s\n", show, count > 1 ? arguments[count - 1] : "nothing");
    std::fclose(file);
    return 0;
}
