#include "network/replyerror.h"

ErrorCode asynchronousErrorCode(QNetworkReply::NetworkError error)
{
    switch (error) {
    case QNetworkReply::NoError:
        return NET_SUCCESS;
    case QNetworkReply::ConnectionRefusedError:
        return NET_REFUSED;
    case QNetworkReply::HostNotFoundError:
        return NET_HOST_NOT_FOUND;
    case QNetworkReply::TimeoutError:
        return NET_TIMEOUT;
    case QNetworkReply::OperationCanceledError:
        return NET_CANCELED;
    case QNetworkReply::ContentAccessDenied:
    case QNetworkReply::ContentNotFoundError:
        return NET_CONTENT_ERROR;
    default:
        return NET_FAILED;
    }
}

ErrorCode synchronousErrorCode(QNetworkReply::NetworkError error)
{
    switch (error) {
    case QNetworkReply::UnknownContentError:
        return NET_SUCCESS;
    case QNetworkReply::ContentOperationNotPermittedError:
        return NET_NOT_PERMITTED;
    default:
        return asynchronousErrorCode(error);
    }
}
