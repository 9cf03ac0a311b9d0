#include "FindInFilesWindow.h"

#include "ApplicationBase.h"

#include <QCommandLineParser>
#include <QDir>
#include <QFileInfo>

#include <cstdio>

int main(int argc, char** argv)
{
    Gui::Orba::ApplicationBase app(argc, argv);
    // The settings file lives under this name in the user's configuration
    // folder.
    QCoreApplication::setApplicationName(QStringLiteral("findinfiles"));
    QCoreApplication::setApplicationVersion(QStringLiteral(FIF_VERSION));

    QCommandLineParser parser;
    parser.setApplicationDescription(
        QCoreApplication::translate("main", "Finds text in files and shows each result."));
    parser.addHelpOption();
    parser.addVersionOption();
    parser.addPositionalArgument(
        QStringLiteral("FOLDER"),
        QCoreApplication::translate("main", "The folder to search first (default: the "
                                            "current directory)."),
        QStringLiteral("[FOLDER]"));
    parser.process(app);

    const QStringList arguments = parser.positionalArguments();
    if (arguments.size() > 1) {
        std::fprintf(stderr, "%s\n",
                     qPrintable(QCoreApplication::translate("main", "Name one folder at most.")));
        return 2;
    }
    QString folder;
    if (!arguments.isEmpty()) {
        const QFileInfo info(arguments.first());
        if (!info.isDir() || !QDir::setCurrent(info.absoluteFilePath())) {
            std::fprintf(stderr, "%s\n",
                         qPrintable(QCoreApplication::translate("main", "%1 is not a folder that can be opened.")
                                        .arg(arguments.first())));
            return 2;
        }
        // The folder as named, so that the dialog shows what the user typed
        // made absolute rather than a resolved link.
        folder = info.absoluteFilePath();
    }

    FindInFilesWindow window(folder);
    window.show();
    return app.exec();
}
