#pragma once

#include <QByteArray>
#include <QString>
#include <QVariant>

// The XML-RPC wire format. Values map to QVariant: QString <string>, int <int>, bool <boolean>,
// double <double>, QByteArray <base64>, QDateTime <dateTime.iso8601>, QVariantMap <struct>,
// QVariantList <array>.
namespace XmlRpcMessage {

QByteArray MethodCall(const QString& method, const QVariantList& params);

struct Response {
    enum class Kind { Value, Fault, Malformed };
    Kind kind = Kind::Malformed;
    QVariant value;
    // A fault's faultString, or what was wrong with a malformed answer.
    QString error;
};

// Reads a methodResponse; anything else (HTML, a DTD, stray text) is Malformed.
Response ParseResponse(const QByteArray& body);

} // namespace XmlRpcMessage
