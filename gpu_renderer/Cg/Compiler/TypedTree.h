#ifndef CG_COMPILER_TYPED_TREE_H
#define CG_COMPILER_TYPED_TREE_H

#include <Cg/Compiler/SyntaxTree.h>
#include <Cg/Compiler/Types.h>

#include <array>
#include <cstddef>
#include <cstdint>
#include <map>
#include <string>
#include <vector>

/// The program as it means: what the resolver makes of the syntax tree and the emitter writes out.
///
/// Every name is resolved, every expression has its type, every conversion that Cg makes silently is a
/// CONVERT or a SWIZZLE, and every operation is one that GLSL has: what GLSL lacks has become calls, helper
/// functions and temporaries. Only what the entry reaches is here.
///
/// A matrix is kept with its rows as the columns of a GLSL matrix, so m[i] is the same row in both.
namespace cg {

struct TypedExpr;
struct TypedStmt;
struct Function;

struct Variable {
    enum class Storage { UNIFORM, GLOBAL, LOCAL, PARAMETER };

    Storage storage = Storage::LOCAL;
    Name name;
    const Type* type = nullptr;
    const VariableDecl* declaration = nullptr; ///< null for temporaries and pieces of other variables
    Direction direction = Direction::IN;       ///< PARAMETER
    bool isConst = false;
    bool isUnsized = false;            ///< a UNIFORM array that is as long as its elements' use asks for
    bool isWritten = false;            ///< a UNIFORM that the program writes to works on a copy
    TypedExpr* initializer = nullptr;  ///< GLOBAL, and the default value of a UNIFORM
    TypedExpr* state = nullptr;        ///< UNIFORM: the piece of OpenGL state that it stands for
    bool isConstantExpression = false; ///< a GLOBAL whose initializer GLSL takes as a constant

    bool comparesDepth = false; ///< a sampler that a look-up compares a depth with
    bool givesColour = false;   ///< a sampler that a look-up takes texels from

    /// A sampler that was assigned stands for what was assigned to it: GLSL cannot copy samplers.
    TypedExpr* alias = nullptr;

    /// GLSL structs here hold no samplers. Those of a variable with a struct type are variables of their own,
    /// by path: `.layers.base`; those within arrays are arrays.
    std::map<std::string, Variable*> samplers;
    const Variable* samplerOwner = nullptr; ///< of such a sampler: the variable that it belongs to
    std::string samplerPath;                ///< of such a sampler: its path in that variable
};

struct TypedExpr {
    enum class Kind {
        LITERAL,     ///< number
        VARIABLE,    ///< variable
        FIELD,       ///< operands[0] . structure's field `index`
        SWIZZLE,     ///< components of the vector operands[0]
        ELEMENT,     ///< operands[0] [ operands[1] ]: of an array, a vector or a matrix's rows
        CALL,        ///< function(operands)
        BUILTIN,     ///< form, a GLSL text in which $0, $1, ... are the operands
        UNARY,       ///< unary
        BINARY,      ///< binary; with the operand types that GLSL has for it
        ASSIGN,      ///< operands[0] = operands[1]
        CONDITIONAL, ///< operands[0] ? operands[1] : operands[2], the condition one bool
        CONSTRUCT,   ///< type(operands): components one after another; elements; members
        CONVERT ///< type(operand): to another scalar kind, a smaller matrix, or one value to all components
    };

    TypedExpr(Kind theKind, SourceLocation at, const Type* theType)
        : kind(theKind), location(at), type(theType) {}

