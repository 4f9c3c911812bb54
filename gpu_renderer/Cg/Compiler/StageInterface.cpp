#include <Cg/Compiler/StageInterface.h>

#include <algorithm>
#include <cctype>
#include <set>

namespace cg {

namespace {

constexpr int TEXTURE_COORDINATES = 8;
constexpr int ATTRIBUTES = 16;

/// Locations of varyings, of which common drivers have 31: texture coordinates from the ninth on, those
/// below, and VaryingPlaces.
constexpr int FIRST_NAMED_LOCATION = TEXTURE_COORDINATES;
constexpr int FIRST_PLACE_LOCATION = FIRST_NAMED_LOCATION + 3;
constexpr int NO_LOCATION = -1;

/// A semantic and its number: TEXCOORD, 3.
struct NumberedSemantic {
    std::string name;
    int number = 0;
};

NumberedSemantic split(const std::string& text) {
    std::size_t digits = text.size();
    while (digits > 0 && std::isdigit(static_cast<unsigned char>(text[digits - 1])) != 0)
        --digits;
    const std::string number = text.substr(digits);
    return {text.substr(0, digits), number.empty() || number.size() > 4 ? 0 : std::stoi(number)};
}

bool isOneOf(const std::string& name, std::initializer_list<const char*> names) {
    return std::any_of(names.begin(), names.end(), [&](const char* other) { return name == other; });
}

bool isPosition(const std::string& name) {
    return isOneOf(name, {"POSITION", "HPOS", "SV_POSITION", "POSITIONT"});
}

bool isColour(const std::string& name) {
    return isOneOf(name, {"COLOR", "COL", "DIFFUSE", "SPECULAR"});
}

int colourNumber(const NumberedSemantic& semantic) {
    return semantic.name == "SPECULAR" ? 1 : semantic.number;
}

bool isTextureCoordinate(const NumberedSemantic& semantic) {
    return isOneOf(semantic.name, {"TEXCOORD", "TEX", "TEXC"}) && semantic.number < TEXTURE_COORDINATES;
}

StageSlot vertexAttribute(int number) {
    switch (number) {
    case 0:
        return {"gl_Vertex", 4, false, ""};
    case 2:
        return {"gl_Normal", 3, false, ""};
    case 3:
        return {"gl_Color", 4, false, ""};
    case 4:
        return {"gl_SecondaryColor", 4, false, ""};
    case 5:
        return {"gl_FogCoord", 1, false, ""};
    default:
        if (number >= 8 && number < 16)
            return {"gl_MultiTexCoord" + std::to_string(number - 8), 4, false, ""};
        return {};
    }
}

StageSlot vertexInput(const NumberedSemantic& semantic) {
    const std::string& name = semantic.name;
    if (isPosition(name) && semantic.number == 0)
        return vertexAttribute(0);
    if (name == "ATTR")
        return vertexAttribute(semantic.number);
    if (name == "NORMAL" && semantic.number == 0)
        return vertexAttribute(2);
    if (isColour(name) && colourNumber(semantic) < 2)
        return vertexAttribute(3 + colourNumber(semantic));
    if (isOneOf(name, {"FOGCOORD", "FOG", "FOGC", "TESSFACTOR"}))
        return vertexAttribute(5);
    if (isTextureCoordinate(semantic))
        return vertexAttribute(8 + semantic.number);
    if (name == "TANGENT" && semantic.number == 0)
        return vertexAttribute(14);
    if (isOneOf(name, {"BINORMAL", "BITANGENT"}) && semantic.number == 0)
        return vertexAttribute(15);
    if (isOneOf(name, {"VERTEXID", "SV_VERTEXID"}))
        return {"gl_VertexID", 1, true, ""};
    if (isOneOf(name, {"INSTANCEID", "SV_INSTANCEID"}))
        return {"gl_InstanceID", 1, true, ""};
    return {};
}

StageSlot vertexOutput(const NumberedSemantic& semantic) {
    const std::string& name = semantic.name;
    if (isPosition(name) && semantic.number == 0)
        return {"gl_Position", 4, false, ""};
    if (isColour(name) && colourNumber(semantic) < 2)
        return colourNumber(semantic) == 0
                   ? StageSlot{"gl_FrontColor", 4, false, "gl_BackColor"}
                   : StageSlot{"gl_FrontSecondaryColor", 4, false, "gl_BackSecondaryColor"};
    if (isOneOf(name, {"BCOL", "BCOLOR"}) && semantic.number < 2)
        return {semantic.number == 0 ? "gl_BackColor" : "gl_BackSecondaryColor", 4, false, ""};
    if (isTextureCoordinate(semantic))
        return {"gl_TexCoord[" + std::to_string(semantic.number) + "]", 4, false, ""};
    if (isOneOf(name, {"FOG", "FOGC", "FOGCOORD"}))
        return {"gl_FogFragCoord", 1, false, ""};
    if (isOneOf(name, {"PSIZE", "PSIZ", "POINTSIZE"}))
        return {"gl_PointSize", 1, false, ""};
    if (name == "CLP" && semantic.number < 6)
        return {"gl_ClipDistance[" + std::to_string(semantic.number) + "]", 1, false, ""};
    return {};
}

StageSlot fragmentInput(const NumberedSemantic& semantic) {
    const std::string& name = semantic.name;
    if (isPosition(name) || isOneOf(name, {"WPOS", "VPOS"}))
        return {"gl_FragCoord", 4, false, ""};
    if (isColour(name) && colourNumber(semantic) < 2)
        return {colourNumber(semantic) == 0 ? "gl_Color" : "gl_SecondaryColor", 4, false, ""};
    if (isTextureCoordinate(semantic))
        return {"gl_TexCoord[" + std::to_string(semantic.number) + "]", 4, false, ""};
    if (isOneOf(name, {"FOG", "FOGC", "FOGCOORD"}))
        return {"gl_FogFragCoord", 1, false, ""};
    if (isOneOf(name, {"FACE", "VFACE"}))
        return {"(gl_FrontFacing ? 1.0 : -1.0)", 1, false, ""};
    if (isOneOf(name, {"POINTCOORD", "SPRITECOORD"}))
        return {"gl_PointCoord", 2, false, ""};
    if (isOneOf(name, {"PRIMITIVEID", "SV_PRIMITIVEID"}))
        return {"gl_PrimitiveID", 1, true, ""};
    if (isOneOf(name, {"PSIZE", "PSIZ", "POINTSIZE", "CLP", "DEPTH", "DEPR"}))
        return {"0.0", 1, false, ""}; // in the struct that the stages share, but not handed on
    return {};
}

bool isFragmentColour(const std::string& name) {
    return isColour(name) || name == "SV_TARGET";
}

bool isDepth(const std::string& name) {
    return isOneOf(name, {"DEPTH", "DEPR", "SV_DEPTH"});
}

/// The location of a semantic that always has the same.
int fixedLocation(const NumberedSemantic& semantic) {
    if (semantic.name == "TEXCOORD" && semantic.number < 2 * TEXTURE_COORDINATES)
        return semantic.number - TEXTURE_COORDINATES;
    if (semantic.number == 0) {
        if (semantic.name == "NORMAL")
            return FIRST_NAMED_LOCATION;
        if (semantic.name == "TANGENT")
            return FIRST_NAMED_LOCATION + 1;
        if (isOneOf(semantic.name, {"BINORMAL", "BITANGENT"}))
            return FIRST_NAMED_LOCATION + 2;
    }
    return NO_LOCATION;
}

/// The name of a variable for a semantic that OpenGL has none for.
std::string freeName(const std::string& text, bool isAttribute) {
    const NumberedSemantic semantic = split(text);
    std::string name = isAttribute ? "attribute_" : "varying_";
    for (const char c : semantic.name + std::to_string(semantic.number))
        if (std::isalnum(static_cast<unsigned char>(c)) != 0 || (c == '_' && name.back() != '_'))
            name += c;
    return name;
}

} // namespace

StageInterface::StageInterface(Stage stage, const std::vector<StageValue>& values, VaryingPlaces& places)
    : mStage(stage), mValues(values) {
    for (const StageValue& value : values) {
        const NumberedSemantic semantic = split(value.semantic);
        if (stage == Stage::FRAGMENT && value.isOutput && isFragmentColour(semantic.name) &&
            colourNumber(semantic) > 0)
            mHasSeveralColours = true;
    }
    if (stage == Stage::VERTEX)
        declareAttributes(freeValues(false));
    declareVaryings(freeValues(stage == Stage::VERTEX), places);
}

StageSlot StageInterface::builtinSlot(const StageValue& value) const {
    const NumberedSemantic semantic = split(value.semantic);
    if (mStage == Stage::VERTEX)
        return value.isOutput ? vertexOutput(semantic) : vertexInput(semantic);
    if (!value.isOutput)
        return fragmentInput(semantic);
    if (isFragmentColour(semantic.name) && colourNumber(semantic) < 8)
        return {mHasSeveralColours ? "gl_FragData[" + std::to_string(colourNumber(semantic)) + "]"
                                   : "gl_FragColor",
                4, false, ""};
    if (isDepth(semantic.name))
        return {"gl_FragDepth", 1, false, ""};
    return {};
}

/// What has no built-in variable, by the names of its variables: the first value of each.
std::map<std::string, const StageValue*> StageInterface::freeValues(bool isOutput) const {
    const bool isAttribute = mStage == Stage::VERTEX && !isOutput;
    std::map<std::string, const StageValue*> free;
    for (const StageValue& value : mValues)
        if (value.isOutput == isOutput && builtinSlot(value).glsl.empty())
            free.emplace(freeName(value.semantic, isAttribute), &value);
    return free;
}

/// The host finds them by their numbers; those without one count from 6 on, past those that are taken.
void StageInterface::declareAttributes(const std::map<std::string, const StageValue*>& values) {
    std::set<int> taken;
    for (const auto& [name, value] : values) {
        const NumberedSemantic semantic = split(value->semantic);
        const bool isWeight = isOneOf(semantic.name, {"BLENDWEIGHT", "BLENDWEIGHTS"});
        const bool isIndex = isOneOf(semantic.name, {"BLENDINDICES", "BLENDINDEX"});
        int location = isWeight                                                  ? 1
                       : isIndex                                                 ? 7
                       : semantic.name == "ATTR" && semantic.number < ATTRIBUTES ? semantic.number
                                                                                 : 6;
        for (int tries = 0; taken.count(location) != 0 && tries < ATTRIBUTES; ++tries)
            location = (location + 1) % ATTRIBUTES;
        if (!taken.insert(location).second && !mSharedAttribute)
            mSharedAttribute = value;
        mDeclarations.push_back({name, location, false});
    }
}

void StageInterface::declareVaryings(const std::map<std::string, const StageValue*>& values,
                                     VaryingPlaces& places) {
    const bool isOutput = mStage == Stage::VERTEX;
    std::set<std::string> ownNames;
    for (const auto& [name, value] : values)
        if (fixedLocation(split(value->semantic)) == NO_LOCATION)
            ownNames.insert(name);
    const std::map<std::string, int> placed = places.assign(ownNames);
    for (const auto& [name, value] : values) {
        const auto own = placed.find(name);
        const int location =
            own == placed.end() ? fixedLocation(split(value->semantic)) : FIRST_PLACE_LOCATION + own->second;
        if (location == NO_LOCATION && !mUnplaced)
            mUnplaced = value;
        mDeclarations.push_back({name, location, isOutput});
    }
}

StageSlot StageInterface::slot(const StageValue& value) const {
    StageSlot slot = builtinSlot(value);
    if (!slot.glsl.empty() || (mStage == Stage::FRAGMENT && value.isOutput))
        return slot;
    return {freeName(value.semantic, mStage == Stage::VERTEX && !value.isOutput), 4, false, ""};
}

std::string StageInterface::builtinDeclarations() const {
    std::set<std::string> used;
    for (const StageValue& value : mValues) {
        const StageSlot slot = builtinSlot(value);
        const bool isVarying = value.isOutput == (mStage == Stage::VERTEX);
        if (slot.glsl.empty() || !isVarying)
            continue;
        used.insert(slot.glsl.substr(0, slot.glsl.find('[')));
        if (!slot.twin.empty())
            used.insert(slot.twin);
    }
    const std::string coordinates = "gl_TexCoord[" + std::to_string(TEXTURE_COORDINATES) + "];\n";
    if (mStage == Stage::FRAGMENT)
        return used.count("gl_TexCoord") != 0 ? "in vec4 " + coordinates : "";
    used.insert("gl_Position");
    struct Member {
        const char* name;
        const char* declaration;
    };
    constexpr Member MEMBERS[] = {{"gl_Position", "vec4 gl_Position;"},
                                  {"gl_PointSize", "float gl_PointSize;"},
                                  {"gl_ClipDistance", "float gl_ClipDistance[6];"},
                                  {"gl_FrontColor", "vec4 gl_FrontColor;"},
                                  {"gl_BackColor", "vec4 gl_BackColor;"},
                                  {"gl_FrontSecondaryColor", "vec4 gl_FrontSecondaryColor;"},
                                  {"gl_BackSecondaryColor", "vec4 gl_BackSecondaryColor;"},
                                  {"gl_FogFragCoord", "float gl_FogFragCoord;"}};
    std::string text = "out gl_PerVertex {\n";
    for (const Member& member : MEMBERS)
        if (used.count(member.name) != 0)
            text += "    " + std::string(member.declaration) + "\n";
    if (used.count("gl_TexCoord") != 0)
        text += "    vec4 " + coordinates;
    return text + "};\n";
}

} // namespace cg
