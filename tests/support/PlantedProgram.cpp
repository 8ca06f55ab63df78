// What an attacker leaves where a program may look for another: it leaves a mark, C:\planted.txt, and does nothing
// else.

#include <cstdio>

#include "platform/win32.h"

int main() {
    FILE* mark = nullptr;
    if (fopen_s(&mark, "C:\\planted.txt", "w") == 0) {
        std::fputs("it ran", mark);
        std::fclose(mark);
    }
}
