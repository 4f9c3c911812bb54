#ifndef CG_COMPILER_STATE_BINDINGS_H
#define CG_COMPILER_STATE_BINDINGS_H

#include <Cg/Compiler/Types.h>

#include <optional>
#include <string>

namespace cg {

/// A piece of OpenGL's own state in GLSL.
struct StateBinding {
    const Type* type = nullptr; ///< null: there is no such state
    std::string form;           ///< GLSL text; a matrix with its rows as columns, as all of ours
};

/// @param path  what is written after `glstate.` or `state.`: "matrix.mvp", "light[0].position",
///              "matrix.transpose.modelview[0]", "matrix.mvp.row[2]"
StateBinding findState(const std::string& path, const TypeTable& types);

/// @return the path in a semantic that names a piece of state, `STATE.MATRIX.MVP` or
///         `glstate.fog.color`, in any case of letters; nothing for other semantics
std::optional<std::string> stateSemantic(Name semantic);

} // namespace cg

#endif
