// Stands in for the user's file manager on a session bus: writes each call and its arguments to a file, a
// line a call. Usage: test-file-manager FILE READY. Makes the file READY once it can be called.
#include <QCoreApplication>
#include <QDBusConnection>
#include <QDBusMessage>
#include <QDBusVirtualObject>
#include <QStringList>

#include <fstream>
#include <string>

namespace {

class FileManager : public QDBusVirtualObject {
  public:
    explicit FileManager(const char* file) : mFile(file) {}
    QString introspect(const QString&) const override { return {}; }
    bool handleMessage(const QDBusMessage& message, const QDBusConnection& connection) override {
        std::string line = message.member().toStdString();
        for (const QString& uri : message.arguments().value(0).toStringList())
            line += " " + uri.toStdString();
        std::ofstream(mFile, std::ios::app) << line << "\n";
        connection.send(message.createReply());
        return true;
    }

  private:
    const std::string mFile;
};

} // namespace

int main(int count, char** arguments) {
    if (count != 3)
        return 2;
    QCoreApplication application(count, arguments);
    FileManager manager(arguments[1]);
    QDBusConnection bus = QDBusConnection::sessionBus();
    if (!bus.registerVirtualObject(QStringLiteral("/org/freedesktop/FileManager1"), &manager) ||
        !bus.registerService(QStringLiteral("org.freedesktop.FileManager1")))
        return 1;
    std::ofstream ready(arguments[2]);
    return QCoreApplication::exec();
}
