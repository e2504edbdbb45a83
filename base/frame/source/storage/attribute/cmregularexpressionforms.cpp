#include "containers/match/cmregularexpression.h"
#include "storage/attribute/farchive.h"
#include "storage/attribute/fattributes.h"
#include "storage/stream/fstream.h"

static constexpr const char* kExpressionKey = "expression";
static constexpr const char* kCaseSensitiveKey = "caseSensitive";

bool CmRegularExpression::externalize(FArchive& archive) const
{
    return expression.externalize(archive) && archive.getStream().writeBool(caseSensitive);
}

bool CmRegularExpression::internalize(FArchive& archive)
{
    return expression.internalize(archive) && archive.getStream().readBool(caseSensitive);
}

bool CmRegularExpression::storeAttributes(FAttributes& attributes) const
{
    return attributes.set(kExpressionKey, expression) && attributes.set(kCaseSensitiveKey, caseSensitive);
}

bool CmRegularExpression::restoreAttributes(FAttributes& attributes)
{
    return attributes.get(kExpressionKey, expression) && attributes.get(kCaseSensitiveKey, caseSensitive);
}
