#include "CDbaseField.h"

CDbaseField::CDbaseField(char const *name, char type, int length, int decimals)
    : m_name(name), m_type(type), m_length(length), m_decimals(decimals)
{
}

char const *CDbaseField::Problem() const
{
    switch (m_type) {
    case 'C':
        if (m_length < 1 || m_length > maxTextLength)
            return "Die L\344nge eines Textfeldes muss zwischen 1 und 255 liegen";
        return nullptr;
    case 'N':
    case 'F':
        if (m_length < 1 || m_length > maxNumberLength)
            return "Die L\344nge eines numerischen Feldes muss zwischen 1 und 20 liegen";
        if (m_decimals < 0 || (m_decimals > 0 && m_decimals > m_length - 2))
            return "Die Anzahl der Nachkommastellen passt nicht zur Feldl\344nge";
        return nullptr;
    case 'D':
        if (m_length != 8)
            return "Ein Datumsfeld hat die L\344nge 8";
        return nullptr;
    case 'L':
        if (m_length != 1)
            return "Ein logisches Feld hat die L\344nge 1";
        return nullptr;
    default:
        return "Unbekannter Feldtyp";
    }
}
