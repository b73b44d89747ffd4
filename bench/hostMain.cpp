// The measurements of the reference host. Its callbacks and those of the other measurements have
// the same names, so this is a program of its own.

#include "Measurements.h"
#include "Program.h"

int main(int argc, char** argv) {
    Program program;
    addMetricsCost(program);
    return program.run(argc, argv);
}
