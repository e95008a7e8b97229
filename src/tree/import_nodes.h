// Import statements. They derive from CNode and not from CStmt.
#pragma once

#include "tree/node.h"

namespace codeloom {

// `import a.b as c, d`
class CImportNamesStmt : public CNode {};

// `from a import b as c, d`
class CFromImportStmt : public CNode {};

}  // namespace codeloom
