#include <Cg/Compiler/Diagnostics.h>
#include <Cg/Compiler/Parser.h>
#include <Cg/Compiler/Preprocessor.h>
#include <Cg/Compiler/SourceFiles.h>

#include <gtest/gtest.h>

#include <cstdint>
#include <sstream>
#include <string>
#include <vector>

namespace {

// The tree as text: every operator in parentheses, calls as f(...), constructors as new T(...), casts as
// T<...>, members of the grammar that are absent left out.

std::string text(const cg::Expr* expr);

std::string list(const std::vector<cg::Expr*>& all) {
    std::string result;
    for (const cg::Expr* one : all)
        result += (result.empty() ? "" : ", ") + text(one);
    return result;
}

std::string dimensions(const std::vector<cg::Expr*>& all) {
    std::string result;
    for (const cg::Expr* one : all)
        result += "[" + (one == nullptr ? "" : text(one)) + "]";
    return result;
}

std::string name(const cg::TypeSyntax* type);

std::string literal(const cg::LiteralExpr& one) {
    using Type = cg::LiteralExpr::Type;
    std::ostringstream out;
    switch (one.type) {
    case Type::TEXT:
        return "\"" + std::string(one.text) + "\"";
    case Type::BOOL:
        return one.number != 0 ? "true" : "false";
    case Type::INT:
        out << one.number;
        break;
    case Type::UNSIGNED:
        out << one.number << 'u';
        break;
    case Type::FLOAT:
        out << one.number << 'f';
        break;
    case Type::HALF:
        out << one.number << 'h';
        break;
    case Type::FIXED:
        out << one.number << 'x';
        break;
    }
    return out.str();
}

std::string binaryOp(cg::BinaryOp op) {
    static const char* const SIGNS[] = {"*",  "/",  "%",  "+", "-", "<<", ">>", "<",  ">", "<=",
                                        ">=", "==", "!=", "&", "^", "|",  "&&", "||", ","};
    return SIGNS[static_cast<std::size_t>(op)];
}

std::string unary(const cg::UnaryExpr& one) {
    static const char* const SIGNS[] = {"+", "-", "!", "~", "++", "--"};
    const std::string operand = text(one.operand);
    if (one.op == cg::UnaryOp::POST_INCREMENT)
        return "(" + operand + "++)";
    if (one.op == cg::UnaryOp::POST_DECREMENT)
        return "(" + operand + "--)";
    return "(" + std::string(SIGNS[static_cast<std::size_t>(one.op)]) + operand + ")";
}

template <class Node>
const Node& as(const cg::Expr* expr) {
    return static_cast<const Node&>(*expr);
}

std::string text(const cg::Expr* expr) {
    using Kind = cg::Expr::Kind;
    switch (expr->kind) {
    case Kind::LITERAL:
        return literal(as<cg::LiteralExpr>(expr));
    case Kind::NAME:
        return std::string(as<cg::NameExpr>(expr).name);
    case Kind::MEMBER:
        return text(as<cg::MemberExpr>(expr).object) + "." + std::string(as<cg::MemberExpr>(expr).name);
    case Kind::INDEX:
        return text(as<cg::IndexExpr>(expr).object) + "[" + text(as<cg::IndexExpr>(expr).index) + "]";
    case Kind::CALL:
        return text(as<cg::CallExpr>(expr).callee) + "(" + list(as<cg::CallExpr>(expr).arguments) + ")";
    case Kind::CONSTRUCT:
        return "new " + name(as<cg::ConstructExpr>(expr).type) + "(" +
               list(as<cg::ConstructExpr>(expr).arguments) + ")";
    case Kind::CAST:
        return name(as<cg::CastExpr>(expr).type) + "<" + text(as<cg::CastExpr>(expr).operand) + ">";
    case Kind::UNARY:
        return unary(as<cg::UnaryExpr>(expr));
    case Kind::BINARY:
        return "(" + text(as<cg::BinaryExpr>(expr).left) + " " + binaryOp(as<cg::BinaryExpr>(expr).op) + " " +
               text(as<cg::BinaryExpr>(expr).right) + ")";
    case Kind::ASSIGN: {
        const auto& assign = as<cg::AssignExpr>(expr);
        return "(" + text(assign.target) + " " + (assign.isCompound ? binaryOp(assign.op) : "") + "= " +
               text(assign.value) + ")";
    }
    case Kind::CONDITIONAL: {
        const auto& conditional = as<cg::ConditionalExpr>(expr);
        return "(" + text(conditional.condition) + " ? " + text(conditional.whenTrue) + " : " +
               text(conditional.whenFalse) + ")";
    }
    case Kind::INIT_LIST:
        return "{" + list(as<cg::InitListExpr>(expr).elements) + "}";
    }
    return "?";
}

std::string text(const cg::Decl* decl);

std::string name(const cg::TypeSyntax* type) {
    const std::string base =
        type->definition != nullptr ? "(" + text(type->definition) + ")" : std::string(type->name);
    return (type->isUnsigned ? "unsigned " : "") + base + dimensions(type->dimensions);
}

std::string text(const cg::Qualifiers& qualifiers) {
    static const char* const DIRECTIONS[] = {"", "in ", "out ", "inout "};
    std::string result = DIRECTIONS[static_cast<std::size_t>(qualifiers.direction)];
    result += qualifiers.isConst ? "const " : "";
    result += qualifiers.isStatic ? "static " : "";
    result += qualifiers.isUniform ? "uniform " : "";
    result += qualifiers.isVarying ? "varying " : "";
    result += qualifiers.isRowMajor ? "row_major " : "";
    result += qualifiers.isColumnMajor ? "column_major " : "";
    return result;
}

std::string text(const cg::Semantic& semantic) {
    return semantic.name.empty() ? "" : " : " + std::string(semantic.name);
}

std::string text(const cg::Stmt* stmt);

std::string variable(const cg::VariableDecl& one) {
    return text(one.qualifiers) + name(one.type) + (one.name.empty() ? "" : " " + std::string(one.name)) +
           dimensions(one.dimensions) + text(one.semantic) +
           (one.initializer != nullptr ? " = " + text(one.initializer) : "");
}

std::string function(const cg::FunctionDecl& one) {
    std::string parameters;
    for (const cg::VariableDecl* parameter : one.parameters)
        parameters += (parameters.empty() ? "" : ", ") + variable(*parameter);
    return name(one.returnType) + " " + (one.ownerName.empty() ? "" : std::string(one.ownerName) + "::") +
           std::string(one.name) + "(" + parameters + ")" + text(one.semantic) +
           (one.body != nullptr ? " " + text(one.body) : "");
}

std::string text(const cg::Decl* decl) {
    switch (decl->kind) {
    case cg::Decl::Kind::VARIABLE:
        return variable(static_cast<const cg::VariableDecl&>(*decl));
    case cg::Decl::Kind::FUNCTION:
        return function(static_cast<const cg::FunctionDecl&>(*decl));
    case cg::Decl::Kind::TYPEDEF: {
        const auto& alias = static_cast<const cg::TypedefDecl&>(*decl);
        return "typedef " + name(alias.type) + " " + std::string(alias.name) + dimensions(alias.dimensions);
    }
    case cg::Decl::Kind::STRUCT:
        break;
    }
    const auto& structure = static_cast<const cg::StructDecl&>(*decl);
    std::string result = (structure.isInterface ? "interface " : "struct ") + std::string(structure.name) +
                         (structure.baseName.empty() ? "" : " : " + std::string(structure.baseName)) + " {";
    for (const cg::VariableDecl* member : structure.members)
        result += " " + variable(*member) + ";";
    for (const cg::FunctionDecl* method : structure.methods)
        result += " " + function(*method) + ";";
    return result + " }";
}

std::string orNothing(const cg::Expr* expr) {
    return expr == nullptr ? "" : text(expr);
}

std::string jump(const char* word, const cg::Stmt* stmt) {
    const cg::Expr* const value = static_cast<const cg::JumpStmt*>(stmt)->value;
    return word + (value == nullptr ? "" : " " + text(value)) + ";";
}

std::string text(const cg::Stmt* stmt) {
    using Kind = cg::Stmt::Kind;
    if (stmt == nullptr)
        return ";";
    std::string result;
    switch (stmt->kind) {
    case Kind::BLOCK:
        for (const cg::Stmt* one : static_cast<const cg::BlockStmt*>(stmt)->statements)
            result += text(one) + " ";
        return "{ " + result + "}";
    case Kind::DECL:
        for (const cg::Decl* one : static_cast<const cg::DeclStmt*>(stmt)->declarations)
            result += (result.empty() ? "" : ", ") + text(one);
        return result + ";";
    case Kind::EXPR:
        return text(static_cast<const cg::ExprStmt*>(stmt)->expression) + ";";
    case Kind::IF: {
        const auto& branch = static_cast<const cg::IfStmt&>(*stmt);
        return "if " + text(branch.condition) + " " + text(branch.thenBranch) +
               (branch.elseBranch != nullptr ? " else " + text(branch.elseBranch) : "");
    }
    case Kind::FOR: {
        const auto& loop = static_cast<const cg::ForStmt&>(*stmt);
        return "for (" + text(loop.initializer) + " " + orNothing(loop.condition) + "; " +
               orNothing(loop.step) + ") " + text(loop.body);
    }
    case Kind::WHILE:
    case Kind::DO: {
        const auto& loop = static_cast<const cg::LoopStmt&>(*stmt);
        return (stmt->kind == Kind::DO ? "do " : "while ") + text(loop.condition) + " " + text(loop.body);
    }
    case Kind::SWITCH: {
        const auto& choice = static_cast<const cg::SwitchStmt&>(*stmt);
        return "switch " + text(choice.selector) + " " + text(choice.body);
    }
    case Kind::CASE:
        return "case " + orNothing(static_cast<const cg::CaseStmt*>(stmt)->value) + ":";
    case Kind::RETURN:
        return jump("return", stmt);
    case Kind::DISCARD:
        return jump("discard", stmt);
    case Kind::BREAK:
        return "break;";
    case Kind::CONTINUE:
        return "continue;";
    }
    return "?";
}

/// One parsed program; the tree lives as long as this.
struct Parsed {
    explicit Parsed(std::string source) {
        const std::uint32_t file = files.add("main.cg", std::move(source));
        tokens = cg::preprocess(files, file, {}, diagnostics);
        unit = cg::parse(tokens, arena, diagnostics);
    }

