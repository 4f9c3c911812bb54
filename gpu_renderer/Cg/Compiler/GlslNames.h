#ifndef CG_COMPILER_GLSL_NAMES_H
#define CG_COMPILER_GLSL_NAMES_H

#include <string>
#include <string_view>
#include <unordered_map>
#include <unordered_set>
#include <vector>

namespace cg {

/// GLSL gives the word a meaning of its own: keyword, reserved, or a built-in function that we may call.
bool isGlslWord(std::string_view name);

/// The name as GLSL allows it: words of GLSL get an underscore, `gl_` and double underscores go.
std::string legalName(std::string_view name);

/// Gives out the names of a GLSL text, each the source's own where it is free.
class GlslNames {
public:
    /// A name for all of the text.
    std::string global(std::string_view wanted);

    /// A name for the innermost scope, taken neither there nor around it.
    std::string local(std::string_view wanted);

    void openScope() { mScopes.push_back(mLocals.size()); }
    void closeScope();

private:
    bool isTaken(const std::string& name) const { return mTaken.count(name) != 0; }
    std::string distinct(std::string_view wanted);
    void giveBack(const std::string& name);

    std::unordered_set<std::string> mTaken;
    std::unordered_map<std::string, int> mNextNumbers; ///< behind a name: all below are taken
    std::vector<std::string> mLocals;
    std::vector<std::size_t> mScopes;
};

} // namespace cg

#endif
