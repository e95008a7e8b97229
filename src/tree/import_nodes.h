// Import statements, and the names that they import as plain records. The statements derive from CNode and
// not from CStmt.
#pragma once

#include "tree/node.h"

namespace codeloom {

// One imported name.
class CAsName : public CHosted {
  public:
    void Init() {}

    template <class Visitor>
    void References(Visitor&& visit) {
        visit(module_name);
        visit(as_name);
    }

    CTextOrNone module_name;          // as written, with its dots
    nb::object as_name = nb::none();  // normally a text string; none without `as`
};

using CAsNameList = nb::typed<nb::list, CAsName>;

// `import a.b as c, d`
//   child    'import'  name, `name as name`, or a list of such
//   index       0       1
class CImportNamesStmt : public CNode {
  public:
    OPERATIONS_OF(CImportNamesStmt, CNode)
    OPERATION(CAsNameList, GetAsNameList, (), "A new list of CAsName, one for each imported module.");
    END_OPERATIONS

  private:
    static constexpr Py_ssize_t kNamesIndex = 1;
};

// `from .a import b as c, d`
//   child    'from'  ['.' or '...'] ...  [name]  'import'  names
//   child    ...  'import'  '('  names  ')'
//   child    ...  'import'  '*'
// The names are one name, a `name as name`, or a list of such.
class CFromImportStmt : public CNode {
  public:
    OPERATIONS_OF(CFromImportStmt, CNode)
    OPERATION(CTextOrNone, GetFromString, (),
              "The module after `from`, with its dots; None when nothing is between `from` and `import`.");
    OPERATION(bool, GetImportStar, (), "True for `from a import *`.");
    OPERATION(CAsNameList, GetAsNameList, (),
              "A new list of CAsName, one for each imported name; a star is such a name.");
    OPERATION(Py_ssize_t, _GetImportIndex, (), "The index of the child `import`; -1 when there is none.");
    END_OPERATIONS

  private:
    static constexpr Py_ssize_t kModuleIndex = 1;
};

// The index of the first child whose text is `text`; -1 when there is none.
Py_ssize_t _GetMatchingChildToken(const CNode& node, nb::str text);

// One CAsName for each name of a list, or the one of `node` itself when that isn't a list.
CAsNameList _ProcessAsNamesList(CNodeRef node);

// The record of `name as name` or of a name.
CRef<CAsName> _ProcessSingleModuleNameAs(CNodeRef node);

// The texts of all leaves below the nodes, joined with nothing in between.
nb::str _TextForImportName(CNodeList node_list);

// Binds CAsName and the functions.
void BindAsNames(nb::module_& module);

}  // namespace codeloom