    std::string tree() const {
        std::string result;
        for (const cg::Decl* one : unit->declarations)
            result += (result.empty() ? "" : "\n") + text(one);
        return result;
    }

    /// "line: message" of every error and warning.
    std::vector<std::string> messages() const {
        std::vector<std::string> result;
        for (const cg::Diagnostic& one : diagnostics.all())
            result.push_back(std::to_string(one.location.line) + ": " + one.message);
        return result;
    }

    cg::SourceFiles files;
    cg::Diagnostics diagnostics;
    cg::Arena arena;
    std::vector<cg::Token> tokens;
    cg::TranslationUnit* unit = nullptr;
};

struct Case {
    std::string source;
    std::string expected;
};

TEST(CgParser, Expressions) {
    const std::vector<Case> cases{
        {"a + b * c - d / e % f", "((a + (b * c)) - ((d / e) % f))"},
        {"a || b && c | d ^ e & f == g < h << i + j",
         "(a || (b && (c | (d ^ (e & (f == (g < (h << (i + j)))))))))"},
        {"a != b >= c >> d, x > y <= z", "((a != (b >= (c >> d))) , ((x > y) <= z))"},
        {"a = b += c ? d : e ? f : g", "(a = (b += (c ? d : (e ? f : g))))"},
        {"a <<= b >>= c &= d ^= e |= f -= g *= h /= i %= j",
         "(a <<= (b >>= (c &= (d ^= (e |= (f -= (g *= (h /= (i %= j)))))))))"},
        {"- -a + !b * ~c", "((-(-a)) + ((!b) * (~c)))"},
        {"++a-- - --b++", "((++(a--)) - (--(b++)))"},
        {"a.b[c].d(e, f).g++", "(a.b[c].d(e, f).g++)"},
        {"(float3)x + (float3x3)m[0]", "(float3<x> + float3x3<m[0]>)"},
        {"(float)-x * (half3)(y) * (x)", "((float<(-x)> * half3<y>) * x)"},
        {"(unsigned int)x + (float[2])a + (const float)b + (struct S)0",
         "(((unsigned int<x> + float[2]<a>) + float<b>) + S<0>)"},
        {"float3(1, 2., .5h) * float4(1.x, 0x, 3u, 1e2)",
         "(new float3(1, 2f, 0.5h) * new float4(1x, 0x, 3u, 100f))"},
        {"float[3](1, 2, 3)[1] + float[](4)[0]", "(new float[3](1, 2, 3)[1] + new float[](4)[0])"},
        {"float3(x).xyz + (float3(y))", "(new float3(x).xyz + new float3(y))"},
        {"1.0.xxx + 2.xy + 1.f + 0x10 + 017", "((((1f.xxx + 2.xy) + 1f) + 16) + 15)"},
        {"m._m00_m11 + m._11_22 + v.xyzw.wzyx", "((m._m00_m11 + m._11_22) + v.xyzw.wzyx)"},
        {"true ? false : a.length", "(true ? false : a.length)"},
        {"vec3(1) + mat2(1) + unsigned int(2)", "((new vec3(1) + new mat2(1)) + new unsigned int(2))"},
        {"f(a, (b, c))", "f(a, (b , c))"},
        {"half4x4(a) + fixed1(b) + bool2x3(c) + uint4(d) + double(e)",
         "((((new half4x4(a) + new fixed1(b)) + new bool2x3(c)) + new uint4(d)) + new double(e))"},
    };
    for (const Case& one : cases) {
        SCOPED_TRACE(one.source);
        const Parsed parsed("void f() { " + one.source + "; }");
        EXPECT_EQ(parsed.tree(), "void f() { " + one.expected + "; }");
        EXPECT_EQ(parsed.messages(), std::vector<std::string>());
    }
}

TEST(CgParser, Declarations) {
    const std::vector<Case> cases{
        {"float a, b[2][3] = {{1, 2, 3,}, {4, 5, 6}}, c = 1;",
         "float a\nfloat b[2][3] = {{1, 2, 3}, {4, 5, 6}}\nfloat c = 1"},
        {"const static float x[] = { 1, 2 }; uniform extern float3 v;",
         "const static float x[] = {1, 2}\nuniform float3 v"},
        {"float3 const a = 1; float[3] b; float[2] c[3];", "const float3 a = 1\nfloat[3] b\nfloat[2] c[3]"},
        {"unsigned a; unsigned int b; unsigned short c; long int d; signed e; short f; long long g;",
         "unsigned int a\nunsigned int b\nunsigned short c\nint d\nint e\nshort f\nlong g"},
        {"packed half3 a; row_major float4x4 m; volatile inline float b;",
         "half3 a\nrow_major float4x4 m\nfloat b"},
        {"struct S { float3 p : POSITION, q : texcoord0; packed half4 c[2]; };",
         "struct S { float3 p : POSITION; float3 q : texcoord0; half4 c[2]; }"},
        {"struct { float a; } s, t[2]; struct P { S x; } p;",
         "(struct  { float a; }) s\n(struct  { float a; }) t[2]\n(struct P { S x; }) p"},
        {"typedef struct { float a; } T; T t; typedef float3 V, W[4]; V f(W w);",
         "typedef (struct  { float a; }) T\nT t\ntypedef float3 V\ntypedef float3 W[4]\nV f(W w)"},
        {"typedef struct _S { float a; } S; struct S2; struct S2 { S s; };",
         "typedef (struct _S { float a; }) S\nstruct S2 { S s; }"},
        {"float4 m(float4 p : POSITION, const uniform float4x4 mvp : state.matrix.mvp[ 0 ], out float x : C)"
         ": COLOR;",
         "float4 m(float4 p : POSITION, const uniform float4x4 mvp : state.matrix.mvp[0], out float x : C) : "
         "COLOR"},
        {"void f(void) {} float g() { return 1; };", "void f() { }\nfloat g() { return 1; }"},
        {"void f(float, float a[], inout float3 b = float3(1), in out float c, varying in half d);",
         "void f(float, float a[], inout float3 b = new float3(1), inout float c, in varying half d)"},
        {"uniform float x : register(c0) = 2; float y = 3 : C5; float z : C1 : register(c2);",
         "uniform float x = 2\nfloat y : C5 = 3\nfloat z : C1"},
        {"float a < string n = \"a>b\"; float m = 1.0; float3 c = {1,2,3}; > = 4; float b <int x = 1;>= 5;",
         "float a = 4\nfloat b = 5"},
        {"sampler2D s = sampler_state { Texture = <t>; MinFilter = Linear; }; samplerRECT r : TEXUNIT1;",
         "sampler2D s\nsamplerRECT r : TEXUNIT1"},
        {"texture t : DIFFUSE < string n = \"x\"; >; texture2D u; string s = \"x\"; float a;", "float a"},
        {"technique T { pass P { VertexProgram = compile vp40 main(); } } technique10 { } float a;",
         "float a"},
        {"interface I { float3 f(float3 n); }; struct S : I { float k; float3 f(float3 n) { return n * k; } "
         "};",
         "interface I { float3 I::f(float3 n); }\nstruct S : I { float k; float3 S::f(float3 n) { return (n "
         "* "
         "k); }; }"},
        {"struct S { float f(); }; float S::f() { return 1; }",
         "struct S { float S::f(); }\nfloat S::f() { return 1; }"},
    };
    for (const Case& one : cases) {
        SCOPED_TRACE(one.source);
        const Parsed parsed(one.source);
        EXPECT_EQ(parsed.tree(), one.expected);
        EXPECT_EQ(parsed.messages(), std::vector<std::string>());
    }
}

TEST(CgParser, Statements) {
    const std::vector<Case> cases{
        {";; if (a) ; else { }", "if a ; else { }"},
        {"if (a) b = 1; else if (c) { d; } else e;", "if a (b = 1); else if c { d; } else e;"},
        {"for (;;) break; for (int i = 0, j = 1; i < 4; i++, j--) continue;",
         "for (; ; ) break; for (int i = 0, int j = 1; (i < 4); ((i++) , (j--))) continue;"},
        {"for (i = 0; i < 4; ++i) { }", "for ((i = 0); (i < 4); (++i)) { }"},
        {"while (a < 3) a++; do { a--; } while (a);", "while (a < 3) (a++); do a { (a--); }"},
        {"[unroll] for (;;) ; [branch(4)] if (a) b;", "for (; ; ) ; if a b;"},
        {"discard; discard(a < 0); discard a.x < 0; discard();",
         "discard; discard (a < 0); discard (a.x < 0); discard;"},
        {"switch (a) { case 0: b = 1; break; case 1 + 1: default: c; }",
         "switch a { case 0: (b = 1); break; case (1 + 1): case : c; }"},
        {"return; return a, b;", "return; return (a , b);"},
        {"struct L { float a; }; typedef float3 V; V v; L l = { 1 }; static const float k = 1;",
         "struct L { float a; }; typedef float3 V; V v; L l = {1}; const static float k = 1;"},
        {"float[2] a; float[2](1, 2); float3(1); Unknown u;",
         "float[2] a; new float[2](1, 2); new float3(1); Unknown u;"},
    };
    for (const Case& one : cases) {
        SCOPED_TRACE(one.source);
        const Parsed parsed("void f() { " + one.source + " }");
        EXPECT_EQ(parsed.tree(), "void f() { " + one.expected + " }");
        EXPECT_EQ(parsed.messages(), std::vector<std::string>());
    }
}

/// Words that are types or qualifiers in one place and names in another.
TEST(CgParser, OrdinaryNames) {
    const std::vector<Case> cases{
        {"float4 f(sampler2D texture, float2 input, out float4 output, float sample, float filter)"
         "{ output = tex2D(texture, input) * sample * filter; return output; }",
         "float4 f(sampler2D texture, float2 input, out float4 output, float sample, float filter)"
         " { (output = ((tex2D(texture, input) * sample) * filter)); return output; }"},
        {"float4x4 matrix; float3 line, point, linear, packed; void f() { matrix[0] = (line) + (point) * "
         "packed; }",
         "float4x4 matrix\nfloat3 line\nfloat3 point\nfloat3 linear\nfloat3 packed\n"
         "void f() { (matrix[0] = (line + (point * packed))); }"},
        {"void f() { float vec2 = 1; vec2 = (vec2) - 1; { vec3 v = vec3(1); } float out = in * 2; }",
         "void f() { float vec2 = 1; (vec2 = (vec2 - 1)); { vec3 v = new vec3(1); } float out = (in * 2); }"},
        {"float mat2(float x); void f() { float a = mat2(1); }",
         "float mat2(float x)\nvoid f() { float a = mat2(1); }"},
        {"float4 texture2D(sampler2D sampler, float2 uv) { return tex2D(sampler, uv); }",
         "float4 texture2D(sampler2D sampler, float2 uv) { return tex2D(sampler, uv); }"},
        {"struct pass { float technique; float string; }; pass vector; float case, default, switch, asm;",
         "struct pass { float technique; float string; }\npass vector\nfloat case\nfloat default\nfloat "
         "switch\n"
         "float asm"},
        {"struct L { float a; }; void f() { L L; L.a = (L).a; } L g();",
         "struct L { float a; }\nvoid f() { L L; (L.a = L.a); }\nL g()"},
        {"struct texture { float a; }; texture t;", "struct texture { float a; }\ntexture t"},
        {"typedef float2 vec2; vec2 sampler_state; vec2 f() { return sampler_state; }",
         "typedef float2 vec2\nvec2 sampler_state\nvec2 f() { return sampler_state; }"},
    };
    for (const Case& one : cases) {
        SCOPED_TRACE(one.source);
        const Parsed parsed(one.source);
        EXPECT_EQ(parsed.tree(), one.expected);
        EXPECT_EQ(parsed.messages(), std::vector<std::string>());
    }
}

TEST(CgParser, LocatesWhatItBuilds) {
    const Parsed parsed("float g;\nvoid f() {\n  g = a +\n b.c;\n}");
    const auto* const function = static_cast<const cg::FunctionDecl*>(parsed.unit->declarations[1]);
    EXPECT_TRUE((function->location == cg::SourceLocation{0, 2, 6}));
    const auto* const statement = static_cast<const cg::ExprStmt*>(function->body->statements[0]);
    const auto& assign = as<cg::AssignExpr>(statement->expression);
    EXPECT_TRUE((assign.location == cg::SourceLocation{0, 3, 5}));
    EXPECT_TRUE((assign.value->location == cg::SourceLocation{0, 3, 9}));
    EXPECT_TRUE((as<cg::BinaryExpr>(assign.value).right->location == cg::SourceLocation{0, 4, 4}));
}

TEST(CgParser, NamesWhatIsWrongAndGoesOn) {
    struct Fault {
        std::string source;
        std::vector<std::string> messages;
    };
    const std::vector<Fault> faults{
        {"float a\nfloat b;", {"1: expected ';' after a declaration, found 'float'"}},
        {"void f() {\n a = 1\n b = (2;\n c = 3;\n d = ;\n}\nfloat 3;",
         {"2: expected ';' after a statement, found 'b'", "5: expected an expression, found ';'",
          "7: expected a name after the type, found '3'"}},
        {"void f() { a = f(1 2); b[1 = 2; c = x ? 1; }\nvoid g() { x y z; }",
         {"1: expected ',' or ')' after an argument, found '2'", "1: expected ']' after an index, found ';'",
          "1: expected ':' between the two values of '?', found ';'",
          "2: expected ';' after a declaration, found 'z'"}},
        {"struct S { float a; float 4; float b }; float c = ;",
         {"1: expected a name after the type, found '4'", "1: expected ';' after a declaration, found '}'",
          "1: expected an expression, found ';'"}},
        {"void f( { a; }\nvoid g() { for (i = 0) ; }",
         {"1: expected a type, found '{'", "2: expected ';' after a statement, found ')'"}},
        {"}\nvoid f() {\n if (a) {\n", {"1: '}' closes nothing here", "3: this '{' is never closed"}},
        {"float f() : { }", {"1: expected a semantic after ':', found '{'"}},
        {"float a < string b;\nvoid f() { }", {"1: this annotation is never closed: expected '>'"}},
        {"void f() { asm { mov r0, r1; } }",
         {"1: assembly is not supported: 'asm' blocks cannot be translated"}},
        {"void f() { else a; 1.2.3; v.; do a; } return;",
         {"1: 'else' without 'if'", "1: no number: '1.2.3'",
          "1: expected a member or a swizzle after '.', found ';'",
          "1: expected 'while' after the body of 'do', found '}'", "1: expected a type, found 'return'"}},
        {"float x = 99999999999;", {"1: this number is too large for an int: taken as a float"}},
    };
    for (const Fault& one : faults) {
        SCOPED_TRACE(one.source);
        EXPECT_EQ(Parsed(one.source).messages(), one.messages);
    }
}

constexpr const char* SAMPLE = R"(#include "none.h"
#define LUMA(T) T luma_##T(T##3 c) { return dot(c, T##3(.299, .587, .114)); }
LUMA(half)
struct Light { float3 direction : TEXCOORD1; struct { float power[2]; } inner; float f(float x) { return x; } };
typedef struct { float4 p : POSITION; } Vertex;
uniform sampler2D image : TEXUNIT0 = sampler_state { MinFilter = Linear; };
static const float taps[3] = { 1, { 2 }, 3.5e1f };
float gain < string ui = "slider"; > = 1.0;
technique T { pass P { } }
#if defined(A) && (1 + 2 << 3) // text
#else
float4 main(Vertex v, uniform Light lights[2], out float d : DEPTH) : COLOR0 {
    [unroll] for (int i = 0, j = 1; i < 3; ++i, j--) { if (i == 2) break; else continue; }
    do { d -= (float)lights[1].inner.power[0] * 1.0.x; } while (d > .5 && !false);
    switch (1) { case 0: default: discard(d < 0); }
    return float4(1, float2[](v.p.xy)[0], luma_half(half3(1))) * (d != 0 ? gain : -taps[2]);
}
#endif
)";

