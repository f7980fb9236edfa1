# What a careless or hostile project must not do to a user's data, and what an
# unattended run must never do: wait. Each case runs the program in batch mode
# (or its module with a cancel) and checks the exit code, the log, and the
# databases and files it touched as the sqlite3 shell reads them.
#
#   cmake -DEMULATOR=... -DPROGRAM=... -DCANCEL=... -DMODULE=... -DSOURCE_DIR=... -DWORK_DIR=... -P SafeRun.cmake
set(p ${WORK_DIR}/safe-project)
file(REMOVE_RECURSE ${p})
file(MAKE_DIRECTORY ${p})
execute_process(COMMAND iconv -f UTF-8 -t CP1252 ${SOURCE_DIR}/sample/kunden.txt.utf8
                OUTPUT_FILE ${p}/kunden.txt RESULT_VARIABLE rc)
if(NOT rc EQUAL 0)
  message(FATAL_ERROR "iconv failed")
endif()
set(failures "")
if(NOT DEFINED RUN_TIMEOUT)
  set(RUN_TIMEOUT 90)
endif()

# Runs the program on the project `ini`; the exit code and the log go to
# `rc_var` and `log_var`.
function(run_batch ini rc_var log_var)
  file(WRITE ${p}/qoconvert.ini "${ini}")
  file(REMOVE ${p}/qoconvert.log)
  execute_process(COMMAND ${EMULATOR} ${PROGRAM} /batch ${p}
                  RESULT_VARIABLE rc OUTPUT_QUIET ERROR_VARIABLE err TIMEOUT ${RUN_TIMEOUT})
  set(log "")
  if(EXISTS ${p}/qoconvert.log)
    file(READ ${p}/qoconvert.log log)
  endif()
  set(${rc_var} "${rc}" PARENT_SCOPE)
  set(${log_var} "${log}\n${err}" PARENT_SCOPE)
endfunction()

# Every table, view and index of an SQLite file with its rows: what must
# stay exactly as it was.
function(dump db out_var)
  execute_process(COMMAND sqlite3 ${db} ".dump" OUTPUT_VARIABLE out RESULT_VARIABLE rc)
  set(${out_var} "${out}" PARENT_SCOPE)
endfunction()

function(fail what detail)
  set(failures "${failures}\n--- ${what}: ${detail}" PARENT_SCOPE)
endfunction()

set(sqlite "ODBC=Driver=SQLite3;Database=ziel.db")

