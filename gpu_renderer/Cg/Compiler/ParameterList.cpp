#include <Cg/Compiler/ParameterList.h>

#include <Cg/Compiler/ConstantFolding.h>
#include <Cg/Compiler/GlslSymbols.h>
#include <Cg/Compiler/References.h>

#include <cctype>
#include <cstdlib>
#include <optional>
#include <string>

namespace cg {

namespace {

/// Elements of arrays of structs of arrays of ...: no host asks for so many by name.
constexpr std::size_t MAX_PARAMETERS = 65536;

ScalarKind kindOf(Scalar scalar) {
    switch (scalar) {
    case Scalar::HALF:
        return ScalarKind::HALF;
    case Scalar::FIXED:
        return ScalarKind::FIXED;
    case Scalar::INT:
    case Scalar::UINT:
        return ScalarKind::INT;
    case Scalar::BOOL:
        return ScalarKind::BOOL;
    case Scalar::FLOAT:
        break;
    }
    return ScalarKind::FLOAT;
}

SamplerKind kindOf(Sampler sampler) {
    switch (sampler) {
    case Sampler::D1:
    case Sampler::D1_SHADOW:
        return SamplerKind::SAMPLER_1D;
    case Sampler::D3:
        return SamplerKind::SAMPLER_3D;
    case Sampler::RECT:
    case Sampler::RECT_SHADOW:
        return SamplerKind::SAMPLER_RECT;
    case Sampler::CUBE:
    case Sampler::CUBE_SHADOW:
        return SamplerKind::SAMPLER_CUBE;
    case Sampler::D1_ARRAY:
        return SamplerKind::SAMPLER_1D_ARRAY;
    case Sampler::D2_ARRAY:
    case Sampler::D2_ARRAY_SHADOW:
        return SamplerKind::SAMPLER_2D_ARRAY;
    default:
        return SamplerKind::SAMPLER_2D;
    }
}

/// n of TEXUNITn, in any case of letters; -1 for any other semantic.
int textureUnit(const std::string& semantic) {
    const std::string prefix = "TEXUNIT";
    if (semantic.size() <= prefix.size() || semantic.size() > prefix.size() + 3)
        return -1;
    for (std::size_t i = 0; i < semantic.size(); ++i) {
        const auto c = static_cast<unsigned char>(semantic[i]);
        if (i < prefix.size() ? std::toupper(c) != prefix[i] : std::isdigit(c) == 0)
            return -1;
    }
    return std::atoi(semantic.c_str() + prefix.size());
}

/// Where in a variable a parameter stands.
struct Place {
    const Variable* variable;
    std::string memberPath; ///< ".taps.weight": elements not told apart
    std::string glslName;   ///< empty where the variable is no uniform of the GLSL text
    int samplerIndex = 0;   ///< position in the flat array that holds such samplers
    int flatIndex = 0;      ///< position in the flat array that holds arrays of arrays
    bool isInArray = false; ///< the samplers are in an array
};

class ParameterLister {
public:
    ParameterLister(const References& references, GlslSymbols& symbols)
        : mReferences(references), mSymbols(symbols) {}

    Parameter list(const TypedParameter& source) {
        Parameter parameter;
        parameter.name = std::string(source.name);
        parameter.semantic = std::string(source.semantic);
        parameter.direction = source.direction == Direction::OUT     ? ParameterDirection::OUT
                              : source.direction == Direction::INOUT ? ParameterDirection::INOUT
                                                                     : ParameterDirection::IN;
        parameter.variability =
            source.isUniform ? ParameterVariability::UNIFORM : ParameterVariability::VARYING;
        parameter.isGlobal = source.isGlobal;
        mDefaults.reset();
        mNextDefault = 0;
        if (source.isUniform && source.variable->initializer)
            mDefaults = constantValue(source.variable->initializer);
        Place place;
        place.variable = source.variable;
        if (source.isUniform && !source.variable->state)
            place.glslName = mSymbols.uniformName(source.variable);
        if (source.isUniform && source.variable->state)
            parameter.stateBinding = parameter.semantic;
        const Type* type = source.isUniform ? source.variable->type : source.type;
        describe(parameter, type, place);
        return parameter;
    }

private:
    void describe(Parameter& parameter, const Type* type, const Place& place) {
        parameter.isReferenced = mReferences.uses(place.variable, place.memberPath);
        ++mCount;
        switch (type->kind) {
        case Type::Kind::STRUCT:
            describeStruct(parameter, type, place);
            break;
        case Type::Kind::ARRAY:
            describeArray(parameter, type, place);
            break;
        case Type::Kind::SAMPLER:
            describeSampler(parameter, type, place);
            break;
        default:
            describeNumber(parameter, type, place);
            break;
        }
    }

