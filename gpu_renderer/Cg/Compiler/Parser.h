#ifndef CG_COMPILER_PARSER_H
#define CG_COMPILER_PARSER_H

#include <Cg/Compiler/SyntaxTree.h>
#include <Cg/Compiler/Token.h>

#include <vector>

namespace cg {

class Diagnostics;

/// Builds the syntax tree of a program.
///
/// After an error it goes on with the next statement, member or declaration, so several errors come at once;
/// the tree then holds what was understood. Nesting is bounded (see the source), so the tree can be walked by
/// recursion.
///
/// @param tokens  a whole program as preprocess() gives it, with END as the last; outlives the tree's names
/// @param arena   owns the tree
/// @return never null
TranslationUnit* parse(const std::vector<Token>& tokens, Arena& arena, Diagnostics& diagnostics);

} // namespace cg

#endif
