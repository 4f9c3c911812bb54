#include <Cg/Compiler/StateBindings.h>

#include <algorithm>
#include <cctype>
#include <vector>

namespace cg {

namespace {

struct Step {
    std::string name;
    std::string index; ///< empty where there is none
};

/// "light[0].position" as its steps; nothing where the text is something else.
std::vector<Step> stepsOf(const std::string& path) {
    std::vector<Step> steps;
    std::size_t at = 0;
    while (at < path.size()) {
        Step step;
        while (at < path.size() && path[at] != '.' && path[at] != '[')
            step.name += static_cast<char>(std::tolower(static_cast<unsigned char>(path[at++])));
        if (at < path.size() && path[at] == '[') {
            for (++at; at < path.size() && std::isdigit(static_cast<unsigned char>(path[at])) != 0; ++at)
                step.index += path[at];
            if (step.index.empty() || step.index.size() > 3 || at >= path.size() || path[at++] != ']')
                return {};
        }
        if (at < path.size() && path[at++] != '.')
            return {};
        steps.push_back(step);
    }
    return steps;
}

struct Matrix {
    const char* name;
    const char* glsl;
};

constexpr Matrix MATRICES[] = {{"modelview", "gl_ModelViewMatrix"},
                               {"projection", "gl_ProjectionMatrix"},
                               {"mvp", "gl_ModelViewProjectionMatrix"},
                               {"texture", "gl_TextureMatrix"}};

/// GLSL's name for a form of a matrix; null where the step names no form. GLSL's matrices have Cg's rows as
/// rows; ours have them as columns, so each is the other's transposed.
const char* suffixOf(const std::string& form) {
    if (form == "inverse")
        return "InverseTranspose";
    if (form == "transpose")
        return "";
    return form == "invtrans" ? "Inverse" : nullptr;
}

/// The form stands before the matrix, as in glstate.matrix.inverse.mvp, or after it.
StateBinding findMatrix(const std::vector<Step>& steps, const TypeTable& types) {
    std::size_t at = 1;
    const char* suffix = nullptr;
    const auto takeForm = [&] {
        if (!suffix && at < steps.size() && (suffix = suffixOf(steps[at].name)) != nullptr)
            ++at;
    };
    takeForm();
    StateBinding binding;
    for (const Matrix& matrix : MATRICES) {
        if (at >= steps.size() || steps[at].name != matrix.name)
            continue;
        const std::string index = steps[at].index.empty() ? "0" : steps[at].index;
        ++at;
        takeForm();
        binding.form = std::string(matrix.glsl) + (suffix ? suffix : "Transpose");
        if (std::string(matrix.name) == "texture")
            binding.form += "[" + index + "]";
        binding.type = types.matrix(Scalar::FLOAT, 4, 4);
        break;
    }
    if (binding.type && at < steps.size() && steps[at].name == "row" && !steps[at].index.empty() &&
        steps[at].index < "4") {
        binding.form += "[" + steps[at++].index + "]";
        binding.type = types.vector(Scalar::FLOAT, 4);
    }
    return at == steps.size() ? binding : StateBinding{};
}

struct NamedState {
    const char* path; ///< "#" stands for an index
    int size;
    const char* glsl;
};

constexpr NamedState STATES[] = {
    {"material.ambient", 4, "gl_FrontMaterial.ambient"},
    {"material.diffuse", 4, "gl_FrontMaterial.diffuse"},
    {"material.specular", 4, "gl_FrontMaterial.specular"},
    {"material.emission", 4, "gl_FrontMaterial.emission"},
    {"material.shininess", 1, "gl_FrontMaterial.shininess"},
    {"material.front.ambient", 4, "gl_FrontMaterial.ambient"},
    {"material.front.diffuse", 4, "gl_FrontMaterial.diffuse"},
    {"material.front.specular", 4, "gl_FrontMaterial.specular"},
    {"material.front.emission", 4, "gl_FrontMaterial.emission"},
    {"material.front.shininess", 1, "gl_FrontMaterial.shininess"},
    {"material.back.ambient", 4, "gl_BackMaterial.ambient"},
    {"material.back.diffuse", 4, "gl_BackMaterial.diffuse"},
    {"material.back.specular", 4, "gl_BackMaterial.specular"},
    {"material.back.emission", 4, "gl_BackMaterial.emission"},
    {"material.back.shininess", 1, "gl_BackMaterial.shininess"},
    {"light#.ambient", 4, "gl_LightSource[#].ambient"},
    {"light#.diffuse", 4, "gl_LightSource[#].diffuse"},
    {"light#.specular", 4, "gl_LightSource[#].specular"},
    {"light#.position", 4, "gl_LightSource[#].position"},
    {"light#.half", 4, "gl_LightSource[#].halfVector"},
    {"light#.attenuation", 4,
     "vec4(gl_LightSource[#].constantAttenuation, gl_LightSource[#].linearAttenuation, "
     "gl_LightSource[#].quadraticAttenuation, gl_LightSource[#].spotExponent)"},
    {"light#.spot.direction", 4, "vec4(gl_LightSource[#].spotDirection, gl_LightSource[#].spotCosCutoff)"},
    {"lightmodel.ambient", 4, "gl_LightModel.ambient"},
    {"lightmodel.scenecolor", 4, "gl_FrontLightModelProduct.sceneColor"},
    {"lightmodel.front.scenecolor", 4, "gl_FrontLightModelProduct.sceneColor"},
    {"lightmodel.back.scenecolor", 4, "gl_BackLightModelProduct.sceneColor"},
    {"lightprod#.ambient", 4, "gl_FrontLightProduct[#].ambient"},
    {"lightprod#.diffuse", 4, "gl_FrontLightProduct[#].diffuse"},
    {"lightprod#.specular", 4, "gl_FrontLightProduct[#].specular"},
    {"lightprod#.front.ambient", 4, "gl_FrontLightProduct[#].ambient"},
    {"lightprod#.front.diffuse", 4, "gl_FrontLightProduct[#].diffuse"},
    {"lightprod#.front.specular", 4, "gl_FrontLightProduct[#].specular"},
    {"lightprod#.back.ambient", 4, "gl_BackLightProduct[#].ambient"},
    {"lightprod#.back.diffuse", 4, "gl_BackLightProduct[#].diffuse"},
    {"lightprod#.back.specular", 4, "gl_BackLightProduct[#].specular"},
    {"texenv#.color", 4, "gl_TextureEnvColor[#]"},
    {"texgen#.eye.s", 4, "gl_EyePlaneS[#]"},
    {"texgen#.eye.t", 4, "gl_EyePlaneT[#]"},
    {"texgen#.eye.r", 4, "gl_EyePlaneR[#]"},
    {"texgen#.eye.q", 4, "gl_EyePlaneQ[#]"},
    {"texgen#.object.s", 4, "gl_ObjectPlaneS[#]"},
    {"texgen#.object.t", 4, "gl_ObjectPlaneT[#]"},
    {"texgen#.object.r", 4, "gl_ObjectPlaneR[#]"},
    {"texgen#.object.q", 4, "gl_ObjectPlaneQ[#]"},
    {"fog.color", 4, "gl_Fog.color"},
    {"fog.params", 4, "vec4(gl_Fog.density, gl_Fog.start, gl_Fog.end, gl_Fog.scale)"},
    {"clip#.plane", 4, "gl_ClipPlane[#]"},
    {"point.size", 4, "vec4(gl_Point.size, gl_Point.sizeMin, gl_Point.sizeMax, gl_Point.fadeThresholdSize)"},
    {"point.attenuation", 4,
     "vec4(gl_Point.distanceConstantAttenuation, gl_Point.distanceLinearAttenuation, "
     "gl_Point.distanceQuadraticAttenuation, 1.0)"},
    {"depth.range", 4, "vec4(gl_DepthRange.near, gl_DepthRange.far, gl_DepthRange.diff, 1.0)"},
};

} // namespace

StateBinding findState(const std::string& path, const TypeTable& types) {
    const std::vector<Step> steps = stepsOf(path);
    if (!steps.empty() && steps[0].name == "matrix")
        return findMatrix(steps, types);
    std::string pattern;
    std::string index = "0";
    for (const Step& step : steps) {
        pattern += (pattern.empty() ? "" : ".") + step.name;
        const bool isIndexed = step.name == "light" || step.name == "lightprod" || step.name == "texenv" ||
                               step.name == "texgen" || step.name == "clip";
        if (isIndexed)
            pattern += "#";
        if (!step.index.empty())
            index = step.index;
    }
    for (const NamedState& state : STATES) {
        if (pattern != state.path)
            continue;
        StateBinding binding;
        binding.type = types.vector(Scalar::FLOAT, state.size);
        for (const char* c = state.glsl; *c != '\0'; ++c)
            binding.form += *c == '#' ? index : std::string(1, *c);
        return binding;
    }
    return {};
}

std::optional<std::string> stateSemantic(Name semantic) {
    const std::size_t point = semantic.find('.');
    std::string root(semantic.substr(0, point));
    std::transform(root.begin(), root.end(), root.begin(),
                   [](unsigned char c) { return static_cast<char>(std::toupper(c)); });
    if (point == Name::npos || (root != "STATE" && root != "GLSTATE"))
        return std::nullopt;
    return std::string(semantic.substr(point + 1));
}

} // namespace cg
