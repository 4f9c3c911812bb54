#ifndef CG_COMPILER_RESOLVER_FUNCTION_CONTEXT_H
#define CG_COMPILER_RESOLVER_FUNCTION_CONTEXT_H

#include <Cg/Compiler/ScopedNames.h>
#include <Cg/Compiler/TypedTree.h>

#include <cstddef>

namespace cg {

/// What belongs to the function that is being resolved.
struct FunctionContext {
    /// A variable of a `for` after its loop.
    struct LoopVariable {
        Variable* variable;
        TypedStmt* loop;
    };

    /// Where a scope starts: how much is declared around it.
    struct ScopeStart {
        std::size_t variables;
        std::size_t types;
    };

    /// @return the innermost one of that name, or null
    Variable* findVariable(Name name) const;
    const Type* findType(Name name) const;

    bool isInScope(const Variable* variable) const { return variables.hasMeaning(variable->name, variable); }

    ScopeStart scopeStart() const { return {variables.size(), types.size()}; }
    void endScope(ScopeStart start);

    Function* function = nullptr;
    ScopedNames<Variable*> variables;
    ScopedNames<const Type*> types;
    ScopedNames<LoopVariable> pastLoops; ///< of the blocks around
    Variable* self = nullptr;            ///< a method's object
    Variable* declared = nullptr;        ///< the one whose initial value is being resolved
    bool isDeclaredUsed = false;         ///< that value names its own variable
    std::size_t ordinal = 0;             ///< of the function's declaration
    int loops = 0;                       ///< around the statement
    int switches = 0;
    bool hasReturn = false;
};

/// Puts another context in place of the current one for as long as it lives.
class ContextChange {
public:
    ContextChange(FunctionContext& current, FunctionContext inner);
    ~ContextChange();
    ContextChange(const ContextChange&) = delete;
    ContextChange& operator=(const ContextChange&) = delete;

private:
    FunctionContext& mCurrent;
    FunctionContext mOuter;
};

} // namespace cg

#endif
