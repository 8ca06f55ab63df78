// Does nothing until it is ended. Should nobody do that, it ends by itself.

#include <chrono>
#include <thread>

int main() {
    std::this_thread::sleep_for(std::chrono::minutes(10));
}
