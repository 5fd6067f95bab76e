#include "libs/postwick/XmlRpcMessage.h"

#include <QDateTime>
#include <QXmlStreamReader>
#include <QXmlStreamWriter>

using namespace Qt::StringLiterals;

namespace XmlRpcMessage {
namespace {

// Deeper answers are refused rather than followed: no blog answer nests this far.
constexpr int kMaxDepth = 64;

void WriteValue(QXmlStreamWriter& xml, const QVariant& value) {
    xml.writeStartElement(u"value"_s);
    switch (value.typeId()) {
    case QMetaType::Int:
        xml.writeTextElement(u"int"_s, QString::number(value.toInt()));
        break;
    case QMetaType::Bool:
        xml.writeTextElement(u"boolean"_s, value.toBool() ? u"1"_s : u"0"_s);
        break;
    case QMetaType::Double:
        xml.writeTextElement(u"double"_s, QString::number(value.toDouble(), 'g', 17));
        break;
    case QMetaType::QByteArray:
        xml.writeTextElement(u"base64"_s, QString::fromLatin1(value.toByteArray().toBase64()));
        break;
    case QMetaType::QDateTime:
        xml.writeTextElement(u"dateTime.iso8601"_s,
                             value.toDateTime().toUTC().toString(u"yyyyMMdd'T'HH:mm:ss"_s));
        break;
    case QMetaType::QVariantMap: {
        xml.writeStartElement(u"struct"_s);
        const QVariantMap map = value.toMap();
        for (auto it = map.cbegin(); it != map.cend(); ++it) {
            xml.writeStartElement(u"member"_s);
            xml.writeTextElement(u"name"_s, it.key());
            WriteValue(xml, it.value());
            xml.writeEndElement();
        }
        xml.writeEndElement();
        break;
    }
    case QMetaType::QVariantList: {
        xml.writeStartElement(u"array"_s);
        xml.writeStartElement(u"data"_s);
        for (const QVariant& item : value.toList())
            WriteValue(xml, item);
        xml.writeEndElement();
        xml.writeEndElement();
        break;
    }
    default:
        xml.writeTextElement(u"string"_s, value.toString());
        break;
    }
    xml.writeEndElement();
}

class Reader {
public:
    explicit Reader(const QByteArray& body) : m_xml(body) {}

    Response Read() {
        Response response;
        if (!NextElement() || m_xml.name() != u"methodResponse"_s)
            return Fail(u"The answer is not an XML-RPC response."_s);
        if (!NextElement())
            return Fail(u"The XML-RPC response is empty."_s);
        if (m_xml.name() == u"fault"_s) {
            if (!NextElement() || m_xml.name() != u"value"_s)
                return Fail(u"The XML-RPC fault carries no value."_s);
            const QVariant fault = ReadValue(0);
            if (m_failed)
                return Fail(m_error);
            response.kind = Response::Kind::Fault;
            const QVariantMap map = fault.toMap();
            response.error = map.value(u"faultString"_s).toString();
            if (response.error.isEmpty())
                response.error = u"The blog refused the request (fault %1)."_s.arg(
                    map.value(u"faultCode"_s).toString());
            return response;
        }
        if (m_xml.name() != u"params"_s || !NextElement() || m_xml.name() != u"param"_s ||
            !NextElement() || m_xml.name() != u"value"_s)
            return Fail(u"The XML-RPC response carries no value."_s);
        response.value = ReadValue(0);
        if (m_failed)
            return Fail(m_error);
        response.kind = Response::Kind::Value;
        return response;
    }

private:
    Response Fail(const QString& why) {
        Response response;
        response.error =
            m_xml.hasError()
                ? u"The answer is not well-formed XML-RPC: %1"_s.arg(m_xml.errorString())
                : why;
        return response;
    }

    // The next start element; false at an end element, the end, or anything that no
    // XML-RPC answer holds.
    bool NextElement() {
        while (!m_xml.atEnd()) {
            switch (m_xml.readNext()) {
            case QXmlStreamReader::StartElement:
                return true;
            case QXmlStreamReader::DTD:
            case QXmlStreamReader::EntityReference:
                m_xml.raiseError(u"declarations are not accepted"_s);
                return false;
            case QXmlStreamReader::EndElement:
                return false;
            case QXmlStreamReader::Characters:
                if (!m_xml.isWhitespace()) {
                    m_xml.raiseError(u"unexpected text"_s);
                    return false;
                }
                break;
            default:
                break;
            }
        }
        return false;
    }

