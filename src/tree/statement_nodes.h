// Statements and their parts, by topic.
#pragma once

#include "tree/compound_statement_nodes.h"
#include "tree/definition_nodes.h"
#include "tree/pattern_nodes.h"
#include "tree/simple_statement_nodes.h"
