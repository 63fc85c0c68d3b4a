#include "LoomkitLogging.h"

Q_LOGGING_CATEGORY(lcPlugin, "Orvane.Loomkit.Plugin", QtWarningMsg)
Q_LOGGING_CATEGORY(lcCore, "Orvane.Loomkit.Core", QtWarningMsg)
Q_LOGGING_CATEGORY(lcFile, "Orvane.Loomkit.File", QtWarningMsg)
Q_LOGGING_CATEGORY(lcImage, "Orvane.Loomkit.Image", QtWarningMsg)
Q_LOGGING_CATEGORY(lcManager, "Orvane.Loomkit.Manager", QtWarningMsg)
Q_LOGGING_CATEGORY(lcNetwork, "Orvane.Loomkit.Network", QtWarningMsg)
Q_LOGGING_CATEGORY(lcPackage, "Orvane.Loomkit.Package", QtWarningMsg)
Q_LOGGING_CATEGORY(lcUtility, "Orvane.Loomkit.Utility", QtWarningMsg)
Q_LOGGING_CATEGORY(lcRuntimeUtility, "Orvane.Runtime.Utility", QtWarningMsg)
