#pragma once

#include "containers/value/foperationnode.h"

/// An operation that also knows patterns: `kMatch` asks whether the first operand's text matches the second's as a
/// wildcard pattern, case respected, and `kNoMatch` the opposite; both give 0 or 1.
///
/// One thread at a time.
class CmVariantOperation : public FOperationNode
{
    DECLARE_TYPE(CmVariantOperation, FOperationNode)

    explicit CmVariantOperation(int code) : FOperationNode(code) {}

    /// Its body stands with the patterns.
    CmVariant evaluate(void* context) override;
};
