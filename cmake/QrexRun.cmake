# Translates; run by the commands that qrex_translate() adds. With QREX, the program; FOLDER, in which it runs; ARGUMENTS;
# CONFIGURATION, the files that set its keys; COMPLETE, to do so only where a translation is gone. What it tells is shown
# where it is a message.
if(COMPLETE)
  file(STRINGS "${FOLDER}/outputs.txt" outputs ENCODING UTF-8)
  set(is_complete TRUE)
  foreach(output IN LISTS outputs)
    if(NOT EXISTS "${output}")
      set(is_complete FALSE)
    endif()
  endforeach()
  if(is_complete)
    file(TOUCH "${FOLDER}/complete.stamp")
    return()
  endif()
endif()

file(SIZE "${QREX}" size)
file(TIMESTAMP "${QREX}" time %s)
set(state "${size} ${time} ${ARGUMENTS}\n")
foreach(file ${CONFIGURATION})
  file(SHA256 "${file}" hash)
  string(APPEND state "${hash} ${file}\n")
endforeach()
set(before "")
if(EXISTS "${FOLDER}/state")
  file(READ "${FOLDER}/state" before)
endif()
if(NOT before STREQUAL state)  # which the tool does not compare
  list(APPEND ARGUMENTS rebuildAll=true)
endif()

file(TOUCH "${FOLDER}/begun.stamp")  # what changes from here on is newer
execute_process(COMMAND "${QREX}" ${ARGUMENTS} "depfile=\"${FOLDER}/translated.d\"" WORKING_DIRECTORY "${FOLDER}"
                OUTPUT_VARIABLE told ERROR_VARIABLE told RESULT_VARIABLE status)
if(NOT status EQUAL 0)
  string(REGEX REPLACE "(^|\n)(Qrex V|argv\\[|\\$|PATH = |INCLUDE = |LIB = )[^\n]*" "" told "${told}")
  message(NOTICE "${told}")
  list(GET ARGUMENTS 0 workspace)
  message(FATAL_ERROR "${workspace} can't be translated")
endif()
string(REGEX MATCHALL "[^\n]*[Ww]arning[^\n]*" warnings "${told}")
foreach(warning IN LISTS warnings)
  message(NOTICE "${warning}")
endforeach()

# The stamp is what the build knows as the output.
file(READ "${FOLDER}/translated.d" dependencies)
string(FIND "${dependencies}" ": \\\n" colon)
string(SUBSTRING "${dependencies}" ${colon} -1 dependencies)
string(REGEX REPLACE "([ #])" "\\\\\\1" target "${FOLDER}/translated.stamp")
string(REPLACE "$" "$$" target "${target}")
file(WRITE "${FOLDER}/translated.d" "${target}${dependencies}")

file(WRITE "${FOLDER}/state" "${state}")
file(RENAME "${FOLDER}/begun.stamp" "${FOLDER}/translated.stamp")
if(COMPLETE)
  file(TOUCH "${FOLDER}/complete.stamp")
endif()