    void describeNumber(Parameter& parameter, const Type* type, const Place& place) {
        parameter.parameterClass = type->isMatrix()   ? ParameterClass::MATRIX
                                   : type->isVector() ? ParameterClass::VECTOR
                                                      : ParameterClass::SCALAR;
        parameter.scalarKind = kindOf(type->scalar);
        parameter.rows = type->rows;
        parameter.columns = type->columns;
        if (parameter.variability != ParameterVariability::UNIFORM)
            return;
        if (parameter.isReferenced)
            parameter.glslName = place.glslName;
        const auto count = static_cast<std::size_t>(type->components());
        if (mDefaults && mNextDefault + count <= mDefaults->size())
            for (std::size_t i = 0; i < count; ++i)
                parameter.defaults.push_back(static_cast<float>((*mDefaults)[mNextDefault + i]));
        mNextDefault += count;
    }

    void describeSampler(Parameter& parameter, const Type* type, const Place& place) {
        parameter.parameterClass = ParameterClass::SAMPLER;
        parameter.samplerKind = kindOf(type->sampler);
        parameter.textureUnit = textureUnit(parameter.semantic);
        parameter.variability = ParameterVariability::UNIFORM; // also within a varying struct
        if (place.memberPath.empty()) {
            parameter.glslName = place.glslName;
            return;
        }
        const auto piece = place.variable->samplers.find(place.memberPath);
        if (piece == place.variable->samplers.end())
            return;
        parameter.glslName = mSymbols.uniformName(piece->second);
        if (place.isInArray && !parameter.glslName.empty())
            parameter.glslName += "[" + std::to_string(place.samplerIndex) + "]";
    }

    void describeStruct(Parameter& parameter, const Type* type, const Place& place) {
        const StructType* structure = type->structure;
        parameter.parameterClass = ParameterClass::STRUCT;
        parameter.structName = std::string(structure->name);
        for (std::size_t i = 0; i < structure->fields.size() && mCount < MAX_PARAMETERS; ++i) {
            const Field& field = structure->fields[i];
            Parameter member = derived(parameter, parameter.name + "." + std::string(field.name));
            member.semantic = std::string(field.declaration->semantic.name);
            Place memberPlace = place;
            memberPlace.memberPath += "." + std::string(field.name);
            if (!place.glslName.empty() && !isOpaque(field.type))
                memberPlace.glslName += "." + mSymbols.memberName(structure, i);
            describe(member, field.type, memberPlace);
            parameter.children.push_back(std::move(member));
        }
    }

    void describeArray(Parameter& parameter, const Type* type, const Place& place) {
        parameter.parameterClass = ParameterClass::ARRAY;
        const Type* element = type->element;
        for (int i = 0; i < type->length && mCount < MAX_PARAMETERS; ++i) {
            Parameter child = derived(parameter, parameter.name + "[" + std::to_string(i) + "]");
            child.semantic = parameter.semantic;
            Place childPlace = place;
            childPlace.isInArray = true;
            childPlace.samplerIndex = place.samplerIndex * type->length + i;
            // Arrays of arrays are flat in GLSL.
            childPlace.flatIndex = place.flatIndex * type->length + i;
            if (!element->isArray()) {
                if (!place.glslName.empty())
                    childPlace.glslName += "[" + std::to_string(childPlace.flatIndex) + "]";
                childPlace.flatIndex = 0;
            }
            describe(child, element, childPlace);
            parameter.children.push_back(std::move(child));
        }
        const bool hasWholeName = !element->isArray() && !element->isStruct() && place.flatIndex == 0;
        if (hasWholeName && !parameter.children.empty())
            parameter.glslName = wholeName(parameter.children[0].glslName);
    }

    /// `gains[0]` is one of `gains`.
    static std::string wholeName(const std::string& element) {
        const std::size_t bracket = element.rfind("[0]");
        const bool isLast = bracket != std::string::npos && bracket + 3 == element.size();
        return isLast ? element.substr(0, bracket) : element;
    }

    static Parameter derived(const Parameter& parent, std::string name) {
        Parameter child;
        child.name = std::move(name);
        child.direction = parent.direction;
        child.variability = parent.variability;
        child.isGlobal = parent.isGlobal;
        return child;
    }

    const References& mReferences;
    GlslSymbols& mSymbols;
    std::optional<std::vector<double>> mDefaults;
    std::size_t mNextDefault = 0;
    std::size_t mCount = 0;
};

} // namespace

std::vector<Parameter> listParameters(const TypedProgram& program, const References& references,
                                      GlslSymbols& symbols) {
    ParameterLister lister(references, symbols);
    std::vector<Parameter> parameters;
    for (const TypedParameter& source : program.parameters)
        parameters.push_back(lister.list(source));
    return parameters;
}

} // namespace cg
