#pragma once

#include "IOInterfaceQt/RegisterTypes.h"

#include <QtQml/QQmlComponent>
#include <QtQml/QQmlContext>
#include <QtQml/QQmlEngine>

#include <memory>
#include <string>

/// Evaluates expressions in QML with all modules of the room imported, and collects the warnings on the way.
class QmlEvaluator
{
public:
    QmlEvaluator()
    {
        TQL::IO::RegisterQmlTypes();
        s_pWarnings = &m_Warnings;
        m_pPrevious = qInstallMessageHandler([](QtMsgType, const QMessageLogContext&, const QString& i_rText)
                                             { *s_pWarnings += i_rText.toStdString() + "\n"; });
    }
    ~QmlEvaluator() { qInstallMessageHandler(m_pPrevious); }
    QmlEvaluator(const QmlEvaluator&) = delete;
    QmlEvaluator& operator=(const QmlEvaluator&) = delete;

    QQmlContext& Context() { return *m_Engine.rootContext(); }

    /// The value of the expression as JSON, or the text of the error.
    std::string Evaluate(const std::string& i_rExpression)
    {
        QQmlComponent component(&m_Engine);
        component.setData(QByteArray("import QtQml\nimport Zarvo.Types\nimport Zarvo.Introspection\nimport Test.Enums\n"
                                     "QtObject { function evaluate() { try { const value = ") +
                              i_rExpression.c_str() +
                              "; return value === undefined ? 'undefined' : JSON.stringify(value) }"
                              " catch (error) { return String(error) } } }",
                          QUrl());
        const std::unique_ptr<QObject> pObject(component.create());
        if (!pObject)
            return component.errorString().toStdString();
        QVariant text;
        QMetaObject::invokeMethod(pObject.get(), "evaluate", Q_RETURN_ARG(QVariant, text));
        return text.toString().toStdString();
    }

    /// All warnings since the last call, one a line.
    std::string TakeWarnings() { return std::exchange(m_Warnings, {}); }

private:
    static inline std::string* s_pWarnings = nullptr;
    std::string m_Warnings;
    QtMessageHandler m_pPrevious = nullptr;
    QQmlEngine m_Engine;
};
