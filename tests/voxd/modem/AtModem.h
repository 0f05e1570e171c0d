#pragma once

#include <QLocalServer>
#include <QLocalSocket>
#include <QString>

#include <map>

namespace kestrum {

/// A modem of AT commands on an abstract Unix socket, enough for ModemManager's generic plugin: registered on LTE, with
/// the levels that the test sets (3GPP TS 27.007).
class AtModem {
public:
    explicit AtModem(const QString& port)
    {
        _server.setSocketOptions(QLocalServer::AbstractNamespaceOption);
        QObject::connect(&_server, &QLocalServer::newConnection, &_server, [this] {
            while (auto* const peer = _server.nextPendingConnection())
                QObject::connect(peer, &QLocalSocket::readyRead, peer, [this, peer] { serve(*peer); });
        });
        _listens = _server.listen(port);
    }

    bool listens() const { return _listens; }
    /// dBm, -140 to -44.
    void setRsrp(int dbm) { answers["AT+CESQ"] = QString("+CESQ: 99,99,255,255,20,%1").arg(dbm + 141); }

    /// The lines before "OK", by command. Every other command is an error.
    std::map<QString, QString> answers{
        {"AT", ""},
        {"ATE0", ""},
        {"ATV1", ""},
        {"ATX4", ""},
        {"AT&C1", ""},
        {"AT+CMEE=1", ""},
        {"AT+IFC=1,1", ""},
        {"ATI", "Manufacturer: Test\r\nModel: Fake\r\nRevision: 1"},
        {"AT+GCAP", "+GCAP: +CGSM +DS +ES"},
        {"AT+CGMI", "Test"},
        {"AT+CGMM", "Fake"},
        {"AT+CGMR", "1"},
        {"AT+CGSN", "123456789012345"},
        {"AT+CIMI", "001010123456789"},
        {"AT+WS46=?", "+WS46: (12,22,25,28,29)"},
        {"AT+CGDCONT=?", "+CGDCONT: (1-11),\"IP\",,,(0-2),(0-3)"},
        {"AT+CLCK=?", "+CLCK: (\"SC\",\"AO\",\"PS\",\"FD\")"},
        {"AT+CLCK=\"SC\",2", "+CLCK: 1"},
        {"AT+CLCK=\"FD\",2", "+CLCK: 0"},
        {"AT+CLCK=\"PS\",2", "+CLCK: 0"},
        {"AT+CFUN?", "+CFUN: 1"},
        {"AT+CFUN=1", ""},
        {"AT+CFUN=4", ""},
        {"AT+CPIN?", "+CPIN: READY"},
        {"AT+CSCS=?", "+CSCS: (\"IRA\",\"UCS2\",\"GSM\")"},
        {"AT+CSCS=\"UCS2\"", ""},
        {"AT+CSCS?", "+CSCS: \"UCS2\""},
        {"AT+CREG=?", "+CREG: (0-2)"},
        {"AT+CGREG=?", "+CGREG: (0-2)"},
        {"AT+CEREG=?", "+CEREG: (0-2)"},
        {"AT+CREG=2", ""},
        {"AT+CGREG=2", ""},
        {"AT+CEREG=2", ""},
        {"AT+CREG=0", ""},
        {"AT+CGREG=0", ""},
        {"AT+CEREG=0", ""},
        {"AT+CREG?", "+CREG: 2,1,\"1502\",\"001A2301\",7"},
        {"AT+CGREG?", "+CGREG: 2,1,\"1502\",\"001A2301\",7"},
        {"AT+CEREG?", "+CEREG: 2,1,\"1502\",\"001A2301\",7"},
        {"AT+COPS=3,2", ""},
        {"AT+COPS=3,0", ""},
        {"AT+COPS?", "+COPS: 0,2,\"00101\",7"},
        {"AT+COPS=3,2;+COPS?", "+COPS: 0,2,\"00101\",7"},
        {"AT+COPS=3,0;+COPS?", "+COPS: 0,0,\"Test Net\",7"},
        {"AT+CMGF=?", "+CMGF: (0,1)"},
        {"AT+CMGF=0", ""},
        {"AT+CSQ", "+CSQ: 17,99"},
        {"AT+CESQ=?", "+CESQ: (0-63,99),(0-7,99),(0-96,255),(0-49,255),(0-34,255),(0-97,255)"},
    };

private:
    void serve(QLocalSocket& peer)
    {
        auto& begun = _begun[&peer];
        begun += peer.readAll();
        for (qsizetype end = begun.indexOf('\r'); end >= 0; end = begun.indexOf('\r')) {
            const QString command = QString::fromLatin1(begun.left(end)).trimmed();
            begun.remove(0, end + 1);
            if (command.isEmpty())
                continue;
            const auto found = answers.find(command);
            QString reply = "\r\nERROR\r\n";
            if (found != answers.end())
                reply = (found->second.isEmpty() ? "" : "\r\n" + found->second + "\r\n") + QString("\r\nOK\r\n");
            peer.write(reply.toLatin1());
        }
    }

    QLocalServer _server;
    bool _listens = false;
    std::map<QLocalSocket*, QByteArray> _begun; ///< the beginning of each connection's next command
};

} // namespace kestrum