/// Every text is parsed to its end: no crash, no hang, and no error lost.
TEST(CgParser, SurvivesEveryTruncationAndMutation) {
    const std::string sample = SAMPLE;
    for (std::size_t length = 0; length <= sample.size(); ++length)
        const Parsed parsed(sample.substr(0, length));
    std::uint32_t random = 1;
    const auto next = [&random](std::size_t below) {
        random = random * 1664525U + 1013904223U;
        return (random >> 8) % below;
    };
    const std::string bytes = "{}()[]<>;:,.#\"\\/*=+-!?0x \n\x80";
    for (int round = 0; round < 3000; ++round) {
        std::string mutant = sample;
        for (std::size_t change = next(4); change < 4; ++change) {
            const std::size_t at = next(mutant.size() - 40);
            const std::size_t kind = next(3);
            if (kind == 0)
                mutant[at] = bytes[next(bytes.size())];
            else if (kind == 1)
                mutant.erase(at, next(30));
            else
                mutant.insert(at, mutant.substr(next(mutant.size() - 30), next(30)));
        }
        const Parsed parsed(mutant);
    }
}

std::string repeated(const std::string& text, std::size_t count) {
    std::string result;
    for (std::size_t i = 0; i < count; ++i)
        result += text;
    return result;
}

/// Nesting is refused where a walk of the tree could run out of stack; what is only long is taken.
TEST(CgParser, BoundsNesting) {
    constexpr std::size_t DEEP = 20000;
    const std::vector<std::string> refused{
        "float x = " + repeated("(", DEEP),
        "float x = " + repeated("-", DEEP) + "1;",
        "float x = " + repeated("{", DEEP),
        "float x = " + repeated("f(", DEEP),
        "float x = " + repeated("a[", DEEP),
        "float x = " + repeated("(float)", DEEP) + "1;",
        "float x = " + repeated("1?", DEEP),
        "float x = " + repeated("1?2:", DEEP) + "3;",
        "float x = " + repeated("a=", DEEP),
        "float x = 1" + repeated("+1", DEEP) + ";",
        "float x = a" + repeated(".x", DEEP),
        "float x = a" + repeated("[0]", DEEP) + ";",
        "float x = f" + repeated("()", DEEP),
        "float x = (1" + repeated(",1", DEEP) + ");",
        "void f() " + repeated("{", DEEP),
        "void f() { " + repeated("if (a) ", DEEP),
        "void f() { " + repeated("if (a) ; else ", DEEP) + ";}",
        repeated("struct A { ", DEEP),
        "float x" + repeated("[", DEEP),
        "void f() { " + repeated("for (;;) ", DEEP),
        "void f() { " + repeated("float[", DEEP),
    };
    for (const std::string& source : refused) {
        SCOPED_TRACE(source.substr(0, 40));
        EXPECT_TRUE(Parsed(source).diagnostics.hasErrors());
    }
    EXPECT_EQ(Parsed("float x[] = { 0" + repeated(", 1", DEEP) + "};").messages(),
              std::vector<std::string>());
    EXPECT_EQ(Parsed("void f() { " + repeated("a = 1;", DEEP) + "}").messages(), std::vector<std::string>());
    EXPECT_EQ(Parsed("float x = 1" + repeated("+1", 500) + ";").messages(), std::vector<std::string>());
    EXPECT_EQ(Parsed("void f() { " + repeated("if (a) ; else ", 500) + ";}").messages(),
              std::vector<std::string>());
}

} // namespace
