#include "String.h"

namespace Gui {
namespace Orba {

Port::StringBase<char> String::convert(const QString& text)
{
    return Port::StringBase<char>(text.toStdString());
}

QString String::convert(const Port::StringBase<char>& text)
{
    return QString::fromUtf8(text.c_str(), qsizetype(text.size()));
}

} // namespace Orba
} // namespace Gui
