#ifndef CG_COMPILER_RESOLVER_H
#define CG_COMPILER_RESOLVER_H

#include <Cg/Compiler/Compiler.h>
#include <Cg/Compiler/TypedBuilder.h>
#include <Cg/Compiler/TypedTree.h>

#include <functional>
#include <map>
#include <set>
#include <string>
#include <unordered_map>
#include <vector>

namespace cg {

class Diagnostics;
struct BuiltinFunction;

/// Turns the syntax tree into the typed tree: finds what each name means, chooses among overloads, makes
/// conversions explicit, and takes along only what the entry reaches.
///
/// Errors go to the diagnostics; the typed tree is meaningful only where there are none.
class Resolver {
public:
    /// @param plainSamplers  names of samplers that compare no depth, whatever coordinates a look-up has;
    /// takes
    ///                       in those that are found to be looked up both ways, which GLSL has no type for:
    ///                       where it has grown, the program has to be resolved again
    Resolver(const TranslationUnit& unit, Stage stage, Arena& arena, TypeTable& types,
             Diagnostics& diagnostics, std::set<Name>& plainSamplers);

    TypedProgram* resolve(const std::string& entry);

private:
    static constexpr int MAX_ARRAY_LENGTH = 65536;

    struct ScopeEntry {
        Name name;
        Variable* variable; ///< null for a type
        const Type* type;   ///< null for a variable
    };

    /// A variable of a `for` after its loop.
    struct LoopVariable {
        Variable* variable;
        TypedStmt* loop;
    };

    /// What belongs to the function that is being resolved.
    struct Context {
        Function* function = nullptr;
        std::vector<ScopeEntry> scope;
        std::vector<LoopVariable> pastLoops;           ///< of the blocks around
        std::vector<TypedStmt*>* statements = nullptr; ///< of the innermost block
        Variable* self = nullptr;                      ///< a method's object
        Variable* declared = nullptr;                  ///< the one whose initial value is being resolved
        bool isDeclaredUsed = false;                   ///< that value names its own variable
        std::size_t ordinal = 0;                       ///< of the function's declaration
        int loops = 0;                                 ///< around the statement
        int switches = 0;
        bool hasReturn = false;
    };

    struct Signature {
        std::vector<const Type*> parameters;
        const Type* result = nullptr; ///< null after an error
    };

    /// Where the values of an initializer list are taken from.
    struct ListCursor {
        const std::vector<Expr*>& elements;
        std::size_t next = 0;
        TypedExpr* value = nullptr; ///< the resolved next element
        int component = 0;          ///< of `value`, where only a part of it is used
    };

    // Declarations
    void collect();
    void collectDefinition(const TypeSyntax* type);
    const Type* findType(Name name);
    const Type* typeOf(const TypeSyntax* syntax);
    const Type* typeOf(const TypeSyntax* syntax, const std::vector<Expr*>& dimensions);
    const Type* withDimensions(SourceLocation at, const Type* type, const std::vector<Expr*>& dimensions);
    const Type* structType(const StructDecl* declaration);
    void fillStruct(const Type* type);
    int arrayLength(const Expr* dimension);
    const Type* checkSize(SourceLocation at, const Type* type);
    Variable* globalVariable(const VariableDecl* declaration);
    void resolveGlobal(Variable* variable, const VariableDecl* declaration);
    void bindState(Variable* variable);
    bool implements(const Type* type, const Type* interface) const;

    // Initializers
    TypedExpr* initializer(const Type*& type, const Expr* expression);
    TypedExpr* fromList(const Type* type, const InitListExpr* list);
    const Type* sizedByList(const Type* type, const InitListExpr* list);
    TypedExpr* fill(const Type* type, ListCursor& cursor);
    TypedExpr* fillPieces(SourceLocation at, const Type* type, ListCursor& cursor);
    TypedExpr* fillNumber(const Type* type, ListCursor& cursor);
    TypedExpr* nextValue(ListCursor& cursor);
    bool isAtEnd(const ListCursor& cursor) const { return cursor.next >= cursor.elements.size(); }

    // Functions
    Function* instance(const FunctionDecl* declaration, const std::vector<const Type*>& types,
                       Variable* selfModel);
    void resolveBody(Function* function, const FunctionDecl* definition,
                     const std::vector<const Type*>& types, Variable* selfModel);
    const FunctionDecl* definitionOf(const FunctionDecl* declaration);
    const Signature& signatureOf(const FunctionDecl* declaration);
    std::string describe(const FunctionDecl* declaration);
    Variable* makeVariable(Variable::Storage storage, Name name, const Type* type,
                           const VariableDecl* declaration);
    Variable* temporary(const Type* type);
    void addSamplerParameters(Function* function, Variable* parameter);

