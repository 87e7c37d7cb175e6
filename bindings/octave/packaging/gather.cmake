# SPDX-License-Identifier: MIT
# Lay out the files of the package: cmake -D SOURCE=... -D TREE=... -D DESCRIPTION=... -P gather.cmake
file(REMOVE_RECURSE ${TREE})
set(here ${SOURCE}/bindings/octave)
file(COPY ${DESCRIPTION} ${here}/packaging/INDEX DESTINATION ${TREE})
configure_file(${SOURCE}/LICENSE ${TREE}/COPYING COPYONLY)
file(COPY ${here}/inst DESTINATION ${TREE})
file(GLOB own ${here}/source/*)
file(COPY ${own} ${here}/packaging/Makefile DESTINATION ${TREE}/src)
file(GLOB common ${SOURCE}/bindings/common/*.?pp)
file(COPY ${common} DESTINATION ${TREE}/src/common)
foreach(part encoder size_table)
  file(COPY ${SOURCE}/link/${part}.cpp ${SOURCE}/link/${part}.hpp DESTINATION ${TREE}/src/link)
endforeach()