    QVariant Failed(const QString& why) {
        m_failed = true;
        if (m_error.isEmpty())
            m_error = m_xml.hasError()
                          ? u"The answer is not well-formed XML-RPC: %1"_s.arg(m_xml.errorString())
                          : why;
        return {};
    }

    // At the start of <value>: reads it up to and including its end.
    QVariant ReadValue(int depth) {
        if (depth > kMaxDepth)
            return Failed(u"The XML-RPC answer nests too deeply."_s);
        QString text;
        QVariant value;
        bool typed = false;
        while (!m_xml.atEnd()) {
            const QXmlStreamReader::TokenType token = m_xml.readNext();
            if (token == QXmlStreamReader::Characters) {
                text += m_xml.text();
            } else if (token == QXmlStreamReader::StartElement) {
                if (typed)
                    return Failed(u"An XML-RPC value holds two values."_s);
                typed = true;
                value = ReadTyped(depth);
                if (m_failed)
                    return {};
            } else if (token == QXmlStreamReader::EndElement) {
                // An untyped value is a string.
                return typed ? value : QVariant(text);
            } else if (token == QXmlStreamReader::DTD ||
                       token == QXmlStreamReader::EntityReference) {
                return Failed(u"The answer holds declarations."_s);
            }
        }
        return Failed(u"The XML-RPC answer ends inside a value."_s);
    }

    QVariant ReadTyped(int depth) {
        const QString type = m_xml.name().toString();
        if (type == u"struct"_s) {
            QVariantMap map;
            while (NextElement()) {
                if (m_xml.name() != u"member"_s)
                    return Failed(u"An XML-RPC struct holds something else than members."_s);
                QString name;
                QVariant member;
                bool hasValue = false;
                while (NextElement()) {
                    if (m_xml.name() == u"name"_s) {
                        name = m_xml.readElementText();
                    } else if (m_xml.name() == u"value"_s) {
                        member = ReadValue(depth + 1);
                        hasValue = true;
                        if (m_failed)
                            return {};
                    } else {
                        return Failed(u"An XML-RPC member holds an unknown element."_s);
                    }
                }
                if (!hasValue)
                    return Failed(u"An XML-RPC member has no value."_s);
                map.insert(name, member);
            }
            return m_xml.hasError() ? Failed({}) : QVariant(map);
        }
        if (type == u"array"_s) {
            QVariantList list;
            if (!NextElement() || m_xml.name() != u"data"_s)
                return Failed(u"An XML-RPC array has no data."_s);
            while (NextElement()) {
                if (m_xml.name() != u"value"_s)
                    return Failed(u"An XML-RPC array holds something else than values."_s);
                list.append(ReadValue(depth + 1));
                if (m_failed)
                    return {};
            }
            // The end of </data>, then of </array>.
            if (m_xml.hasError() || NextElement())
                return Failed(u"An XML-RPC array is malformed."_s);
            return list;
        }
        const QString text = m_xml.readElementText();
        if (m_xml.hasError())
            return Failed({});
        if (type == u"string"_s)
            return text;
        bool ok = false;
        if (type == u"int"_s || type == u"i4"_s || type == u"i8"_s) {
            const qlonglong number = text.trimmed().toLongLong(&ok);
            return ok ? QVariant(number) : Failed(u"An XML-RPC number is not a number."_s);
        }
        if (type == u"boolean"_s)
            return text.trimmed() == u"1"_s;
        if (type == u"double"_s) {
            const double number = text.trimmed().toDouble(&ok);
            return ok ? QVariant(number) : Failed(u"An XML-RPC number is not a number."_s);
        }
        if (type == u"base64"_s)
            return QByteArray::fromBase64(text.toLatin1());
        if (type == u"dateTime.iso8601"_s)
            return text.trimmed();
        if (type == u"nil"_s)
            return QVariant();
        return Failed(u"The XML-RPC answer holds an unknown type."_s);
    }

    QXmlStreamReader m_xml;
    bool m_failed = false;
    QString m_error;
};

} // namespace

QByteArray MethodCall(const QString& method, const QVariantList& params) {
    QByteArray body;
    QXmlStreamWriter xml(&body);
    xml.writeStartDocument();
    xml.writeStartElement(u"methodCall"_s);
    xml.writeTextElement(u"methodName"_s, method);
    xml.writeStartElement(u"params"_s);
    for (const QVariant& param : params) {
        xml.writeStartElement(u"param"_s);
        WriteValue(xml, param);
        xml.writeEndElement();
    }
    xml.writeEndElement();
    xml.writeEndElement();
    xml.writeEndDocument();
    return body;
}

Response ParseResponse(const QByteArray& body) {
    return Reader(body).Read();
}

} // namespace XmlRpcMessage
