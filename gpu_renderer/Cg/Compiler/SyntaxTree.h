#ifndef CG_COMPILER_SYNTAX_TREE_H
#define CG_COMPILER_SYNTAX_TREE_H

#include <Cg/Compiler/Arena.h>
#include <Cg/Compiler/SourceLocation.h>

#include <string_view>
#include <vector>

/// The program as it is written: what the parser builds and the resolver reads.
///
/// Nothing here is looked up or decided except what the grammar itself needs: a name followed by `(` is a
/// constructor where the name is a type in scope, else a call. `a.b` is always a MemberExpr, whether b turns
/// out to be a member, a method or a swizzle. The resolver turns this tree into the typed one and leaves it
/// unchanged, so one function body can be resolved several times.
///
/// Nodes are owned by the arena of their TranslationUnit and refer to each other by plain pointers. Names are
/// views into text that outlives the tree (the source files' text or the arena's kept spellings).
///
/// Skipped by the parser, with no trace in the tree: annotations `< ... >`, `sampler_state { ... }` blocks,
/// `[unroll]` and other attributes in brackets before a statement, techniques, `register(...)` and
/// `packoffset`.
namespace cg {

using Name = std::string_view;

struct Expr;
struct Stmt;
struct BlockStmt;
struct VariableDecl;
struct FunctionDecl;
struct StructDecl;

// ---------------------------------------------------------------------------------------------- types

/// A type as written, without the dimensions that stand after a declarator's name.
struct TypeSyntax {
    explicit TypeSyntax(SourceLocation at) : location(at) {}

    SourceLocation location;
    Name name;                        ///< "float3", "Light", "sampler2D"; empty for a nameless struct
    StructDecl* definition = nullptr; ///< the struct defined in place: `struct Light { ... } a, b;`
    /// Dimensions that belong to the type: `float[3] x`, `float[](1, 2)`, outermost first; null is unsized.
    std::vector<Expr*> dimensions;
    bool isUnsigned = false; ///< `unsigned int`; the bare word `unsigned` gives the name "int"
};

/// How an argument travels. NONE is written by nobody and means IN.
enum class Direction { NONE, IN, OUT, INOUT };

/// The words before a declaration's type, in any order; ones that change nothing (`packed`, `inline`,
/// `extern`, `volatile`, `noinline`, `linear`, `nointerpolation`, `precise`, ...) are dropped by the parser.
struct Qualifiers {
    Direction direction = Direction::NONE;
    bool isConst = false;
    bool isStatic = false;
    bool isUniform = false;
    bool isVarying = false;
    bool isRowMajor = false;
    bool isColumnMajor = false;
};

/// `: TEXCOORD0`; the name as written, with its digits. Empty where there is none. `state.matrix.mvp[0]` is
/// kept as one text without blanks. Where several stand in a row (`: COLOR : register(c0)`), the first
/// counts.
struct Semantic {
    SourceLocation location;
    Name name;
};

// --------------------------------------------------------------------------------------- declarations

struct Decl {
    enum class Kind { VARIABLE, FUNCTION, STRUCT, TYPEDEF };

    Decl(Kind theKind, SourceLocation at) : kind(theKind), location(at) {}

    Kind kind;
    SourceLocation location; ///< of the declared name
    Name name;
};

/// One declarator: a global, a local, a parameter or a member. `float a, b[2];` makes two of them that share
/// their type. A parameter of a prototype may be nameless; `(void)` makes no parameter.
struct VariableDecl : Decl {
    explicit VariableDecl(SourceLocation at) : Decl(Kind::VARIABLE, at) {}

    TypeSyntax* type = nullptr;
    Qualifiers qualifiers;
    std::vector<Expr*> dimensions; ///< after the name, outermost first; null is unsized: `float a[]`
    Semantic semantic;
    Expr* initializer = nullptr; ///< also a parameter's default argument and an InitListExpr
};

/// @return how a parameter's argument travels; never NONE
inline Direction directionOf(const VariableDecl* parameter) {
    const Direction written = parameter->qualifiers.direction;
    return written == Direction::NONE ? Direction::IN : written;
}

/// A function or its prototype (no body); also a method, in its struct or outside as `Light::shade`.
struct FunctionDecl : Decl {
    explicit FunctionDecl(SourceLocation at) : Decl(Kind::FUNCTION, at) {}

