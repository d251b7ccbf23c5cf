#include "IOInterfaceQt/DenyNetworkAccess.h"

#include <QtNetwork/QNetworkAccessManager>
#include <QtNetwork/QNetworkReply>
#include <QtQml/QQmlEngine>
#include <QtQml/QQmlNetworkAccessManagerFactory>

namespace TQL::IO
{
namespace
{

/// Has failed before anybody looks at it, and tells so from the event loop as any reply does.
class RefusedReply : public QNetworkReply
{
public:
    RefusedReply(QNetworkAccessManager::Operation i_Operation, const QNetworkRequest& i_rRequest, QObject* i_pParent)
        : QNetworkReply(i_pParent)
    {
        setOperation(i_Operation);
        setRequest(i_rRequest);
        setUrl(i_rRequest.url());
        setError(ContentAccessDenied, QStringLiteral("There is no network access from here."));
        setFinished(true);
        open(ReadOnly | Unbuffered);
        QMetaObject::invokeMethod(
            this,
            [this]
            {
                Q_EMIT errorOccurred(ContentAccessDenied);
                Q_EMIT finished();
            },
            Qt::QueuedConnection);
    }

    void abort() override {}

protected:
    qint64 readData(char*, qint64) override { return -1; }
};

class RefusingManager : public QNetworkAccessManager
{
public:
    using QNetworkAccessManager::QNetworkAccessManager;

protected:
    QNetworkReply* createRequest(Operation i_Operation, const QNetworkRequest& i_rRequest, QIODevice*) override
    {
        return new RefusedReply(i_Operation, i_rRequest, this);
    }
};

/// Called on the threads that load things, too.
class RefusingFactory : public QQmlNetworkAccessManagerFactory
{
public:
    QNetworkAccessManager* create(QObject* i_pParent) override { return new RefusingManager(i_pParent); }
};

} // namespace

void DenyNetworkAccess(QQmlEngine& i_rEngine)
{
    static RefusingFactory s_Factory; // has no state and outlives every engine
    i_rEngine.setNetworkAccessManagerFactory(&s_Factory);
}

} // namespace TQL::IO