    // Statements
    TypedStmt* statement(const Stmt* stmt);
    TypedStmt* block(const BlockStmt* stmt);
    TypedStmt* scoped(const Stmt* stmt);
    TypedStmt* ifStatement(const IfStmt* stmt);
    TypedStmt* declarations(const DeclStmt* stmt);
    void declareLocal(const VariableDecl* declaration, std::vector<TypedStmt*>& out);
    TypedStmt* loop(const LoopStmt* stmt);
    TypedStmt* forLoop(const ForStmt* stmt);
    Variable* outliveLoop(SourceLocation at, Name name);
    Variable* ownValue(const NameExpr* expr);
    TypedStmt* leave(const Stmt* stmt);
    void endBody(Function* function, const FunctionDecl* definition);
    TypedStmt* returnStatement(const JumpStmt* stmt);
    TypedStmt* discardStatement(const JumpStmt* stmt);
    TypedStmt* switchStatement(const SwitchStmt* stmt);
    TypedStmt* expressionStatement(TypedExpr* expression);

    // Expressions: null after an error
    TypedExpr* expression(const Expr* expr);
    TypedExpr* literal(const LiteralExpr* expr);
    TypedExpr* name(const NameExpr* expr);
    TypedExpr* member(const MemberExpr* expr);
    TypedExpr* memberOf(SourceLocation at, TypedExpr* object, Name name);
    TypedExpr* swizzle(SourceLocation at, TypedExpr* object, Name name);
    TypedExpr* matrixElements(SourceLocation at, TypedExpr* matrix, Name name);
    TypedExpr* index(const IndexExpr* expr);
    TypedExpr* elementOf(SourceLocation at, TypedExpr* object, TypedExpr* index);
    TypedExpr* constructor(const ConstructExpr* expr);
    TypedExpr* constructArray(SourceLocation at, const Type* type, const std::vector<Expr*>& arguments);
    TypedExpr* constructStruct(SourceLocation at, const Type* type, const std::vector<Expr*>& arguments);
    TypedExpr* castExpression(const CastExpr* expr);
    TypedExpr* unary(const UnaryExpr* expr);
    TypedExpr* binary(const BinaryExpr* expr);
    TypedExpr* assignment(const AssignExpr* expr);
    TypedExpr* assignElements(const AssignExpr* expr, const MemberExpr* target, TypedExpr* matrix);
    TypedExpr* assignRow(SourceLocation at, TypedExpr* target, TypedExpr* value);
    TypedExpr* conditional(const ConditionalExpr* expr);
    TypedExpr* stateVariable(const Expr* expr);
    bool checkAssignable(SourceLocation at, TypedExpr* target);
    TypedExpr* nothing(SourceLocation at);
    Variable* findVariable(Name name);
    TypedExpr* useVariable(SourceLocation at, Variable* variable);
    TypedExpr* once(TypedExpr* value, TypedExpr*& preparation);
    TypedExpr* useName(const NameExpr* expr, Variable* variable);
    TypedExpr* elementOfUnsized(SourceLocation at, TypedExpr* array, TypedExpr* index);
    static std::string suggestion(Name name, const std::vector<Name>& known);

    // Calls
    TypedExpr* call(const CallExpr* expr);
    TypedExpr* methodCall(SourceLocation at, TypedExpr* object, Name name,
                          std::vector<TypedExpr*>& arguments);
    const FunctionDecl* findMethod(const Type* type, Name name, std::vector<const FunctionDecl*>& candidates);
    std::vector<const FunctionDecl*> candidates(Name name);
    const FunctionDecl* choose(SourceLocation at, Name name,
                               const std::vector<const FunctionDecl*>& candidates,
                               const std::vector<TypedExpr*>& arguments, bool report);
    std::string objection(const FunctionDecl* function, const std::vector<TypedExpr*>& arguments);
    int argumentCost(const VariableDecl* parameter, const Type* type, const TypedExpr* argument);
    TypedExpr* defaultArgument(SourceLocation at, const FunctionDecl* declaration, std::size_t index,
                               const Type* type);
    TypedExpr* callFunction(SourceLocation at, const FunctionDecl* declaration,
                            std::vector<TypedExpr*> arguments, TypedExpr* self);
    TypedExpr* callBuiltin(SourceLocation at, Name name, const std::vector<TypedExpr*>& arguments,
                           bool report, bool withGlslNames, bool& isKnown);
    void refuseBuiltin(SourceLocation at, Name name, const std::vector<BuiltinFunction>& functions,
                       const std::vector<TypedExpr*>& arguments);
    std::string withKnownOffset(const BuiltinFunction& function, std::vector<TypedExpr*>& arguments);
    TypedExpr* passArgument(TypedExpr* argument, const Type* type, Direction direction,
                            std::vector<TypedExpr*>& before, std::vector<TypedExpr*>& after);
    TypedExpr* around(TypedExpr* call, const std::vector<TypedExpr*>& before,
                      const std::vector<TypedExpr*>& after);
    TypedExpr* withKnownSamplers(TypedExpr* call);
    TypedExpr* withKnownSampler(TypedExpr* call);
    TypedExpr* withSimpleOperands(TypedExpr* call, std::size_t position);
    TypedExpr* chooseCall(TypedExpr* call, std::size_t position);
    TypedExpr* chooseCallByIndex(TypedExpr* call, std::size_t position);
    TypedExpr* chosenSampler(SourceLocation at, const FunctionDecl* declaration,
                             const std::vector<TypedExpr*>& arguments);
    TypedExpr* chosenSampler(const FunctionDecl* definition, const std::vector<Stmt*>& body,
                             std::size_t& ways);
    bool isPlainSampler(TypedExpr* sampler) const;

