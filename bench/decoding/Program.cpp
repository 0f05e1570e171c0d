#include "decoding/Main.h"

int main(int argc, char** argv)
{
    return kestrum::bench::runAll(argc, argv);
}
