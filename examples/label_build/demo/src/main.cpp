#include <cstdio>

extern char const* extra;

int main() {
    std::puts(extra);
}