    Kind kind;
    SourceLocation location;
    const Type* type;
    std::vector<TypedExpr*> operands;
    double number = 0;
    Variable* variable = nullptr; ///< BUILTIN: the uniform that is bound to this piece of OpenGL's state
    Function* function = nullptr;
    Name form;                     ///< BUILTIN
    Name helper;                   ///< BUILTIN: name of the helper function that the form needs
    bool isByRows = false;         ///< BUILTIN: the form is for each row of the operands that are matrices
    std::uint32_t outOperands = 0; ///< BUILTIN: bit i is set where operand i is written to
    int index = 0;
    std::array<std::uint8_t, 4> components{}; ///< SWIZZLE: 0 to 3, as many as the type has
    UnaryOp unary = UnaryOp::PLUS;
    BinaryOp binary = BinaryOp::ADD;
    bool isCompound = false; ///< ASSIGN: operands[0] binary= operands[1]

    /// A literal without a suffix, or arithmetic of such ones: takes the scalar kind of its partner.
    bool isUntyped = false;
};

/// It can be written twice in the GLSL text: no side effect and nothing worth computing once.
bool isSimple(const TypedExpr* expression);

/// Its evaluation may change something.
bool hasEffect(const TypedExpr* expression);

/// The variable that an l-value is a part of, or null.
Variable* rootVariable(const TypedExpr* expression);

/// What `c ? a : b` may be, where that is a sampler; a single one else.
std::vector<TypedExpr*> samplersIn(TypedExpr* sampler);

/// Samplers that one look-up may choose among.
constexpr std::size_t MAX_SAMPLER_CHOICES = 64;

/// How an operator is written, in Cg and in GLSL.
const char* spelling(BinaryOp op);

struct TypedStmt {
    enum class Kind {
        BLOCK,    ///< body
        SEQUENCE, ///< body, without a scope of its own
        DECLARE,  ///< variable, expression: its initial value or null
        EXPR,     ///< expression
        IF,       ///< expression, body[0], body[1] or null
        FOR,      ///< body[0]: initializer or null; expression, step: or null; body[1]
        WHILE,    ///< expression, body[0]
        DO,       ///< expression, body[0]
        SWITCH,   ///< expression, body with CASE among the others
        CASE,     ///< expression, null for the default
        RETURN,   ///< expression or null
        DISCARD,
        BREAK,
        CONTINUE
    };

    explicit TypedStmt(Kind theKind) : kind(theKind) {}

    Kind kind;
    TypedExpr* expression = nullptr;
    TypedExpr* step = nullptr;
    Variable* variable = nullptr;
    std::vector<TypedStmt*> body;
};

/// A function as one call needs it: with the sizes of its arrays known. Functions of one name differ in
/// their GLSL names.
struct Function {
    Name name;
    const FunctionDecl* declaration = nullptr;
    const Type* result = nullptr;
    std::vector<Variable*> parameters;  ///< a method's object first; samplers of structs last
    std::vector<Variable*> temporaries; ///< to be declared at the start of the body
    TypedStmt* body = nullptr;
    bool isBeingResolved = false;
};

/// One value that a stage takes in or gives out: an entry's parameter, its result, or a member of either.
struct StageValue {
    std::string semantic;       ///< in upper case, with its number: `TEXCOORD0`
    TypedExpr* place = nullptr; ///< what holds the value around the entry's call
    bool isOutput = false;
};

/// A parameter of the program as the runtime sees it.
struct TypedParameter {
    Name name;
    const Type* type = nullptr;
    Name semantic;
    Direction direction = Direction::IN;
    bool isUniform = true;
    bool isGlobal = false;
    Variable* variable = nullptr; ///< a uniform; for others the one around the entry's call
};

struct TypedProgram {
    std::vector<TypedParameter> parameters; ///< the entry's, its result as "return", the globals

    std::vector<Variable*> uniforms;    ///< those that the entry reaches
    std::vector<Variable*> globals;     ///< in the order of their initialization
    std::vector<Variable*> temporaries; ///< of their initializers
    std::vector<Function*> functions;   ///< called ones first, the entry last
    Function* entry = nullptr;

    /// Variables around the entry's call, one for each parameter that is no uniform.
    std::vector<Variable*> arguments;
    Variable* result = nullptr; ///< null for void
    std::vector<StageValue> values;
};

} // namespace cg

#endif
