#include "CQoOutputSource.h"

CQoOutputSource::~CQoOutputSource() = default;

int CQoOutputSource::GetDataLength(int col)
{
    return -1;
}

void CQoOutputSource::Delete()
{
    delete this;
}
