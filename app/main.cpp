#include "FindInFilesWindow.h"

#include "ApplicationBase.h"

#include <QCommandLineParser>
#include <QDir>
#include <QFileInfo>
#include <QGuiApplication>

#include <cstdio>
#include <cstring>

namespace {

void describe(QCommandLineParser& parser)
{
    // The settings file lives under this name in the user's configuration
    // folder; the desktop entry, under which a desktop lists the windows.
    QCoreApplication::setApplicationName(QStringLiteral("findinfiles"));
    QCoreApplication::setApplicationVersion(QStringLiteral(FIF_VERSION));
    QGuiApplication::setDesktopFileName(QStringLiteral("findinfiles"));

    parser.setApplicationDescription(
        QCoreApplication::translate("main", "Finds text in files and shows each result."));
    parser.addHelpOption();
    parser.addVersionOption();
    parser.addPositionalArgument(
        QStringLiteral("FOLDER"),
        QCoreApplication::translate("main", "The folder to search first (default: the "
                                            "current directory)."),
        QStringLiteral("[FOLDER]"));
}

// Whether the arguments ask only for the help or the version, which are
// answered without a display.
bool asksForText(int argc, char** argv)
{
    for (int i = 1; i < argc && std::strcmp(argv[i], "--") != 0; ++i) {
        for (const char* option : {"-h", "-?", "--help", "--help-all", "-v", "--version"}) {
            if (std::strcmp(argv[i], option) == 0)
                return true;
        }
    }
    return false;
}

} // namespace

int main(int argc, char** argv)
{
    if (asksForText(argc, argv)) {
        QCoreApplication app(argc, argv);
        QCommandLineParser parser;
        describe(parser);
        parser.process(app); // prints and ends the program
    }

    Gui::Orba::ApplicationBase app(argc, argv);
    QCommandLineParser parser;
    describe(parser);
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
