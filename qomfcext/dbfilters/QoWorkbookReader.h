// The library's workbook reader for the file-database engine (internal):
// Excel workbooks (.xlsx) read by qotools' CQoXlsxReader, handed to the
// engine, which shows each sheet as a table ("Tabelle1$").
#pragma once

// Registers the reader with the engine; calling it again changes nothing.
void QoRegisterWorkbookReader();
