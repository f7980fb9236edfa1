// Table and column names on their way into SQL.
//
// The database filters put the names a host gives them into SQL text as they
// are, so that a host may qualify or quote them in its driver's own way. What
// they refuse is a name that would be more than a name: a second statement, a
// comment, a quote left open. QoCheckSqlName says whether a name is one (or
// several, qualified by '.') plain or quoted identifiers and nothing else;
// QoQuoteSqlName quotes any text as one identifier for the connected driver
// (CDatabase::GetIdentifierQuote), so that a host can take names from a file
// header or a user and hand them over safely:
//
//     CQoString problem;
//     if (!QoCheckSqlName(name, problem)) refuse("Der Name " + name + " " + problem);
//     out.ColumnName(c, QoQuoteSqlName(header, out.GetDatabase().GetIdentifierQuote()));
#pragma once

#include <CQoString.h>

#include "QoMfcExtApi.h"

// True when `name` goes into SQL as a name and nothing else: parts separated
// by '.', each a quoted identifier ("..." with "" inside, [...] with ]]
// inside, `...` with `` inside) or a plain word (letters, digits, '_', '$',
// '#', '@', bytes from 0x80 on), with no control character anywhere.
// Otherwise false, and `problem` says what is wrong, in German, as the end of
// a sentence that starts with the name ("enthält ein Steuerzeichen").
QOMFCEXT_API bool QoCheckSqlName(const CQoString& name, CQoString& problem);

// `name` as one identifier in the driver's quote, embedded quotes doubled
// ("[" closes with "]"); an empty quote (the driver quotes nothing) leaves
// the name as it is.
QOMFCEXT_API CQoString QoQuoteSqlName(const CQoString& name, const char* quote);

// Internal: where the last part of a name that QoCheckSqlName accepts begins
// ("s.T" -> 2, "\"a.b\"" -> 0), so that a table beside it or an index of it
// can be named in the same schema.
int QoSqlNameLastPart(const CQoString& name);

// Internal: the table a run fills before it takes its target's place,
// "qo_neu_" and 8 hex digits of a hash of `key` (the target's name as the
// database tells names apart), so that every run on one target uses the same
// name and the next run finds and removes what a killed one left.
CQoString QoRunTableName(const CQoString& key);
