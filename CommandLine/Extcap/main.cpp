// SPDX-License-Identifier: MIT
#include "CommandLine/Extcap/Extcap.h"
#include "Platform/Linux/LinuxPlatform.h"

int main(int argumentCount, char** arguments) {
  kestro::prepareStandardStreams();
  return kestro::runExtcap(argumentCount, arguments);
}
