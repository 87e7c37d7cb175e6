# SPDX-License-Identifier: MIT
# The Python that the binding is built for: one with its headers, NumPy and pybind11. Another one, of a version manager
# for instance, may come first on the PATH; then the system's is taken. Choose with -DQUARZEL_PYTHON=/path/to/python3,
# whose NumPy is not looked for: to build, the headers are enough.
set(QUARZEL_PYTHON "" CACHE FILEPATH "The Python interpreter to build the binding for")

function(quarzel_find_python result)
  set(${result} "" PARENT_SCOPE)
  set(candidates ${QUARZEL_PYTHON})
  set(modules os sysconfig sys)
  if(NOT candidates)
    list(APPEND modules numpy)
    find_program(QUARZEL_PYTHON_ON_PATH python3)
    mark_as_advanced(QUARZEL_PYTHON_ON_PATH)
    set(candidates ${QUARZEL_PYTHON_ON_PATH} /usr/bin/python3)
  endif()
  list(JOIN modules ", " modules)
  set(probe "import ${modules}
sys.exit(not os.path.exists(os.path.join(sysconfig.get_path('include'), 'Python.h')))")
  foreach(candidate ${candidates})
    execute_process(COMMAND ${candidate} -c "${probe}" RESULT_VARIABLE status OUTPUT_QUIET ERROR_QUIET)
    if(status EQUAL 0)
      set(${result} ${candidate} PARENT_SCOPE)
      return()
    endif()
  endforeach()
endfunction()
