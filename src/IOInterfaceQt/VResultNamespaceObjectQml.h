#pragma once

#include "IOInterfaceQt/VReadOnlyPropertyMap.h"
#include "TQL/IResult.h"

namespace TQL::IO
{

/// Results for QML, there the singleton Result of module Zarvo.Types. Its properties are three maps of numbers: Mask
/// (the parts of a result word), Category, and Code, with the whole word of every result by name. All numbers are
/// without a sign. The operations take what a native operation returned, or such a number.
class VResultNamespaceObjectQml : public VReadOnlyPropertyMap
{
    Q_OBJECT

public:
    explicit VResultNamespaceObjectQml(QObject* i_pParent = nullptr);

    Q_INVOKABLE bool isOk(TQL::IResult i_Result) const { return i_Result.IsSuccess(); } ///< also with a remark
    Q_INVOKABLE bool isError(TQL::IResult i_Result) const { return i_Result.IsError(); }
    Q_INVOKABLE QString description(TQL::IResult i_Result) const;
    Q_INVOKABLE uint code(TQL::IResult i_Result) const { return i_Result.Value(); } ///< the whole word
    Q_INVOKABLE uint category(TQL::IResult i_Result) const { return i_Result.Category(); }
};

} // namespace TQL::IO
