// CQoFile: a buffered file with the character sets of the record files.
//
// Text files of the family come in Windows-1252 (`ansi`), in DOS code page 850
// (`ascii`) or as a mix of both (`ansimix`). CQoFile converts on the way in
// and out, so that callers always see Windows-1252: open with a mode made of
// the flags below, read lines with `ReadString` or blocks with `Read`, write
// with `Write`, and `Close` (the destructor closes too).
//
//     CQoFile file;
//     if (file.Open("in.txt", CQoFile::read | CQoFile::ascii))
//         for (CQoString line; file.ReadString(line);) ...
//
// Open modes
//   read              open an existing file for reading (Open fails if missing).
//   write             open for writing; without `create` an existing file is kept
//                     and writing appends at its end, a missing file is created.
//   write | begin     as `write`, but positioned at the start, so that writing
//                     overwrites the existing bytes in place.
//   create            create the file, or truncate an existing one; implies write.
//   read | write      both directions on one file (with `create`: a new file).
//   binary            no line-end translation. Without it (text mode) `Write`
//                     turns a lone LF into CR LF and `Read` turns CR LF into LF,
//                     as the C runtime's text mode does. `ReadString` accepts
//                     CR LF and LF in both modes.
//   ansi|ascii|ansimix the character set (default ansi); `FileCharSet(int)`
//                     changes it on an open file.
// `begin`, `current` and `end` are also the origins of `Seek`.
//
// Character sets (conversion applies to the data of Read, ReadString and Write
// in every mode, binary included; with `ansi` the bytes pass untouched):
//   ansi     Windows-1252, no conversion.
//   ascii    DOS code page 850: reading maps bytes 0x80-0xFF to Windows-1252,
//            writing maps them back. A character that the other side lacks
//            becomes its nearest: box drawing becomes + - |, shades #, typographic
//            quotes and dashes their plain forms, letters with a caron or the
//            euro sign their base letter (š -> s, € -> E); anything else '?'.
//   ansimix  files that mix both: reading turns the DOS-850 umlauts and ß
//            (0x84 0x94 0x81 0x8E 0x99 0x9A 0xE1) into their Windows-1252 letters
//            and keeps every other byte; writing writes plain Windows-1252.
//
// Errors: `Open` answers false when the file cannot be opened. Reading and
// writing failures raise CQoException with the file name; `Read` and
// `ReadString` given `throwOnError = false` answer 0 / false instead (also for
// a file that is not open). Positions are 64-bit byte offsets in the file.
#pragma once

#include "QoToolsApi.h"

#include "CQoString.h"

#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <memory>
#include <string>

class QOTOOLS_API CQoFile {
public:
    enum openMode {
        read = 0x0001,
        write = 0x0002,
        create = 0x0004,
        binary = 0x0008,
        ascii = 0x0010,
        ansi = 0x0020,
        ansimix = 0x0040,
        begin = 0x0080,   // open: position at the start; Seek: from the start
        current = 0x0100, // Seek: from the current position
        end = 0x0200      // Seek: from the end of the file
    };

    // The kinds of files and databases that filters deal with. Values are
    // stored in configuration files, so they never change.
    typedef int fileType;
    enum {
        typeUnknown = 0,
        typeExcel = 5,  // an Excel workbook
        typeAccess = 6  // an Access database
    };

    // `bufferBlocks` is the size of the file's buffer in blocks of 64 KiB
    // (at least one; the default gives 1 MiB, enough for fast line reading).
    explicit CQoFile(int bufferBlocks = 16);
    // Opens right away; check IsOpen().
    CQoFile(char const *path, int mode, int bufferBlocks = 16);
    ~CQoFile();

    CQoFile(CQoFile const &) = delete;
    CQoFile &operator=(CQoFile const &) = delete;

