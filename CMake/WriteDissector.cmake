# SPDX-License-Identifier: MIT
# cmake -DPROGRAM=kestro-cli -DOUTPUT=FILE -P WriteDissector.cmake: what the program writes as its
# dissector becomes the file. What it says besides is shown only when it fails.
execute_process(COMMAND ${PROGRAM} codes --format=lua
  OUTPUT_FILE ${OUTPUT}.new ERROR_VARIABLE errors RESULT_VARIABLE status)
if(NOT status EQUAL 0)
  message(FATAL_ERROR "${PROGRAM} codes --format=lua: ${status}\n${errors}")
endif()
file(RENAME ${OUTPUT}.new ${OUTPUT})
