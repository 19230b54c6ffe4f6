// The demo host: shows what the component can do so far, without any server.
#include <cstdio>

int main() {
    std::printf("Quintara Chat demo\n");
    std::printf("The component's layers are being built; run `make test` to see them checked.\n");
    return 0;
}