    // --- opening and closing -------------------------------------------------
    // Closes a file that is open (as Close does), then opens `path`. False
    // when it cannot be opened (missing for read, no permission, a folder, ...).
    bool Open(char const *path, int mode);
    // As Open, but raises CQoException (fileNotFound or cannotOpen) instead.
    void OpenOrThrow(char const *path, int mode);
    bool IsOpen() const { return m_fp != nullptr; }
    // Writes what is buffered and closes. A failing final write raises
    // CQoException, but the file is closed in any case.
    void Close();

    char const *FileName() const { return m_name.c_str(); }
    int Mode() const { return m_mode; }

    // --- character set -------------------------------------------------------
    int FileCharSet() const { return m_charSet; }
    // `ansi`, `ascii` or `ansimix`; any other value is ignored.
    void FileCharSet(int charSet);

    // Converts bytes of a text in `charSet` (ansi, ascii, ansimix) to
    // Windows-1252 in place, as reading such a file does: for texts that
    // reach the caller by another way than Read (the field names of a
    // dBase header).
    static void ConvertToAnsi(int charSet, char *data, std::size_t count);

    // --- reading -------------------------------------------------------------
    // Reads up to `count` bytes (fewer only at the end of the file); returns
    // the number read, 0 at the end.
    std::size_t Read(void *buffer, std::size_t count, bool throwOnError = true);
    // Reads one line without its line end (CR LF or LF). False at the end of
    // the file; a last line without line end is still returned.
    bool ReadString(CQoString &line, bool throwOnError = true);

    // --- writing -------------------------------------------------------------
    void Write(void const *data, std::size_t count);
    void Write(CQoString const &text);
    // Hands the buffered bytes to the system; with `toDisk` also waits until
    // they are on the disk.
    void Flush(bool toDisk = false);

    // --- position ------------------------------------------------------------
    // `from` is begin, current or end; returns the new position. A position
    // before the start raises CQoException (seekError).
    std::int64_t Seek(std::int64_t offset, int from = begin);
    std::int64_t Tell() const;
    std::int64_t Length();

    // --- files on the disk ---------------------------------------------------
    static bool Exists(char const *path);
    static bool Remove(char const *path);
    // Puts the finished file `source` in the place of `target` in one step:
    // a reader sees the old file or the new one, never none, and an existing
    // target is replaced only when the move succeeds. False on failure, with
    // both files as they were.
    static bool MoveOver(char const *source, char const *target);
    // Creates an empty file of a new, unique name in the folder of `target`
    // (so that MoveOver stays one step on the same disk) and answers its
    // name; empty when none could be created.
    static std::string NewTempFileBeside(char const *target);
    // True when both names reach the same file: their full paths (resolved
    // against the current folder, "." and ".." taken out) are equal, letters
    // compared without case as Windows does.
    static bool SameFile(char const *a, char const *b);

private:
    enum state { idle, reading, writing };

    bool FillBuffer(bool throwOnError);
    // Reads at m_filePos and advances it; `failed` when nothing could be read
    // because of an error.
    std::size_t RawRead(void *buffer, std::size_t count, bool &failed);
    // Moves the system's position to m_filePos before the C library writes.
    void SyncSystemPosition();
    void FlushBuffer();
    void SwitchTo(state wanted);
    void ConvertIn(char *data, std::size_t count) const;
    void CloseQuietly();
    [[noreturn]] void Fail(int code) const;

    std::FILE *m_fp = nullptr;
    std::string m_name;
    int m_mode = 0;
    int m_charSet = ansi;
    std::unique_ptr<char[]> m_buffer;
    std::size_t m_bufferSize;
    std::size_t m_fillSize;        // size of the next refill (see FillBuffer)
    std::size_t m_pos = 0;         // next byte to deliver (reading)
    std::size_t m_end = 0;         // end of valid or pending bytes
    std::int64_t m_filePos = 0;    // file offset after the last byte read or written
    bool m_positioned = false;     // a disk file: reads name their offset
    bool m_systemPosStale = false; // the system's position may differ from m_filePos
    state m_state = idle;
    bool m_lastWasCR = false;      // text mode: last byte written was CR
    bool m_bufferConverted = false; // ReadString converted buffer bytes in place
    std::string m_scratch;         // converted copy for Write
};
