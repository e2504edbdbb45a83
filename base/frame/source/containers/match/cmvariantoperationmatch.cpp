#include "containers/match/cmregularexpression.h"
#include "containers/value/cmvariantoperation.h"
#include "foundation/object/fvariant.h"

CmVariant CmVariantOperation::evaluate(void* context)
{
    const bool expectsMatch = getOperation() == kMatch;
    if (!expectsMatch && getOperation() != kNoMatch)
        return FOperationNode::evaluate(context);

    CmVariant left, right;
    if (!evaluateOperands(context, left, right))
        return CmVariant();
    String text, expression;
    left.getString(text);
    right.getString(expression);
    return CmVariant(int64{CmRegularExpression(expression.text16()).match(text.text16()) == expectsMatch});
}
