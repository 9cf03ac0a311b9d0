#include "FifCommandLine.h"

#include <QCommandLineParser>
#include <QObject>

namespace Gui {
namespace Orba {

FifCommandLine::Result FifCommandLine::parse(const QStringList& arguments)
{
    QCommandLineParser parser;
    parser.setApplicationDescription(
        tr("Searches the text files below the folders for lines matching PATTERN and "
           "prints each as \"file (line): text\"; the counts go to standard error.\n"
           "Exit status: 0 lines found, 1 none found, 2 bad expression or arguments, or a "
           "folder that cannot be searched."));
    const QCommandLineOption filter(
        QStringLiteral("filter"),
        tr("File-name patterns separated by \";\", matched without regard to case. A "
           "pattern starting with \"!\" excludes the files and folders whose names match "
           "it, and folders so excluded are not entered, e.g. "
           "\"*.cpp;*.h;!moc_*;!build;!.git\". Exclusions alone mean every file not "
           "excluded."),
        tr("patterns"), QStringLiteral("*"));
    const QCommandLineOption matchCase(QStringLiteral("match-case"),
                                       tr("Letter case must match."));
    const QCommandLineOption word(QStringLiteral("word"), tr("Match whole words only."));
    const QCommandLineOption wildcard(QStringLiteral("wildcard"),
                                      tr("PATTERN is a wildcard: * any run, ? one character."));
    const QCommandLineOption regexp(QStringLiteral("regexp"),
                                    tr("PATTERN is a regular expression."));
    const QCommandLineOption noSubFolders(QStringLiteral("no-subfolders"),
                                          tr("Do not search subfolders."));
    const QCommandLineOption color(
        {QStringLiteral("color"), QStringLiteral("colour")},
        tr("Colour file names, line numbers, separators and matches as GNU grep does "
           "(GREP_COLORS' fn, ln, se and mt are honoured): always, never, or auto, only when "
           "standard output is a terminal (the default, also for --color alone)."),
        tr("when"), QStringLiteral("auto"));
    const QCommandLineOption threads({QStringLiteral("j"), QStringLiteral("threads")},
                                     tr("Scanning threads (default: the number of cores)."),
                                     tr("N"));
    const QCommandLineOption help(QStringLiteral("help"), tr("Show this help."));
    const QCommandLineOption version(QStringLiteral("version"), tr("Show the version."));
    parser.addOptions({filter, matchCase, word, wildcard, regexp, noSubFolders, color, threads,
                       help, version});
    parser.addPositionalArgument(QStringLiteral("PATTERN"),
                                 tr("Literal text to find, unless --wildcard or --regexp."));
    parser.addPositionalArgument(
        QStringLiteral("FOLDER"),
        tr("Folders to search (default: the current directory). Put -- before a pattern "
           "or folder that begins with a dash."),
        QStringLiteral("[FOLDER...]"));
    // Qt names the program by the path it was started with.
    helpText = parser.helpText();
    if (!arguments.isEmpty())
        helpText.replace(QStringLiteral("Usage: ") + arguments.first(), QStringLiteral("Usage: fif"));

    // As for grep, --color alone means auto; the parser wants a value.
    QStringList withValues = arguments;
    for (qsizetype i = 1; i < withValues.size() && withValues.at(i) != QLatin1String("--"); ++i) {
        if (withValues.at(i) == QLatin1String("--color") || withValues.at(i) == QLatin1String("--colour"))
            withValues[i] += QLatin1String("=auto");
    }
    if (!parser.parse(withValues)) {
        errorText = parser.errorText();
        return Error;
    }
    if (parser.isSet(help))
        return Help;
    if (parser.isSet(version))
        return Version;
    if (parser.isSet(wildcard) && parser.isSet(regexp)) {
        errorText = tr("--wildcard and --regexp exclude each other.");
        return Error;
    }
    // grep's words for the three choices.
    const QString when = parser.value(color);
    if (QStringList{"always", "yes", "force"}.contains(when)) {
        colorMode = ColorAlways;
    } else if (QStringList{"never", "no", "none"}.contains(when)) {
        colorMode = ColorNever;
    } else if (QStringList{"auto", "tty", "if-tty"}.contains(when)) {
        colorMode = ColorAuto;
    } else {
        errorText = tr("Invalid argument \"%1\" for --color: use always, never or auto.").arg(when);
        return Error;
    }
    threadCount = 0;
    if (parser.isSet(threads)) {
        bool isNumber = false;
        threadCount = parser.value(threads).toInt(&isNumber);
        if (!isNumber || threadCount < 1) {
            errorText = tr("Invalid number of threads: \"%1\".").arg(parser.value(threads));
            return Error;
        }
    }
    QStringList positional = parser.positionalArguments();
    if (positional.isEmpty()) {
        errorText = tr("Missing PATTERN.");
        return Error;
    }

    request = FifInput(parser.value(filter));
    request.what = positional.takeFirst();
    // Relative folders keep hit paths relative, as the user named them.
    folders = positional.isEmpty() ? QStringList{QStringLiteral(".")} : positional;
    request.where = folders.join(QObject::tr(";"));
    request.matchCase = parser.isSet(matchCase) ? Qt::CaseSensitive : Qt::CaseInsensitive;
    request.matchType = parser.isSet(regexp)     ? QRegExp::RegExp2
                        : parser.isSet(wildcard) ? QRegExp::Wildcard
                                                 : QRegExp::FixedString;
    request.includeSubFolders = !parser.isSet(noSubFolders);
    request.matchWord = parser.isSet(word);
    return Search;
}

FifInput FifCommandLine::getRequest() const
{
    return request;
}

QStringList FifCommandLine::getFolders() const
{
    return folders;
}

FifCommandLine::ColorMode FifCommandLine::getColorMode() const
{
    return colorMode;
}

int FifCommandLine::getThreadCount() const
{
    return threadCount;
}

QString FifCommandLine::getErrorText() const
{
    return errorText;
}

QString FifCommandLine::getHelpText() const
{
    return helpText;
}

QString FifCommandLine::getVersionText()
{
    return QStringLiteral("fif %1\n").arg(QStringLiteral(FIF_VERSION));
}

} // namespace Orba
} // namespace Gui
