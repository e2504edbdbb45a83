#pragma once

#include "containers/value/cmvariant.h"
#include "foundation/object/iptr.h"

/// Node of a tree that computes a value: an operation on what two operand nodes give, or a leaf.
///
/// A node holds a reference to each operand. One thread at a time.
class FOperationNode : public CmObject
{
    DECLARE_TYPE(FOperationNode, CmObject)

    /// The numbers are those by which an expression names its operation.
    enum Operation
    {
        kNothing,
        kAdd,
        kSubtract,
        kMultiply,
        kDivide,
        kEqual,
        kNotEqual,
        kLess,
        kGreater,
        kAnd,
        kOr,
        kMatch,
        kNoMatch
    };

    explicit FOperationNode(int code) : operation(code) {}

    void setOperands(FOperationNode* left, FOperationNode* right);
    int getOperation() const { return operation; }

    /// `context` is handed on to the leaves. Empty where an operand is missing or the operation unknown. Two
    /// integers give an integer, other numbers a fraction; a sum with a text joins texts; a division by 0 gives
    /// the first operand; comparisons and logic give 0 or 1.
    virtual CmVariant evaluate(void* context);

protected:
    /// Evaluates both operands; false where one is missing.
    bool evaluateOperands(void* context, CmVariant& left, CmVariant& right);

private:
    int operation;
    IPtr<FOperationNode> first;
    IPtr<FOperationNode> second;
};

/// A leaf of the tree: a constant.
class CmVariantConstant : public FOperationNode
{
    DECLARE_TYPE(CmVariantConstant, FOperationNode)

    explicit CmVariantConstant(const CmVariant& constant) : FOperationNode(kNothing), value(constant) {}

    CmVariant evaluate(void* context) override;

private:
    CmVariant value;
};