    TypeSyntax* returnType = nullptr; ///< dimensions of a result stand in the type
    std::vector<VariableDecl*> parameters;
    Semantic semantic;         ///< of the result
    BlockStmt* body = nullptr; ///< null for a prototype
    Name ownerName;            ///< "Light" for a method, also inside the struct; else empty
};

struct StructDecl : Decl { ///< an empty name for a nameless one
    explicit StructDecl(SourceLocation at) : Decl(Kind::STRUCT, at) {}

    Name baseName; ///< what stands after `struct Name :`, an interface or a struct
    std::vector<VariableDecl*> members;
    std::vector<FunctionDecl*> methods;
    bool isInterface = false;
};

/// `typedef float3 Colours[4];`
struct TypedefDecl : Decl {
    explicit TypedefDecl(SourceLocation at) : Decl(Kind::TYPEDEF, at) {}

    TypeSyntax* type = nullptr;
    std::vector<Expr*> dimensions;
};

/// A whole program. A struct that is defined within another declaration (`struct {...} a;`, `typedef struct
/// {...} T;`) stands only there, as TypeSyntax::definition.
struct TranslationUnit {
    std::vector<Decl*> declarations; ///< in the order of the source
};

// ----------------------------------------------------------------------------------------- statements

struct Stmt {
    enum class Kind { BLOCK, DECL, EXPR, IF, FOR, WHILE, DO, SWITCH, CASE, RETURN, DISCARD, BREAK, CONTINUE };

    Stmt(Kind theKind, SourceLocation at) : kind(theKind), location(at) {}

    Kind kind; ///< BREAK and CONTINUE need no more than this
    SourceLocation location;
};

struct BlockStmt : Stmt {
    explicit BlockStmt(SourceLocation at) : Stmt(Kind::BLOCK, at) {}

    std::vector<Stmt*> statements; ///< an empty statement `;` leaves nothing
};

/// Local declarations, also structs and typedefs.
struct DeclStmt : Stmt {
    explicit DeclStmt(SourceLocation at) : Stmt(Kind::DECL, at) {}

    std::vector<Decl*> declarations;
};

struct ExprStmt : Stmt {
    explicit ExprStmt(SourceLocation at) : Stmt(Kind::EXPR, at) {}

    Expr* expression = nullptr;
};

struct IfStmt : Stmt {
    explicit IfStmt(SourceLocation at) : Stmt(Kind::IF, at) {}

    Expr* condition = nullptr;
    Stmt* thenBranch = nullptr; ///< null for `;`
    Stmt* elseBranch = nullptr; ///< null where there is none
};

struct ForStmt : Stmt {
    explicit ForStmt(SourceLocation at) : Stmt(Kind::FOR, at) {}

    Stmt* initializer = nullptr; ///< DeclStmt or ExprStmt; null where there is none
    Expr* condition = nullptr;   ///< null where there is none
    Expr* step = nullptr;        ///< null where there is none
    Stmt* body = nullptr;        ///< null for `;`
};

/// WHILE and DO.
struct LoopStmt : Stmt {
    LoopStmt(Kind theKind, SourceLocation at) : Stmt(theKind, at) {}

    Expr* condition = nullptr;
    Stmt* body = nullptr; ///< null for `;`
};

struct SwitchStmt : Stmt {
    explicit SwitchStmt(SourceLocation at) : Stmt(Kind::SWITCH, at) {}

    Expr* selector = nullptr;
    BlockStmt* body = nullptr; ///< CaseStmts stand flat among the other statements
};

/// `case 3:`, and `default:` with a null value.
struct CaseStmt : Stmt {
    explicit CaseStmt(SourceLocation at) : Stmt(Kind::CASE, at) {}

    Expr* value = nullptr;
};

/// RETURN with the result or null; DISCARD with the condition of `discard expr;` or null.
struct JumpStmt : Stmt {
    JumpStmt(Kind theKind, SourceLocation at) : Stmt(theKind, at) {}

    Expr* value = nullptr;
};

// ---------------------------------------------------------------------------------------- expressions

struct Expr {
    enum class Kind {
        LITERAL,
        NAME,
        MEMBER,
        INDEX,
        CALL,
        CONSTRUCT,
        CAST,
        UNARY,
        BINARY,
        ASSIGN,
        CONDITIONAL,
        INIT_LIST
    };

