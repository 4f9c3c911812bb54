#ifndef CG_COMPILER_REFERENCES_H
#define CG_COMPILER_REFERENCES_H

#include <Cg/Compiler/TypedTree.h>

#include <functional>
#include <set>
#include <string>
#include <unordered_map>

namespace cg {

/// Which uniforms, globals and members of them the program uses.
class References {
public:
    explicit References(const TypedProgram& program);

    bool uses(const Variable* variable) const { return mPaths.count(variable) != 0; }

    /// @param path  members by name, elements not told apart: ".taps.weight"
    bool uses(const Variable* variable, const std::string& path) const;

private:
    void visit(const TypedStmt* stmt);
    void visit(const TypedExpr* expression);
    void note(const Variable* variable, const std::string& path);

    std::unordered_map<const Variable*, std::set<std::string, std::less<>>> mPaths;
};

} // namespace cg

#endif
