// SPDX-License-Identifier: MIT
#include "CommandLine/CommandLine.h"
#include "Platform/Linux/LinuxPlatform.h"

int main(int argumentCount, char** arguments) {
  kestro::prepareStandardStreams();
  return kestro::runCommandLine(argumentCount, arguments);
}