    Expr(Kind theKind, SourceLocation at) : kind(theKind), location(at) {}

    Kind kind;
    SourceLocation
        location; ///< of the operator for UNARY, BINARY, ASSIGN and MEMBER (the name), else the start
};

/// A number, `true`, `false` or a text. The suffix decides the scalar kind: f float, h half, x fixed; a
/// number with neither point nor exponent nor suffix is INT.
struct LiteralExpr : Expr {
    explicit LiteralExpr(SourceLocation at) : Expr(Kind::LITERAL, at) {}

    enum class Type { INT, UNSIGNED, FLOAT, HALF, FIXED, BOOL, TEXT };

    Type type = Type::INT;
    double number = 0; ///< value of a number (exact for 32-bit integers); 0 or 1 for BOOL
    Name text;         ///< TEXT: without its quotes
};

struct NameExpr : Expr {
    explicit NameExpr(SourceLocation at) : Expr(Kind::NAME, at) {}

    Name name;
};

/// `object.name`
struct MemberExpr : Expr {
    explicit MemberExpr(SourceLocation at) : Expr(Kind::MEMBER, at) {}

    Expr* object = nullptr;
    Name name;
};

struct IndexExpr : Expr {
    explicit IndexExpr(SourceLocation at) : Expr(Kind::INDEX, at) {}

    Expr* object = nullptr;
    Expr* index = nullptr;
};

/// `callee(arguments)`: the callee is a NameExpr, or a MemberExpr for a method.
struct CallExpr : Expr {
    explicit CallExpr(SourceLocation at) : Expr(Kind::CALL, at) {}

    Expr* callee = nullptr;
    std::vector<Expr*> arguments;
};

/// `float3(...)`, `Light(...)`, `float[](...)`
struct ConstructExpr : Expr {
    explicit ConstructExpr(SourceLocation at) : Expr(Kind::CONSTRUCT, at) {}

    TypeSyntax* type = nullptr;
    std::vector<Expr*> arguments;
};

/// `(float3)x`, `(float[2])x`, `(Light)0`
struct CastExpr : Expr {
    explicit CastExpr(SourceLocation at) : Expr(Kind::CAST, at) {}

    TypeSyntax* type = nullptr;
    Expr* operand = nullptr;
};

enum class UnaryOp {
    PLUS,
    NEGATE,
    NOT,
    COMPLEMENT,
    PRE_INCREMENT,
    PRE_DECREMENT,
    POST_INCREMENT,
    POST_DECREMENT
};

struct UnaryExpr : Expr {
    explicit UnaryExpr(SourceLocation at) : Expr(Kind::UNARY, at) {}

    UnaryOp op = UnaryOp::PLUS;
    Expr* operand = nullptr;
};

enum class BinaryOp {
    MULTIPLY,
    DIVIDE,
    MODULO,
    ADD,
    SUBTRACT,
    SHIFT_LEFT,
    SHIFT_RIGHT,
    LESS,
    GREATER,
    LESS_EQUAL,
    GREATER_EQUAL,
    EQUAL,
    NOT_EQUAL,
    BIT_AND,
    BIT_XOR,
    BIT_OR,
    AND,
    OR,
    COMMA
};

struct BinaryExpr : Expr {
    explicit BinaryExpr(SourceLocation at) : Expr(Kind::BINARY, at) {}

    BinaryOp op = BinaryOp::ADD;
    Expr* left = nullptr;
    Expr* right = nullptr;
};

/// `target = value`, and `target op= value` with isCompound.
struct AssignExpr : Expr {
    explicit AssignExpr(SourceLocation at) : Expr(Kind::ASSIGN, at) {}

    Expr* target = nullptr;
    Expr* value = nullptr;
    bool isCompound = false;
    BinaryOp op = BinaryOp::ADD; ///< meaningful only with isCompound
};

struct ConditionalExpr : Expr {
    explicit ConditionalExpr(SourceLocation at) : Expr(Kind::CONDITIONAL, at) {}

    Expr* condition = nullptr;
    Expr* whenTrue = nullptr;
    Expr* whenFalse = nullptr;
};

/// `{ a, { b, c }, }`: only as an initializer or nested in one.
struct InitListExpr : Expr {
    explicit InitListExpr(SourceLocation at) : Expr(Kind::INIT_LIST, at) {}

    std::vector<Expr*> elements;
};

} // namespace cg

#endif