# A database with the user's tables: Kunden (to be replaced) and Opfer
# (nothing may touch it).
file(REMOVE ${p}/ziel.db)
execute_process(COMMAND sqlite3 ${p}/ziel.db
  "create table Kunden (Nr integer, Name varchar(20)); insert into Kunden values (1, 'alt'), (2, 'auch alt');
   create index Kunden1 on Kunden(Nr); create table Opfer (x integer); insert into Opfer values (42);")
dump(${p}/ziel.db before)

# --- Names are names: a table name, an input table and a column name taken
# from the input's first line can neither end a statement nor start one.
run_batch("[Eingabe]\nDatei=kunden.txt\n[Ausgabe]\n${sqlite}\nTabelle=if exists x; drop table Opfer\n" rc log)
execute_process(COMMAND sqlite3 ${p}/ziel.db "select count(*) from Opfer; select count(*) from \"if exists x; drop table Opfer\""
                OUTPUT_VARIABLE counts)
if(NOT rc EQUAL 0 OR NOT counts MATCHES "^1\n3\n")
  fail("table name with a second statement" "exit ${rc}, counts ${counts}\n${log}")
endif()
run_batch("[Eingabe]\n${sqlite}\nTabelle=Opfer; drop table Opfer\n[Ausgabe]\nDatei=raus.txt\n" rc log)
execute_process(COMMAND sqlite3 ${p}/ziel.db "select count(*) from Opfer" OUTPUT_VARIABLE counts)
if(NOT rc EQUAL 1 OR NOT counts MATCHES "^1\n" OR EXISTS ${p}/raus.txt)
  fail("input table name with a second statement" "exit ${rc}, Opfer ${counts}\n${log}")
endif()
file(WRITE ${p}/boese.txt "Nr;\"x\"\" integer); drop table Opfer; --\"\n1;a\n")
run_batch("[Eingabe]\nDatei=boese.txt\n[Ausgabe]\n${sqlite}\nTabelle=Boese\n" rc log)
execute_process(COMMAND sqlite3 ${p}/ziel.db "select count(*) from Opfer; select name from pragma_table_info('Boese')"
                OUTPUT_VARIABLE counts)
if(NOT rc EQUAL 0 OR NOT counts STREQUAL "1\nNr\nx\" integer); drop table Opfer; --\n")
  fail("column name from a crafted first line" "exit ${rc}, ${counts}\n${log}")
endif()
execute_process(COMMAND sqlite3 ${p}/ziel.db "drop table \"if exists x; drop table Opfer\"; drop table Boese")

# --- A table is replaced only by a complete successor: a definition that
# fails at create time (two columns whose names differ only in case) and a
# cancelled run leave the old table exactly as it was, and nothing else.
file(WRITE ${p}/doppelt.txt "Name;NAME\na;b\n")
run_batch("[Eingabe]\nDatei=doppelt.txt\n[Ausgabe]\n${sqlite}\nTabelle=Kunden\n" rc log)
dump(${p}/ziel.db after)
if(NOT rc EQUAL 1 OR NOT after STREQUAL before)
  fail("create fails on the new table" "exit ${rc}\n${log}\nbefore:\n${before}\nafter:\n${after}")
endif()

set(big ${WORK_DIR}/safe-big)
file(REMOVE_RECURSE ${big})
execute_process(COMMAND /usr/bin/python3 ${SOURCE_DIR}/sample/make-big-sample.py ${big} RESULT_VARIABLE rc)
file(COPY_FILE ${p}/ziel.db ${big}/ziel.db)
file(COPY_FILE ${p}/kunden.txt ${big}/kunden.txt)
# A file database with a table Kunden of its own, made by the program.
file(WRITE ${big}/qoconvert.ini "[Eingabe]\nDatei=kunden.txt\n[Ausgabe]\nDatenbank=ziel.mdb\nTabelle=Kunden\n")
execute_process(COMMAND ${EMULATOR} ${PROGRAM} /batch ${big} RESULT_VARIABLE rc OUTPUT_QUIET ERROR_QUIET TIMEOUT 90)
function(cancel_into output db)
  dump(${big}/${db} before_cancel)
  file(WRITE ${big}/qoconvert.ini "[Eingabe]\nDatei=kunden-gross.txt\nZeichensatz=0\n[Ausgabe]\n${output}\nTabelle=Kunden\n")
  file(REMOVE ${big}/qoconvert.log)
  execute_process(COMMAND ${EMULATOR} ${CANCEL} ${MODULE} ${big}
                  RESULT_VARIABLE rc OUTPUT_VARIABLE out ERROR_VARIABLE err TIMEOUT 300)
  dump(${big}/${db} after_cancel)
  file(READ ${big}/qoconvert.log log)
  if(NOT rc EQUAL 2 OR NOT after_cancel STREQUAL before_cancel OR NOT log MATCHES "die Ausgabe ist unver.ndert")
    set(failures "${failures}\n--- cancelled run into ${output}: exit ${rc}\n${out}${err}\n${log}\nbefore:\n${before_cancel}\nafter:\n${after_cancel}"
        PARENT_SCOPE)
  endif()
endfunction()
cancel_into("ODBC=Driver=SQLite3;Database=ziel.db" ziel.db)
cancel_into("Datenbank=ziel.mdb" ziel.mdb)

# --- One table in and out: the input reads the old table while the new one
# fills, and takes its place at the end. A file database cannot be read and
# written at once: refused before anything is touched, without waiting.
run_batch("[Eingabe]\n${sqlite}\nSQL=select * from Kunden\n[Ausgabe]\nODBC=Driver=SQLite3;Database=./ziel.db\nTabelle=KUNDEN\n" rc log)
execute_process(COMMAND sqlite3 ${p}/ziel.db "select Nr, Name from Kunden order by Nr" OUTPUT_VARIABLE rows)
if(NOT rc EQUAL 0 OR NOT rows STREQUAL "1|alt\n2|auch alt\n")
  fail("same SQLite table in and out" "exit ${rc}, rows ${rows}\n${log}")
endif()
run_batch("[Eingabe]\nDatei=kunden.txt\n[Ausgabe]\nDatenbank=kunden.mdb\nTabelle=Kunden\n" rc log)
dump(${p}/kunden.mdb before)
run_batch("[Eingabe]\nDatenbank=kunden.mdb\nTabelle=Kunden\n[Ausgabe]\nDatenbank=Kunden.MDB\nTabelle=[Kunden]\n" rc log)
dump(${p}/kunden.mdb after)
if(NOT rc EQUAL 1 OR NOT after STREQUAL before OR NOT log MATCHES "derselben Datenbankdatei")
  fail("same file database in and out" "exit ${rc}\n${log}")
endif()

# Access's brackets quote a name; they are not part of it.
run_batch("[Eingabe]\nDatei=kunden.txt\n[Ausgabe]\nDatenbank=klammer.mdb\nTabelle=[Kunden]\n" rc log)
run_batch("[Eingabe]\nDatei=kunden.txt\n[Ausgabe]\nDatenbank=klammer.mdb\nTabelle=[Kunden]\n" rc2 log2)
execute_process(COMMAND sqlite3 ${p}/klammer.mdb "select name from sqlite_master where type='table' and name not like 'qo_dao_%'"
                OUTPUT_VARIABLE tables)
if(NOT rc EQUAL 0 OR NOT rc2 EQUAL 0 OR NOT tables STREQUAL "Kunden\n")
  fail("[Kunden] into a file database" "exit ${rc}/${rc2}, tables ${tables}\n${log}${log2}")
endif()

# --- A password-protected file database: an unattended run never asks. The
# project's key gives the password; without it, or with a wrong one, the run
# ends at once with 1 and names the database. (The engine keeps a salted,
# repeated SHA-256 of the password in its own table.)
file(COPY_FILE ${p}/kunden.mdb ${p}/geheim.mdb)
execute_process(COMMAND /usr/bin/python3 -c "
import hashlib, sqlite3, sys
salt, pw = '00112233445566778899aabbccddeeff', b'Sesam'
data = salt.encode() + b'\\n' + pw
for _ in range(2000):
    digest = hashlib.sha256(data).digest()
    data = digest + pw
db = sqlite3.connect(sys.argv[1])
db.execute('insert into qo_dao_password (salt, hash) values (?, ?)', (salt, digest.hex()))
db.commit()
" ${p}/geheim.mdb RESULT_VARIABLE rc)
function(password_case key expected)
  file(REMOVE ${p}/raus.txt)
  run_batch("[Eingabe]\nDatenbank=geheim.mdb\nTabelle=Kunden\n${key}\n[Ausgabe]\nDatei=raus.txt\n" rc log)
  if(NOT rc EQUAL expected OR (expected EQUAL 1 AND NOT log MATCHES "geheim.mdb[^\n]*Passwort"))
    fail("password-protected input, '${key}'" "exit ${rc}\n${log}")
  endif()
  run_batch("[Eingabe]\nDatei=kunden.txt\n[Ausgabe]\nDatenbank=geheim.mdb\nTabelle=Neu\n${key}\n" rc log)
  if(NOT rc EQUAL expected OR (expected EQUAL 1 AND NOT log MATCHES "geheim.mdb[^\n]*Passwort"))
    fail("password-protected output, '${key}'" "exit ${rc}\n${log}")
  endif()
  set(failures "${failures}" PARENT_SCOPE)
endfunction()
password_case("" 1)
password_case("Passwort=falsch" 1)
password_case("Passwort=Sesam" 0)

# --- What a project can name is refused with a message, never an assertion
# (whose exit code 3 would read as "converted, records left out").
file(MAKE_DIRECTORY ${p}/ordner)
file(WRITE ${p}/kaputt.mdb "keine Datenbank")
string(REPEAT "a" 250 long)
foreach(case "[Ausgabe]\nDatenbank=fehlt/x.mdb\nTabelle=T|fehlt"
             "[Ausgabe]\nDatenbank=ordner\nTabelle=T|ordner"
             "[Ausgabe]\nDatenbank=NUL\nTabelle=T|NUL"
             "[Ausgabe]\nDatenbank=\\\\server\\freigabe\\x.mdb\nTabelle=T|server"
             "[Ausgabe]\nDatenbank=${long}/x.mdb\nTabelle=T|aaaa"
             "[Ausgabe]\nDatenbank=kaputt.mdb\nTabelle=T|kaputt.mdb")
  string(REPLACE "|" ";" parts "${case}")
  list(GET parts 0 output)
  list(GET parts 1 expect)
  string(REPLACE "\\n" "\n" output "${output}")
  run_batch("[Eingabe]\nDatei=kunden.txt\n${output}\n" rc log)
  if(NOT rc EQUAL 1 OR NOT log MATCHES "E:2[0-9]+ [^\n]*${expect}")
    fail("file database output '${output}'" "exit ${rc}\n${log}")
  endif()
endforeach()
file(READ ${p}/kaputt.mdb content)
if(NOT content STREQUAL "keine Datenbank")
  fail("a file that is no database" "was changed: ${content}")
endif()
# Three blanks, as an earlier version of the program wrote them.
run_batch("[Eingabe]\n${sqlite}\nSQL=\\s \\s\n[Ausgabe]\nDatei=raus.txt\n" rc log)
if(NOT rc EQUAL 1 OR NOT log MATCHES "fehlt die Tabelle")
  fail("a statement of blanks" "exit ${rc}\n${log}")
endif()
run_batch("[Eingabe]\nDatenbank=kaputt.mdb\nTabelle=T\n[Ausgabe]\nDatei=raus.txt\n" rc log)
if(NOT rc EQUAL 1 OR NOT log MATCHES "kaputt.mdb[^\n]*: [^\n]*[a-z]")
  fail("the reason a file database cannot be read" "exit ${rc}\n${log}")
endif()

# --- A server's database name is no file: PostgreSQL without a DSN.
if(DEFINED ENV{QO_PG_CONNECT})
  run_batch("[Eingabe]\nDatei=kunden.txt\n[Ausgabe]\nODBC=$ENV{QO_PG_CONNECT}\nTabelle=safe_kunden\n" rc log)
  if(NOT rc EQUAL 0)
    fail("PostgreSQL connect string with Database=" "exit ${rc}\n${log}")
  endif()
endif()

# --- Read-only targets are refused as Windows refuses them.
file(WRITE ${p}/schreibgeschuetzt.txt "bleibt\n")
# Wine shows a file without write permission as read-only.
execute_process(COMMAND chmod a-w ${p}/schreibgeschuetzt.txt)
run_batch("[Eingabe]\nDatei=kunden.txt\n[Ausgabe]\nDatei=schreibgeschuetzt.txt\n" rc log)
file(READ ${p}/schreibgeschuetzt.txt content)
if(NOT rc EQUAL 1 OR NOT content STREQUAL "bleibt\n" OR NOT log MATCHES "schreibgeschuetzt.txt")
  fail("read-only output file" "exit ${rc}, content ${content}\n${log}")
endif()

# --- Hand-written projects: a Windows path reads as written, CR line ends
# are line ends (in the project and in the data), and a composed column
# that reads an input column the file does not have is named in the log.
file(MAKE_DIRECTORY ${p}/daten)
file(COPY_FILE ${p}/kunden.txt ${p}/daten/sicherung.txt)
run_batch("[Eingabe]\r Datei=daten\\sicherung.txt\r[Ausgabe]\rDatei=daten\\tabelle.txt\r" rc log)
if(NOT rc EQUAL 0 OR NOT EXISTS ${p}/daten/tabelle.txt)
  fail("hand-written paths, CR line ends" "exit ${rc}\n${log}")
endif()
execute_process(COMMAND sh -c "tr -d '\\r' < kunden.txt | tr '\\n' '\\r' > kunden-cr.txt" WORKING_DIRECTORY ${p})
run_batch("[Eingabe]\nDatei=kunden-cr.txt\n[Ausgabe]\nDatei=raus.txt\n" rc log)
if(NOT rc EQUAL 0 OR NOT log MATCHES "H:1001 4 S.tze")
  fail("a data file with CR line ends" "exit ${rc}\n${log}")
endif()
string(CONCAT ini "[Eingabe]\nDatei=kunden.txt\n[Ausgabe]\nDatei=raus.txt\n[Spalten]\nMultiColumnType=1\nInnerColumns=2\n"
       "Inner0Id=1\nInner0Function=1\nInner0Name=Nr\nInner0Source=0\n"
       "Inner1Id=2\nInner1Function=2\nInner1Name=Fax\nInner1Source=9\n"
       "OuterColumns=2\nOuter0Id=0\nOuter0Name=Nr\nOuter1Id=1\nOuter1Name=Fax\n"
       "Assignments=2\nAssign0Outer=0\nAssign0Inner=1\nAssign1Outer=1\nAssign1Inner=2\n")
run_batch("${ini}" rc log)
if(NOT rc EQUAL 0 OR NOT log MATCHES "W: Die Ausgabespalte 'Fax' liest 'Fax' aus der Eingabespalte 10")
  fail("a composed column of a missing input column" "exit ${rc}\n${log}")
endif()

if(failures)
  message(FATAL_ERROR "${failures}")
endif()
