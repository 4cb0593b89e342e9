// Loads the module named on the command line and prints its model count.
#include <ulk/ulk.h>

#include <cstdio>

int main(int argc, char** argv) {
    if (argc != 2) {
        std::fprintf(stderr, "usage: %s PLUGIN\n", argv[0]);
        return 2;
    }
    ulkDLL* module = ulkDLLMaker::Open(argv[1], nullptr, nullptr);
    if (!module) {
        std::fprintf(stderr, "%s: cannot load the module\n", argv[1]);
        return 1;
    }
    std::printf("models: %u\n", module->GetNumModels());
    ulkDLLMaker::Close(module, kCloseNow);
    return 0;
}
