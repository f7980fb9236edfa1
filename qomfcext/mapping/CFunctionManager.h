// CFunctionManager - the registry of the field functions of a project.
//
// A function ("Funktionalität") is the meaning a user gives to a column, such
// as a name or a postcode. Every function has a numeric id from one of the id
// ranges below; a combination function is composed of other functions, each
// part preceded by its separator text. The manager keeps the functions sorted
// by id and remembers deleted ones by name, so that a function deleted and
// defined again under the same name gets its old id back and stored column
// assignments stay valid.
//
// Use:
//   1. Construct it, set the id ranges if the defaults do not suit, and add the
//      application's functions (AddFunction); then set the next ids.
//   2. Hand copies to the editing dialogs and assign a confirmed copy back.
//   3. Read the functions by index (ascending id) or by id.
//
// The manager computes no combination values and reads or writes no
// configuration: loading, storing and joining values belong to the host.
#pragma once

#include <afx.h>

#include <map>
#include <vector>

#include "QoMfcExtApi.h"

class QOMFCEXT_API CFunctionManager
{
public:
    // One component of a combination: the function whose value is taken, and
    // the separator written before it - only before a non-empty value, or
    // always when the always-separate flag is set.
    class CCombiPart
    {
    public:
        CCombiPart(long functionId, const CString& separator, bool alwaysSeparate)
            : m_lFunctionId(functionId), m_strSeparator(separator), m_bAlwaysSeparate(alwaysSeparate)
        {
        }

        long GetFunctionId() const { return m_lFunctionId; }
        void SetFunctionId(long id) { m_lFunctionId = id; }
        CString GetSeparator() const { return m_strSeparator; }
        void SetSeparator(const CString& separator) { m_strSeparator = separator; }
        bool GetAlwaysSeparate() const { return m_bAlwaysSeparate; }
        void SetAlwaysSeparate(bool on) { m_bAlwaysSeparate = on; }

    private:
        long m_lFunctionId;
        CString m_strSeparator;   // the first part of a combination carries none
        bool m_bAlwaysSeparate;
    };

    // One function, held by value. A plain function has no combination parts.
    class CFunction
    {
    public:
        CFunction(long id, const CString& name) : m_lId(id), m_strName(name) {}

        long GetId() const { return m_lId; }
        void SetId(long id) { m_lId = id; }
        CString GetName() const { return m_strName; }
        void SetName(const CString& name) { m_strName = name; }
        std::vector<CCombiPart> GetCombination() const { return m_combination; }
        void SetCombination(const std::vector<CCombiPart>& parts) { m_combination = parts; }

    private:
        long m_lId;
        CString m_strName;
        std::vector<CCombiPart> m_combination;
    };

    // Puts a function list into the application's display order. The manager
    // never calls it; the pages that show function lists do.
    class CSorter
    {
    public:
        virtual void Sort(std::vector<CFunction>& functions) = 0;
        virtual ~CSorter() {}
    };

    // The kind of an id, by the range it lies in.
    enum type
    {
        noType = 0,         // in no range, below the file range
        predefinedType = 1, // defined by the application
        userdefinedType = 2,
        combiType = 3,
        fileType = 4        // at or above the min unused file id
    };

    // The function id stored for a column that has no function.
    static const long unusedFunction;

    CFunctionManager();
    CFunctionManager(const CFunctionManager&) = default;
    CFunctionManager& operator=(const CFunctionManager&) = default;
    virtual ~CFunctionManager();

    // --- the functions ---------------------------------------------------
    int GetNumFunctions() const;
    // The function at `index` in ascending id order; false (and `function`
    // untouched) for an index outside the list.
    bool GetFunctionAt(int index, CFunction& function) const;
    // The function with that id; false (and `function` untouched) if none.
    bool GetFunction(long id, CFunction& function) const;
    // Stores the function, replacing one with the same id. A function whose
    // name (ignoring case) was deleted before takes the deleted function's id
    // back when both ids are of the same kind; `function` then carries it.
    void AddFunction(CFunction& function);
    // Removes the function and remembers it as deleted under its name.
    void DeleteFunction(long id);
    // Removes every function; the memory of deleted names stays.
    void ClearFunctions();

    // Whether a function of that name exists, compared by the user's locale
    // without regard to case.
    bool ExistsFunction(const CString& name) const;
    // Whether any combination uses the function `id` as a part.
    bool ExistsCombiWithId(long id) const;
    // Whether a function of that name was deleted and not added again.
    bool IsDeleted(CString name) const;

    type Id2Type(long id) const;

    // --- id ranges (bounds inclusive) ------------------------------------
    long GetMinPredefinedId() const { return m_lMinPredefinedId; }
    void SetMinPredefinedId(long id) { m_lMinPredefinedId = id; }
    long GetMaxPredefinedId() const { return m_lMaxPredefinedId; }
    void SetMaxPredefinedId(long id) { m_lMaxPredefinedId = id; }
    void SetNextPredefinedId(long id) { m_lNextPredefinedId = id; }

    long GetMinUserdefinedId() const { return m_lMinUserdefinedId; }
    void SetMinUserdefinedId(long id) { m_lMinUserdefinedId = id; }
    long GetMaxUserdefinedId() const { return m_lMaxUserdefinedId; }
    void SetMaxUserdefinedId(long id) { m_lMaxUserdefinedId = id; }
    void SetNextUserdefinedId(long id) { m_lNextUserdefinedId = id; }

    long GetMinCombiId() const { return m_lMinCombiId; }
    void SetMinCombiId(long id) { m_lMinCombiId = id; }
    long GetMaxCombiId() const { return m_lMaxCombiId; }
    void SetMaxCombiId(long id) { m_lMaxCombiId = id; }
    void SetNextCombiId(long id) { m_lNextCombiId = id; }

    long GetMinUnusedFileId() const { return m_lMinUnusedFileId; }
    void SetMinUnusedFileId(long id) { m_lMinUnusedFileId = id; }

    // The next ids. The predefined one is always taken; the others only when
    // `take` is true (false peeks). None is checked against its range or the
    // ids in use: the host sets the next ids after loading its functions.
    long GetNextPredefinedId();
    long GetNextUserdefinedId(bool take);
    long GetNextCombiId(bool take);

private:
    void RebuildList();

    std::map<long, CFunction> m_functions;
    std::map<CString, CFunction> m_deleted;   // by lower-cased name
    std::vector<CFunction> m_list;            // m_functions' values, ascending id

    long m_lMinPredefinedId;
    long m_lMaxPredefinedId;
    long m_lNextPredefinedId;
    long m_lMinUserdefinedId;
    long m_lMaxUserdefinedId;
    long m_lNextUserdefinedId;
    long m_lMinCombiId;
    long m_lMaxCombiId;
    long m_lNextCombiId;
    long m_lMinUnusedFileId;
};
