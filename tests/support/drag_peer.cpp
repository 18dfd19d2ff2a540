// A program that knows nothing of the kits, to drag from and to drop on. Qt alone.
//
//   drag_peer offer X Y URI...    a red window; a drag from it offers the files, to copy
//   drag_peer accept X Y          a green window; prints the formats of what is dropped on it, and its list
//   of files
//
// Prints "ready" when the window shows, "began" and "ended ACTION" for a drag, "dropped FORMAT..." and one
// line "file URI" each.
#include <QBackingStore>
#include <QDrag>
#include <QDropEvent>
#include <QGuiApplication>
#include <QMimeData>
#include <QPainter>
#include <QUrl>
#include <QWindow>

#include <cstdio>

namespace {

class PeerWindow : public QWindow {
  public:
    PeerWindow(bool offers, QList<QUrl> files) : offers_(offers), files_(std::move(files)), store_(this) {
        setSurfaceType(QSurface::RasterSurface);
        setTitle(offers ? "Offering peer" : "Accepting peer");
    }

  protected:
    void exposeEvent(QExposeEvent*) override {
        if (!isExposed())
            return;
        store_.resize(size());
        const QRect all(QPoint(), size());
        store_.beginPaint(all);
        QPainter painter(store_.paintDevice());
        painter.fillRect(all, offers_ ? Qt::red : Qt::green);
        painter.end();
        store_.endPaint();
        store_.flush(all);
        if (!ready_)
            say("ready");
        ready_ = true;
    }
    void mouseMoveEvent(QMouseEvent* event) override {
        if (!offers_ || (event->buttons() & Qt::LeftButton) == 0 || dragging_)
            return;
        dragging_ = true;
        say("began");
        auto* const drag = new QDrag(this);
        auto* const data = new QMimeData;
        data->setUrls(files_);
        drag->setMimeData(data);
        const Qt::DropAction action = drag->exec(Qt::CopyAction | Qt::MoveAction, Qt::MoveAction);
        say(action == Qt::CopyAction   ? "ended copy"
            : action == Qt::MoveAction ? "ended move"
                                       : "ended nothing");
        dragging_ = false;
    }
    bool event(QEvent* event) override {
        if (event->type() == QEvent::DragEnter || event->type() == QEvent::DragMove) {
            static_cast<QDropEvent*>(event)->setDropAction(Qt::CopyAction);
            event->setAccepted(!offers_);
            return true;
        }
        if (event->type() == QEvent::Drop) {
            auto* const drop = static_cast<QDropEvent*>(event);
            say("dropped " + drop->mimeData()->formats().join(' ').toStdString());
            for (const QUrl& file : drop->mimeData()->urls())
                say("file " + file.toEncoded().toStdString());
            drop->setDropAction(Qt::CopyAction);
            drop->accept();
            return true;
        }
        return QWindow::event(event);
    }

  private:
    static void say(const std::string& line) {
        std::printf("%s\n", line.c_str());
        std::fflush(stdout);
    }

    const bool offers_;
    const QList<QUrl> files_;
    QBackingStore store_;
    bool dragging_ = false;
    bool ready_ = false;
};

} // namespace

int main(int argc, char** argv) {
    QGuiApplication application(argc, argv);
    const QStringList words = QGuiApplication::arguments();
    if (words.size() < 4)
        return 2;
    QList<QUrl> files;
    for (const QString& word : words.mid(4))
        files.append(QUrl(word));
    PeerWindow window(words[1] == "offer", files);
    window.setGeometry(words[2].toInt(), words[3].toInt(), 200, 150);
    window.show();
    return QGuiApplication::exec();
}
