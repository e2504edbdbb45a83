#include "containers/value/foperationnode.h"

#include "foundation/object/fvariant.h"
#include "foundation/text/string.h"

namespace
{
bool isTrue(const CmVariant& value)
{
    String text;
    if (value.isString())
        return value.getString(text) && !text.isEmpty();
    return value.isObject() || value.getFloat() != 0;
}

/// Numbers wrap around at 64 bits. A division by 0 keeps the first one.
int64 calculate(int operation, int64 left, int64 right)
{
    const auto a = static_cast<uint64>(left);
    const auto b = static_cast<uint64>(right);
    switch (operation)
    {
    case FOperationNode::kAdd:
        return static_cast<int64>(a + b);
    case FOperationNode::kSubtract:
        return static_cast<int64>(a - b);
    case FOperationNode::kMultiply:
        return static_cast<int64>(a * b);
    default:
        break;
    }
    if (right == 0)
        return left;
    return right == -1 ? static_cast<int64>(0 - a) : left / right;
}

double calculate(int operation, double left, double right)
{
    switch (operation)
    {
    case FOperationNode::kAdd:
        return left + right;
    case FOperationNode::kSubtract:
        return left - right;
    case FOperationNode::kMultiply:
        return left * right;
    default:
        return right == 0 ? left : left / right;
    }
}

CmVariant join(const CmVariant& left, const CmVariant& right)
{
    String text, tail;
    left.getString(text);
    right.getString(tail);
    text.append(tail);
    return CmVariant(text.text16(), true);
}

CmVariant calculate(int operation, const CmVariant& left, const CmVariant& right)
{
    if (operation == FOperationNode::kAdd && (left.isString() || right.isString()))
        return join(left, right);
    if (left.isInteger() && right.isInteger())
        return CmVariant(calculate(operation, left.getLong(), right.getLong()));
    return CmVariant(calculate(operation, left.getFloat(), right.getFloat()));
}

bool decide(int operation, const CmVariant& left, const CmVariant& right)
{
    const int order = CmVariant::compareVariants(left, right);
    switch (operation)
    {
    case FOperationNode::kEqual:
        return order == 0;
    case FOperationNode::kNotEqual:
        return order != 0;
    case FOperationNode::kLess:
        return order < 0;
    case FOperationNode::kGreater:
        return order > 0;
    case FOperationNode::kAnd:
        return isTrue(left) && isTrue(right);
    default:
        return isTrue(left) || isTrue(right);
    }
}
} // namespace

void FOperationNode::setOperands(FOperationNode* left, FOperationNode* right)
{
    first = left;
    second = right;
}

CmVariant FOperationNode::evaluate(void* context)
{
    CmVariant left, right;
    if (!evaluateOperands(context, left, right))
        return CmVariant();
    if (operation >= kAdd && operation <= kDivide)
        return calculate(operation, left, right);
    if (operation >= kEqual && operation <= kOr)
        return CmVariant(int64{decide(operation, left, right)});
    return CmVariant();
}

bool FOperationNode::evaluateOperands(void* context, CmVariant& left, CmVariant& right)
{
    if (!first || !second)
        return false;
    left = first->evaluate(context);
    right = second->evaluate(context);
    return true;
}

CmVariant CmVariantConstant::evaluate(void*)
{
    return value;
}