    // Samplers
    TypedExpr* samplerMember(SourceLocation at, TypedExpr* object, Name name, const Type* type);
    Variable* samplerPiece(Variable* owner, const std::string& path, const Type* type);
    TypedExpr* aliasSamplers(SourceLocation at, TypedExpr* target, TypedExpr* value);
    void agree(TypedExpr* sampler, const Type* type);
    void alias(Variable* variable, TypedExpr* sampler);
    TypedExpr* samplerPlace(const Expr* target);
    TypedExpr* assignSampler(SourceLocation at, TypedExpr* target, TypedExpr* value);
    TypedExpr* giveSampler(SourceLocation at, Variable* variable, TypedExpr* sampler);
    TypedExpr* giveListed(SourceLocation at, Variable* root, const std::string& path, const TypedExpr* list);
    TypedExpr* giveElement(SourceLocation at, const TypedExpr* element, TypedExpr* sampler);
    TypedExpr* samplerValue(const Type* type, const Expr* expr);
    TypedExpr* listedSampler(SourceLocation at, TypedExpr* list, TypedExpr* index);
    bool isOfBlocksAround(const Variable* sampler) const;
    TypedExpr* chosenOf(SourceLocation at, TypedExpr* condition, TypedExpr* whenTrue, TypedExpr* whenFalse);
    bool isUnset(const TypedExpr* sampler) const;
    TypedStmt* withSelectors(SourceLocation at, const std::function<TypedStmt*()>& resolve);
    bool addSelector(SourceLocation at, Variable* variable, const std::vector<TypedExpr*>& given,
                     std::vector<TypedStmt*>& before);
    TypedExpr* numberOf(SourceLocation at, const std::vector<TypedExpr*>& samplers, TypedExpr* sampler);
    TypedExpr* frozen(TypedExpr* sampler, TypedExpr*& preparation);

    // The entry
    void refuseEntry(const std::string& entry);
    void resolveEntry(const FunctionDecl* declaration);
    bool isUniformParameter(const VariableDecl* parameter, const Type* type);
    bool hasSemantics(const Type* type) const;
    Variable* uniformVariable(const VariableDecl* declaration, const Type* type);
    void addUniformSamplers(Variable* inner, Variable* outer);
    void addStageValues(TypedExpr* place, std::string semantic, Name name, bool isOutput);
    void addGlobals();

    const TranslationUnit& mUnit;
    const Stage mStage;
    Arena& mArena;
    TypeTable& mTypes;
    Diagnostics& mDiagnostics;
    std::set<Name>& mPlainSamplers;
    TypedBuilder mBuild;
    TypedProgram* mProgram;

    std::unordered_map<Name, const StructDecl*> mStructDecls;
    std::unordered_map<Name, const TypedefDecl*> mTypedefs;
    std::unordered_map<Name, std::vector<const FunctionDecl*>> mFunctionDecls;
    std::unordered_map<Name, std::vector<const FunctionDecl*>> mOutsideMethods; ///< by owner
    std::unordered_map<Name, const VariableDecl*> mGlobalDecls;
    std::unordered_map<const FunctionDecl*, std::size_t> mOrdinals;

    std::unordered_map<const StructDecl*, const Type*> mStructTypes;
    std::unordered_map<const TypedefDecl*, const Type*> mTypedefTypes;
    std::unordered_map<const VariableDecl*, Variable*> mGlobals;
    std::unordered_map<const FunctionDecl*, Signature> mSignatures;
    struct Instance {
        std::vector<const Type*> types;
        bool hasWritableSelf;
        Function* function;
    };
    std::unordered_map<const FunctionDecl*, std::vector<Instance>> mInstances;

    /// A sampler variable and what it stood for before.
    struct Aliasing {
        Variable* variable;
        TypedExpr* before;
    };

    /// A sampler that was given to a variable.
    struct Gift {
        Variable* variable;
        TypedExpr* sampler;
        const Function* giver;
    };

    /// A sampler variable that changes in a loop or a `switch`: a number says which of these it stands for.
    struct Selector {
        Variable* number;
        std::vector<TypedExpr*> samplers;
    };

    std::vector<Aliasing> mAliased; ///< in their order
    std::unordered_map<const TypedExpr*, std::map<std::size_t, TypedExpr*>>
        mListedSamplers; ///< of structs made from lists, by field
    std::unordered_map<const Variable*, std::set<const Function*>>
        mSamplerUsers;        ///< functions that are resolved once, of the samplers of the program
    std::vector<Gift> mGifts; ///< all of them, also those of branches
    std::unordered_map<const Variable*, Selector> mSelectors; ///< of the loops and switches around
    int mSelections = 0;
    const Expr* mIndexed = nullptr; ///< what stands before the brackets that are being resolved
    Context mContext;
    int mCallDepth = 0;
    int mDefaultArguments = 0;
    int mSamplerCalls = 0;
    std::size_t mChosenCalls = 0; ///< that stand for calls with samplers to be chosen
};

} // namespace cg

#endif
