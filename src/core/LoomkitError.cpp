#include "LoomkitError.h"

LoomkitError::LoomkitError(QObject *parent)
    : QObject(parent)
{
}

LoomkitError::LoomkitError(const QString &message, const QString &details, QObject *parent)
    : QObject(parent)
    , m_message(message)
    , m_details(details)
{
}

void LoomkitError::clear()
{
    m_code = 0;
    m_message.clear();
    m_details.clear();
    emit objectChanged();
}

void LoomkitError::assign(const LoomkitError &other)
{
    m_code = other.m_code;
    m_message = other.m_message;
    m_details = other.m_details;
    emit objectChanged();
}
