// SPDX-License-Identifier: MIT
#include "App/Program.h"
#include "Platform/Linux/LinuxPlatform.h"

int main(int argumentCount, char** arguments) {
  kestro::prepareStandardStreams();
  return kestro::runProgram(argumentCount, arguments);
}
