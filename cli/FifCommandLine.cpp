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
           "Exit status: 0 lines found, 1 none found, 2 bad expression or arguments."));
    const QCommandLineOption filter(
        QStringLiteral("filter"),
        tr("File-name patterns separated by \";\", matched without regard to case."),
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
    const QCommandLineOption help(QStringLiteral("help"), tr("Show this help."));
    const QCommandLineOption version(QStringLiteral("version"), tr("Show the version."));
    parser.addOptions({filter, matchCase, word, wildcard, regexp, noSubFolders, help, version});
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

    if (!parser.parse(arguments)) {
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
    QStringList positional = parser.positionalArguments();
    if (positional.isEmpty()) {
        errorText = tr("Missing PATTERN.");
        return Error;
    }

    request = FifInput(parser.value(filter));
    request.what = positional.takeFirst();
    // Relative folders keep hit paths relative, as the user named them.
    request.where =
        positional.isEmpty() ? QStringLiteral(".") : positional.join(QObject::tr(";"));
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
