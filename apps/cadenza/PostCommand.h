#ifndef CADENZA_APPS_POSTCOMMAND_H
#define CADENZA_APPS_POSTCOMMAND_H

#include <QStringList>

/// "cadenza post": posts a distributed notification to every process of the session.
class PostCommand
{
public:
    static int run(const QStringList &arguments);
};

#endif
