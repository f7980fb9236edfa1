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

# Projects that must be refused with exit code 1, a reason in the log, and
# the input untouched. The output named as the input under other spellings
# would otherwise be truncated before it is read.
file(COPY_FILE ${project}/kunden.txt ${project}/kunden.orig)
set(cases
    "same file|Datei=kunden.txt\nZeichensatz=1|ist die Eingabedatei"
    "other case|Datei=KUNDEN.TXT\nZeichensatz=1|ist die Eingabedatei"
    "dot-dot path|Datei=./sub/../kunden.txt\nZeichensatz=1|ist die Eingabedatei"
    "unknown charset|Datei=kunden-neu.txt\nZeichensatz=7|Unbekannter Zeichensatz '7'"
    "charset not a number|Datei=kunden-neu.txt\nZeichensatz=dos|Unbekannter Zeichensatz 'dos'"
    "unknown format|Datei=kunden-neu.txt\nFormat=3|Unbekanntes Ausgabeformat '3'"
    "columns of no kind|Datei=kunden-neu.txt\n[Spalten]\nOuterColumns=1|keine Zusammensetzung der Ausgabespalten"
    "column count out of range|Datei=kunden-neu.txt\n[Spaltenauswahl]\nSpalten=99999|Der Wert 99999 von 'Spalten'")
foreach(case IN LISTS cases)
  string(REPLACE "|" ";" parts "${case}")
  list(GET parts 0 what)
  list(GET parts 1 output)
  list(GET parts 2 expect)
  string(REPLACE "\\n" "\n" output "${output}")
  file(WRITE ${project}/qoconvert.ini "[Eingabe]\nDatei=kunden.txt\nZeichensatz=0\n[Ausgabe]\n${output}\n")
  file(REMOVE ${project}/qoconvert.log)
  execute_process(COMMAND ${EMULATOR} ${PROGRAM} /batch ${project}
                  RESULT_VARIABLE rc OUTPUT_QUIET ERROR_VARIABLE err TIMEOUT 120)
  file(READ ${project}/qoconvert.log log)
  execute_process(COMMAND ${CMAKE_COMMAND} -E compare_files ${project}/kunden.txt ${project}/kunden.orig
                  RESULT_VARIABLE changed)
  if(NOT rc EQUAL 1 OR NOT changed EQUAL 0 OR NOT log MATCHES "E:2[0-9]+ [^\n]*${expect}"
     OR NOT err MATCHES "${expect}" OR EXISTS ${project}/kunden-neu.txt)
    message(FATAL_ERROR "${what}: exit ${rc}, input changed: ${changed}\nlog:\n${log}\nconsole:\n${err}")
  endif()
endforeach()

