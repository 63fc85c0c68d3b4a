#ifndef LOOMKITLOGGING_H
#define LOOMKITLOGGING_H

#include <QLoggingCategory>

// One category per area; all default to QtWarningMsg so that debug and info
// output stays off unless the host enables it with a category rule.
Q_DECLARE_LOGGING_CATEGORY(lcPlugin)         // "Orvane.Loomkit.Plugin"
Q_DECLARE_LOGGING_CATEGORY(lcCore)           // "Orvane.Loomkit.Core"
Q_DECLARE_LOGGING_CATEGORY(lcFile)           // "Orvane.Loomkit.File"
Q_DECLARE_LOGGING_CATEGORY(lcImage)          // "Orvane.Loomkit.Image"
Q_DECLARE_LOGGING_CATEGORY(lcManager)        // "Orvane.Loomkit.Manager"
Q_DECLARE_LOGGING_CATEGORY(lcNetwork)        // "Orvane.Loomkit.Network"
Q_DECLARE_LOGGING_CATEGORY(lcPackage)        // "Orvane.Loomkit.Package"
Q_DECLARE_LOGGING_CATEGORY(lcUtility)        // "Orvane.Loomkit.Utility"
Q_DECLARE_LOGGING_CATEGORY(lcRuntimeUtility) // "Orvane.Runtime.Utility"

#endif // LOOMKITLOGGING_H
