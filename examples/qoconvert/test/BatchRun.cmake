# Runs the sample program in batch mode on a fresh copy of the sample project
# and checks what a user of the family would check: the exit code, the log,
# and every byte of the converted file.
#
#   cmake -DEMULATOR=... -DPROGRAM=... -DSOURCE_DIR=... -DWORK_DIR=... -P BatchRun.cmake
set(project ${WORK_DIR}/batch-project)
file(REMOVE_RECURSE ${project})
file(MAKE_DIRECTORY ${project})

# The sample data in Windows-1252, the project converting it to DOS code page 850.
execute_process(COMMAND iconv -f UTF-8 -t CP1252 ${SOURCE_DIR}/sample/kunden.txt.utf8
                OUTPUT_FILE ${project}/kunden.txt RESULT_VARIABLE rc)
if(NOT rc EQUAL 0)
  message(FATAL_ERROR "iconv failed")
endif()
file(WRITE ${project}/qoconvert.ini
     "[Eingabe]\nDatei=kunden.txt\nZeichensatz=0\n[Ausgabe]\nDatei=kunden-dos.txt\nZeichensatz=1\n")

execute_process(COMMAND ${EMULATOR} ${PROGRAM} /batch ${project}
                RESULT_VARIABLE rc OUTPUT_QUIET ERROR_QUIET TIMEOUT 120)
if(NOT rc EQUAL 0)
  message(FATAL_ERROR "qoconvert /batch ended with ${rc}")
endif()

# Compared as files: CMake's strings would lose the carriage returns. The
# expected file is the sample in code page 850 with CR LF line ends.
execute_process(COMMAND sh -c "sed 's/$/\r/' '${SOURCE_DIR}/sample/kunden.txt.utf8' | iconv -f UTF-8 -t CP850"
                OUTPUT_FILE ${project}/expected.txt RESULT_VARIABLE rc)
execute_process(COMMAND ${CMAKE_COMMAND} -E compare_files ${project}/kunden-dos.txt ${project}/expected.txt
                RESULT_VARIABLE differs)
if(NOT rc EQUAL 0 OR NOT differs EQUAL 0)
  message(FATAL_ERROR "kunden-dos.txt differs from the sample in code page 850 with CR LF")
endif()

file(READ ${project}/qoconvert.log log)
if(NOT log MATCHES "H:1001 4 S.tze konvertiert nach [^\r\n]*kunden-dos.txt, Autoreturn: ok\r?\n")
  message(FATAL_ERROR "log lacks the result line:\n${log}")
endif()
if(NOT log MATCHES "qoconvert beendet mit 0\r?\n$")
  message(FATAL_ERROR "log lacks the end line:\n${log}")
endif()

# A project without files fails with exit code 1 and says why in the log, without a window.
file(WRITE ${project}/qoconvert.ini "[Eingabe]\n")
file(REMOVE ${project}/qoconvert.log)
execute_process(COMMAND ${EMULATOR} ${PROGRAM} /batch ${project}
                RESULT_VARIABLE rc OUTPUT_QUIET ERROR_QUIET TIMEOUT 120)
file(READ ${project}/qoconvert.log log)
if(NOT rc EQUAL 1 OR NOT log MATCHES "E:2101 Im Projekt '[^']*qoconvert.ini' sind Eingabe- und Ausgabedatei nicht eingetragen., Autoreturn: ok")
  message(FATAL_ERROR "incomplete project: exit ${rc}, log:\n${log}")
endif()
