#ifndef CADENZA_APPS_LANGUAGESCOMMAND_H
#define CADENZA_APPS_LANGUAGESCOMMAND_H

#include <QStringList>

/// "cadenza languages": the installed and downloadable recognition languages.
class LanguagesCommand
{
public:
    static int run(const QStringList &arguments);
};

#endif
