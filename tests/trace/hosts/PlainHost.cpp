// Brings nothing of its own.

#include "HostRun.h"

int main(int argumentCount, char** arguments) { return runHost(argumentCount, arguments); }