# No temporary file of the output is left behind, by the good run or the refused ones.
file(GLOB leftovers ${project}/qo*.tmp ${project}/*.~tmp)
if(leftovers)
  message(FATAL_ERROR "temporary files left: ${leftovers}")
endif()

# Through the text filters as their pages configure them: a tab-delimited
# file with a title line and quoted names into fixed-length records in code
# page 850, the lengths and line ends as the project's filter sections say.
file(WRITE ${project}/make-tab.sh [=[
{ printf 'Kundenliste\r\n'; tr ';' '\t' < kunden.txt | sed 's/\t\([^\t]*\)\t/\t"\1"\t/'; } > kunden-tab.txt
tr -d '\r' < kunden.txt | awk -F';' 'NR>1{printf "%-3s%-10s%-18s%-12s\r\n",$1,$2,$3,$4}' | iconv -f CP1252 -t CP850 > expected.fix
]=])
execute_process(COMMAND sh make-tab.sh WORKING_DIRECTORY ${project} RESULT_VARIABLE rc)
file(WRITE ${project}/qoconvert.ini
     "[Eingabe]\nDatei=kunden-tab.txt\n[Eingabefilter]\ndelimiter=9\nencloser=34\nescape=0\nskip=1\nfirstrownames=1\ncharset=32\n"
     "[Ausgabe]\nDatei=kunden.fix\nFormat=1\n[Ausgabefilter]\ncharset=16\ncrlf=1\ncolumns=4\n"
     "column0_len=3\ncolumn1_len=10\ncolumn2_len=18\ncolumn3_len=12\n")
execute_process(COMMAND ${EMULATOR} ${PROGRAM} /batch ${project}
                RESULT_VARIABLE rc OUTPUT_QUIET ERROR_VARIABLE err TIMEOUT 120)
execute_process(COMMAND ${CMAKE_COMMAND} -E compare_files ${project}/kunden.fix ${project}/expected.fix
                RESULT_VARIABLE differs)
if(NOT rc EQUAL 0 OR NOT differs EQUAL 0)
  file(READ ${project}/qoconvert.log log)
  message(FATAL_ERROR "through the text filters: exit ${rc}, differs ${differs}\n${err}\nlog:\n${log}")
endif()

# Output columns as the window's column dialog stores them: a combination
# "Adresse" of street and town with ", " between them, the columns ordered
# Adresse, Name, and Nr left out.
file(WRITE ${project}/expected-columns.sh [=[
tr -d '\r' < kunden.txt | awk -F';' 'NR==1{printf "Adresse;Name\r\n"} NR>1{printf "%s, %s;%s\r\n",$3,$4,$2}' > expected-columns.txt
]=])
execute_process(COMMAND sh expected-columns.sh WORKING_DIRECTORY ${project} RESULT_VARIABLE rc)
file(WRITE ${project}/qoconvert.ini
     "[Eingabe]\nDatei=kunden.txt\nZeichensatz=0\n[Ausgabe]\nDatei=spalten.txt\nZeichensatz=0\n"
     "[Funktionen]\nFunktionen=1\nFunktion0Id=20000\nFunktion0Name=Adresse\nFunktion0Teile=2\n"
     "Funktion0Teil0Id=3\nFunktion0Teil0Trenner=\nFunktion0Teil1Id=4\nFunktion0Teil1Trenner=,\\s\n"
     "[Spalten]\nMultiColumnType=1\nInnerColumns=4\n"
     "Inner0Id=1\nInner0Function=1\nInner0Name=Nr\nInner0Source=0\n"
     "Inner1Id=2\nInner1Function=2\nInner1Name=Name\nInner1Source=1\n"
     "Inner2Id=3\nInner2Function=3\nInner2Name=Stra\\xDFe\nInner2Source=2\n"
     "Inner3Id=4\nInner3Function=4\nInner3Name=Ort\nInner3Source=3\n"
     "OuterColumns=3\nOuter0Id=0\nOuter0Name=Nr\nOuter1Id=1\nOuter1Name=Name\nOuter2Id=2\nOuter2Name=Adresse\n"
     "Assignments=4\nAssign0Outer=0\nAssign0Inner=1\nAssign1Outer=1\nAssign1Inner=2\n"
     "Assign2Outer=2\nAssign2Inner=3\nAssign3Outer=2\nAssign3Inner=4\nAssign3Separator=,\\s\n"
     "[Spaltenauswahl]\nSpalten=3\nSpalte0Name=Adresse\nSpalte0Ausgabe=1\nSpalte1Name=Name\nSpalte1Ausgabe=1\n"
     "Spalte2Name=Nr\nSpalte2Ausgabe=0\n")
execute_process(COMMAND ${EMULATOR} ${PROGRAM} /batch ${project}
                RESULT_VARIABLE rc OUTPUT_QUIET ERROR_VARIABLE err TIMEOUT 120)
execute_process(COMMAND ${CMAKE_COMMAND} -E compare_files ${project}/spalten.txt ${project}/expected-columns.txt
                RESULT_VARIABLE differs)
if(NOT rc EQUAL 0 OR NOT differs EQUAL 0)
  file(READ ${project}/qoconvert.log log)
  message(FATAL_ERROR "composed and chosen columns: exit ${rc}, differs ${differs}\n${err}\nlog:\n${log}")
endif()

# A project folder that does not exist: exit code 1 and the reason on the console.
execute_process(COMMAND ${EMULATOR} ${PROGRAM} /batch ${project}/fehlt
                RESULT_VARIABLE rc OUTPUT_QUIET ERROR_VARIABLE err TIMEOUT 120)
if(NOT rc EQUAL 1 OR NOT err MATCHES "Der Projektordner '[^']*fehlt' existiert nicht")
  message(FATAL_ERROR "missing project folder: exit ${rc}, console:\n${err}")
endif()

# Through a database: the delimited file into a table of an SQLite file (its
# columns as the project's output section sets them: the number an integer
# column, indexed), and the table back into a delimited file; the records
# arrive unchanged.
file(WRITE ${project}/qoconvert.ini
     "[Eingabe]\nDatei=kunden.txt\nZeichensatz=0\n[Ausgabe]\nODBC=Driver=SQLite3;Database=kunden.db\nTabelle=Kunden\n"
     "[Ausgabefilter]\ncolumns=4\ncolumn0_type=1\ncolumn0_index=1\ncolumn1_type=2\ncolumn1_len=40\n"
     "column2_type=2\ncolumn2_len=40\ncolumn3_type=2\ncolumn3_len=40\n")
execute_process(COMMAND ${EMULATOR} ${PROGRAM} /batch ${project}
                RESULT_VARIABLE rc OUTPUT_QUIET ERROR_VARIABLE err TIMEOUT 120)
execute_process(COMMAND sqlite3 ${project}/kunden.db "select typeof(Nr) from Kunden limit 1; select count(*) from sqlite_master where type='index' and tbl_name='Kunden'"
                OUTPUT_VARIABLE schema)
if(NOT schema MATCHES "^integer\n1\n")
  message(FATAL_ERROR "the project's column settings did not reach the table:\n${schema}")
endif()
file(WRITE ${project}/qoconvert.ini
     "[Eingabe]\nODBC=Driver=SQLite3;Database=kunden.db\nSQL=select * from Kunden\n[Ausgabe]\nDatei=zurueck.txt\nZeichensatz=0\n")
execute_process(COMMAND ${EMULATOR} ${PROGRAM} /batch ${project}
                RESULT_VARIABLE rc2 OUTPUT_QUIET ERROR_VARIABLE err2 TIMEOUT 120)
execute_process(COMMAND sh -c "sed 's/$/\r/' '${SOURCE_DIR}/sample/kunden.txt.utf8' | iconv -f UTF-8 -t CP1252"
                OUTPUT_FILE ${project}/expected-ansi.txt)
execute_process(COMMAND ${CMAKE_COMMAND} -E compare_files ${project}/zurueck.txt ${project}/expected-ansi.txt
                RESULT_VARIABLE differs)
if(NOT rc EQUAL 0 OR NOT rc2 EQUAL 0 OR NOT differs EQUAL 0)
  file(READ ${project}/qoconvert.log log)
  message(FATAL_ERROR "through SQLite: exit ${rc}/${rc2}, differs ${differs}\n${err}${err2}\nlog:\n${log}")
endif()

# Through an Access-type database file: into a table, and back out.
file(WRITE ${project}/qoconvert.ini
     "[Eingabe]\nDatei=kunden.txt\nZeichensatz=0\n[Ausgabe]\nDatenbank=kunden.mdb\nTabelle=Kunden\n")
execute_process(COMMAND ${EMULATOR} ${PROGRAM} /batch ${project}
                RESULT_VARIABLE rc OUTPUT_QUIET ERROR_VARIABLE err TIMEOUT 120)
file(REMOVE ${project}/zurueck.txt)
file(WRITE ${project}/qoconvert.ini
     "[Eingabe]\nDatenbank=kunden.mdb\nTabelle=Kunden\n[Ausgabe]\nDatei=zurueck.txt\nZeichensatz=0\n")
execute_process(COMMAND ${EMULATOR} ${PROGRAM} /batch ${project}
                RESULT_VARIABLE rc2 OUTPUT_QUIET ERROR_VARIABLE err2 TIMEOUT 120)
execute_process(COMMAND ${CMAKE_COMMAND} -E compare_files ${project}/zurueck.txt ${project}/expected-ansi.txt
                RESULT_VARIABLE differs)
if(NOT rc EQUAL 0 OR NOT rc2 EQUAL 0 OR NOT differs EQUAL 0)
  file(READ ${project}/qoconvert.log log)
  message(FATAL_ERROR "through an Access-type database: exit ${rc}/${rc2}, differs ${differs}\n${err}${err2}\nlog:\n${log}")
endif()

# From a sheet of an Excel workbook (written by openpyxl: numbers stay numbers).
execute_process(COMMAND /usr/bin/python3 -c "
import openpyxl, sys
rows = [l.rstrip('\\n').split(';') for l in open(sys.argv[1], encoding='utf-8')]
wb = openpyxl.Workbook()
ws = wb.active
ws.title = 'Kunden'
ws.append(rows[0])
for r in rows[1:]:
    ws.append([int(r[0])] + r[1:])
wb.save(sys.argv[2])
" ${SOURCE_DIR}/sample/kunden.txt.utf8 ${project}/kunden.xlsx RESULT_VARIABLE rc)
if(NOT rc EQUAL 0)
  message(FATAL_ERROR "openpyxl could not write the workbook")
endif()
file(REMOVE ${project}/zurueck.txt)
file(WRITE ${project}/qoconvert.ini
     "[Eingabe]\nDatenbank=kunden.xlsx\nTabelle=Kunden$\n[Ausgabe]\nDatei=zurueck.txt\nZeichensatz=0\n")
execute_process(COMMAND ${EMULATOR} ${PROGRAM} /batch ${project}
                RESULT_VARIABLE rc OUTPUT_QUIET ERROR_VARIABLE err TIMEOUT 120)
execute_process(COMMAND ${CMAKE_COMMAND} -E compare_files ${project}/zurueck.txt ${project}/expected-ansi.txt
                RESULT_VARIABLE differs)
if(NOT rc EQUAL 0 OR NOT differs EQUAL 0)
  file(READ ${project}/qoconvert.log log)
  message(FATAL_ERROR "from a workbook: exit ${rc}, differs ${differs}\n${err}\nlog:\n${log}")
endif()

# Every other kind of file in one chain, each read back by the filter that
# reads such files: delimited text into a dBase file, that into a table of an
# Access-type database, that into fixed-length records without line breaks
# and into fixed-length lines, which come back as delimited text. The values
# arrive unchanged (the column names are the ones each kind can keep).
set(lengths "columns=4\ncolumn0_len=3\ncolumn1_len=10\ncolumn2_len=18\ncolumn3_len=12\n")
set(widths "charset=32\ncolumns=4\ncollen0=3\ncollen1=10\ncollen2=18\ncollen3=12\n")
set(chain
    "[Eingabe]\nDatei=kunden.txt\nZeichensatz=0\n[Ausgabe]\nDatei=kette.dbf\nFormat=2\n"
    "[Eingabe]\nDatei=kette.dbf\nFormat=3\n[Ausgabe]\nDatenbank=kette.mdb\nTabelle=Kette\n"
    "[Eingabe]\nDatenbank=kette.mdb\nTabelle=Kette\n[Ausgabe]\nDatei=kette.fix\nFormat=1\n[Ausgabefilter]\ncharset=32\ncrlf=0\n${lengths}"
    "[Eingabe]\nDatenbank=kette.mdb\nTabelle=Kette\n[Ausgabe]\nDatei=kette.lines\nFormat=1\n[Ausgabefilter]\ncharset=32\ncrlf=1\n${lengths}"
    "[Eingabe]\nDatei=kette.fix\nFormat=1\n[Eingabefilter]\nrecordlen=43\n${widths}[Ausgabe]\nDatei=kette1.txt\n"
    "[Eingabe]\nDatei=kette.lines\nFormat=2\n[Eingabefilter]\n${widths}[Ausgabe]\nDatei=kette2.txt\n")
set(step 0)
foreach(ini IN LISTS chain)
  math(EXPR step "${step} + 1")
  file(WRITE ${project}/qoconvert.ini "${ini}")
  execute_process(COMMAND ${EMULATOR} ${PROGRAM} /batch ${project}
                  RESULT_VARIABLE rc OUTPUT_QUIET ERROR_VARIABLE err TIMEOUT 120)
  if(NOT rc EQUAL 0)
    file(READ ${project}/qoconvert.log log)
    message(FATAL_ERROR "chain step ${step}: exit ${rc}\n${ini}\n${err}\nlog:\n${log}")
  endif()
endforeach()
execute_process(COMMAND sh -c "tail -n +2 expected-ansi.txt > expected-values.txt; for f in kette1 kette2; do tail -n +2 $f.txt > $f.values; done"
                WORKING_DIRECTORY ${project})
foreach(result kette1 kette2)
  execute_process(COMMAND ${CMAKE_COMMAND} -E compare_files ${project}/${result}.values ${project}/expected-values.txt
                  RESULT_VARIABLE differs)
  if(NOT differs EQUAL 0)
    file(READ ${project}/${result}.txt got)
    message(FATAL_ERROR "chain: ${result}.txt differs from the input's values:\n${got}")
  endif()
endforeach()

# The large sample with its four defective records: a batch run converts the
# rest, names each defective record in the log and ends with 3 (converted,
# records left out).
set(big ${WORK_DIR}/big-project)
file(REMOVE_RECURSE ${big})
execute_process(COMMAND /usr/bin/python3 ${SOURCE_DIR}/sample/make-big-sample.py ${big} RESULT_VARIABLE rc)
if(NOT rc EQUAL 0)
  message(FATAL_ERROR "the large sample could not be generated")
endif()
execute_process(COMMAND ${EMULATOR} ${PROGRAM} /batch ${big}
                RESULT_VARIABLE rc OUTPUT_QUIET ERROR_VARIABLE err TIMEOUT 300)
file(READ ${big}/qoconvert.log log)
string(REGEX MATCHALL "Fehlerhafter Satz .bersprungen: Satz [0-9]+: [^\n]*Anfang: [0-9]+" skipped "${log}")
list(LENGTH skipped nskipped)
execute_process(COMMAND sh -c "wc -l < kunden-gross-dos.txt" WORKING_DIRECTORY ${big} OUTPUT_VARIABLE lines)
string(STRIP "${lines}" lines)
if(NOT rc EQUAL 3 OR NOT nskipped EQUAL 4 OR NOT lines EQUAL 119997
   OR NOT log MATCHES "Satz [0-9]+: 11 Felder statt 10 [^\n]*Anfang: 5000;"
   OR NOT log MATCHES "Begrenzer nicht geschlossen [^\n]*Anfang: 120000;"
   OR NOT log MATCHES "H:1001 119996 S.tze konvertiert")
  message(FATAL_ERROR "large sample: exit ${rc}, ${nskipped} skipped, ${lines} lines\n${err}\nlog:\n${log}")
endif()
# The records around a skipped one arrive whole, in code page 850.
execute_process(COMMAND sh -c "grep -a -c -E '^(4999|5001);' kunden-gross-dos.txt; grep -a '^2;' kunden-gross-dos.txt | iconv -f CP850 -t UTF-8"
                WORKING_DIRECTORY ${big} OUTPUT_VARIABLE around)
if(NOT around MATCHES "^2\n2;Wei[^;]+;K[^;]+the;[^;]+bergasse 8;")
  message(FATAL_ERROR "large sample: records around the defects:\n${around}")
endif()

# Cancelled after its first progress message (a driver that runs the module
# as the window does): code 2, and the previous output is still there as it was.
file(WRITE ${big}/kunden-gross-dos.txt "die vorige Ausgabe\n")
file(COPY_FILE ${big}/kunden-gross-dos.txt ${big}/vorher.txt)
execute_process(COMMAND ${EMULATOR} ${CANCEL} ${MODULE} ${big}
                RESULT_VARIABLE rc OUTPUT_VARIABLE out ERROR_VARIABLE err TIMEOUT 300)
execute_process(COMMAND ${CMAKE_COMMAND} -E compare_files ${big}/kunden-gross-dos.txt ${big}/vorher.txt
                RESULT_VARIABLE previous)
file(GLOB leftovers ${big}/qo*.tmp ${big}/*.~tmp)
if(NOT rc EQUAL 2 OR NOT previous EQUAL 0 OR leftovers
   OR NOT out MATCHES "start size 11[0-9]+\r?\nprogress records [1-9]")
  message(FATAL_ERROR "cancelled run: exit ${rc}, output '${previous}', left ${leftovers}\n${out}\n${err}")
endif()
