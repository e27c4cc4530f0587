// SPDX-License-Identifier: MIT
#include "App/Program.h"

int main(int argumentCount, char** arguments) {
  return kestro::runProgram(argumentCount, arguments);
}
