#pragma once

#include "orba_host_export.h"
#include "StringBase.h"

#include <QString>

namespace Gui {
namespace Orba {

class ORBA_HOST_EXPORT String
{
public:
    // UTF-8 encoded copy of `text`.
    static Port::StringBase<char> convert(const QString& text);
    static QString convert(const Port::StringBase<char>& text);
};

} // namespace Orba
} // namespace Gui
